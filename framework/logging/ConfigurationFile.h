#ifndef FRAMEWORK_LOGGING_CONFIGURATION_FILE_H
#define FRAMEWORK_LOGGING_CONFIGURATION_FILE_H

#include <sys/stat.h>

#include <optional>
#include <string>

#include "Configuration.h"
#include "Environment.h"

namespace ZBLog {

/// A configuration in a file that may change, vanish and come back. Serves one thread at a time.
class ConfigurationFile {
  public:
    ConfigurationFile(ConfigurationSource source, Environment& environment);

    /// What the file says: at the first call, and when its content or the reason why it cannot be
    /// read is another one than before; else nothing. Costs one stat while the file rests. A file
    /// that is missing says nothing (the defaults), and is an error if it is required; so is one
    /// that cannot be read. Throws std::bad_alloc; the object is of no use then.
    std::optional<ParsedConfiguration> readIfChanged();

    const std::string& path() const { return source_.path; }

  private:
    /// What stat tells; equal stamps mean that the file was not touched in between, unless the two
    /// touches were too close in time to be told apart. Who sets the time of the last modification
    /// sets that of the last change, too.
    struct Stamp {
        int error;
        struct stat status;  // zeros where there is an error
        bool operator==(const Stamp& other) const;
    };

    struct Content {
        std::string text;
        std::string problem;  // why there is no text; empty if nothing is wrong
    };

    Stamp stamp() const;
    bool isSettled(const Stamp& stamp) const;
    Content read() const;
    Content failure(int error) const;

    ConfigurationSource source_;
    Environment& environment_;
    std::optional<Stamp> stamp_;  // none: to be read again
    std::optional<Content> content_;
};

}  // namespace ZBLog

#endif
