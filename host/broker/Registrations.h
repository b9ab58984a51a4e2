#ifndef HOST_BROKER_REGISTRATIONS_H
#define HOST_BROKER_REGISTRATIONS_H

#include "host/broker/Operation.h"

#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

/// Which provider serves which class, as registration files tell it to object managers.
namespace cmpihost {

/// A registration that cannot be used; what() is one line, "FILE:LINE: what is wrong".
class RegistrationError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// One section of a registration file.
struct Registration {
    std::string className{};
    /// The MI name, which the factories carry.
    std::string provider{};
    /// Names the library lib<location>.so.
    std::string location{};
    /// The interfaces that serve the class.
    std::vector<Interface> types{};
    /// `*` stands for all.
    std::vector<std::string> nameSpaces{};
    /// What the factories find in their context; none: nothing.
    std::optional<std::string> parameters{};
    /// Where the section begins.
    std::filesystem::path file{};
    std::size_t line = 0;

    /// Whether the namespace is one of its own. Names compare without case.
    bool isFor(const std::string& nameSpace) const;
    /// Whether it serves the class in that namespace by that interface.
    bool serves(Interface type, const std::string& nameSpace) const;
};

/// The registrations of one host. Immutable once read, so any thread may ask.
class Registrations {
  public:
    /// Reads each file, and of each folder the files *.reg in the order of their names. Throws
    /// RegistrationError for a file that is none or that registers a class again for another
    /// provider, and std::runtime_error for a file or folder that cannot be read.
    static Registrations read(const std::vector<std::filesystem::path>& paths);

    /// Adds the sections of one text. `file` is named in complaints. Throws RegistrationError.
    void add(const std::string& text, const std::filesystem::path& file);

    /// In the order in which they were read.
    const std::vector<Registration>& all() const noexcept { return sections_; }

    /// Who serves the class itself by that interface; null: nobody.
    const Registration* find(const std::string& className, const std::string& nameSpace,
                             Interface type) const;
    /// Whether any registration is for the namespace.
    bool names(const std::string& nameSpace) const;
    /// The namespaces that registrations name, each once; `*` is none.
    std::vector<std::string> nameSpaces() const;

  private:
    void addSection(Registration section);

    std::vector<Registration> sections_;
};

}  // namespace cmpihost

#endif
