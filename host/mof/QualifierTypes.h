#ifndef HOST_MOF_QUALIFIER_TYPES_H
#define HOST_MOF_QUALIFIER_TYPES_H

#include <map>
#include <string>
#include <vector>

#include "host/mof/MofAst.h"

namespace cmpihost {

/// How a qualifier passes to subclasses once all is told that there is to tell.
struct Inheritance {
    bool toSubclass = true;
    bool overridable = true;
};

/// What is known of qualifiers by their names: what the MOF declares, else what the CIM standard
/// says of those that it defines. Names compare without case.
class QualifierTypes {
  public:
    /// Throws mof::MofError when the qualifier is declared already, and otherwise.
    void add(const mof::QualifierType& added);

    /// The declaration, or null for one that no MOF declares.
    const mof::QualifierType* find(const std::string& name) const;

    /// All that the MOF declares, in alphabetical order.
    std::vector<const mof::QualifierType*> all() const;

    /// Of a qualifier where it stands: its own flavor, else that of its declaration, else that of
    /// the standard, else it is inherited and may be overridden.
    Inheritance inheritanceOf(const mof::Qualifier& qualifier) const;

    /// Whether its text may be told in several languages, by the same rules.
    bool isTranslatable(const mof::Qualifier& qualifier) const;

  private:
    std::map<std::string, mof::QualifierType> declared_;
};

}  // namespace cmpihost

#endif
