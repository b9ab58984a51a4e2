#ifndef TESTS_SUPPORT_TEMPORARY_DIRECTORY_H
#define TESTS_SUPPORT_TEMPORARY_DIRECTORY_H

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

/// A directory of the object's own, readable for all; removed, with all in it, when the object
/// dies. Names are relative to it. Throws std::runtime_error and std::filesystem::filesystem_error.
class TemporaryDirectory {
  public:
    TemporaryDirectory() {
        std::string name = (std::filesystem::temp_directory_path() / "korva-XXXXXX").string();
        if (::mkdtemp(name.data()) == nullptr) throw std::runtime_error("no temporary directory");
        path_ = name;
        // Some tests give up root's privileges.
        std::filesystem::permissions(path_, std::filesystem::perms(0755));
    }
    ~TemporaryDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    const std::string& path() const { return path_; }
    std::string path(const std::string& name) const { return path_ + '/' + name; }

    /// Makes the parent directories that are missing, and writes the file anew.
    void write(const std::string& name, const std::string& content) const {
        std::filesystem::create_directories(std::filesystem::path(path(name)).parent_path());
        std::ofstream file(path(name), std::ios::binary | std::ios::trunc);
        file << content;
        if (!file.flush()) throw std::runtime_error("cannot write " + path(name));
    }

  private:
    std::string path_;
};

#endif
