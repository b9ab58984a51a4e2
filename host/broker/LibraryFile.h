#ifndef HOST_BROKER_LIBRARY_FILE_H
#define HOST_BROKER_LIBRARY_FILE_H

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

/// The file of a shared library, looked at without loading it.
namespace cmpihost {

/// Why a library could not be loaded (not found, no library of this process, an unresolved symbol,
/// no factory, one that failed); what() is one line that names the file.
class LoadError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// Throws LoadError for a file that is no library of this process. The dynamic loader says little
/// about one, and maps one that is cut off, so that its first use ends the process. A name without
/// folder passes: the loader searches for it.
void examineLibrary(const std::string& file);

/// The names of the functions that a library offers to others, in the order of its symbol table.
/// Empty for a file that cannot be read or whose tables point outside of it.
std::vector<std::string> exportedFunctions(const std::filesystem::path& file);

/// The library lib<location>.so, or that with .1 behind it, in the first of the folders that holds
/// it in the word size of this process, or else in the other one; the bare name lib<location>.so,
/// which the dynamic loader searches for, when none does. A location that is a path is taken as it
/// stands.
std::filesystem::path findLibrary(const std::string& location,
                                  const std::vector<std::filesystem::path>& folders);

}  // namespace cmpihost

#endif
