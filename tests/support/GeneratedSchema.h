#ifndef TESTS_SUPPORT_GENERATED_SCHEMA_H
#define TESTS_SUPPORT_GENERATED_SCHEMA_H

#include <string>

#include "support/TemporaryDirectory.h"

/// A schema of the size and shape of a whole CIM schema: folders of one class a file, about 4 kB
/// each, with descriptions, value maps, methods and superclasses that stand in other folders, the
/// declarations of the qualifiers in qualifiers.mof, and all.mof, which includes every file.
class GeneratedSchema {
  public:
    /// As many classes as CIM schema 2.41 has.
    static constexpr unsigned classCount = 1442;

    GeneratedSchema();

    /// The folder, which goes with this object.
    const std::string& folder() const { return directory_.path(); }

    /// The name of the class with that number, counted from 0; 0 is the only root. The superclass
    /// of each other number n is (n - 1) / 3.
    static std::string className(unsigned number);

  private:
    TemporaryDirectory directory_;
};

#endif
