// A whole CIM schema is more than a thousand files: each is opened once and asked for its identity
// by one call, which tells files of two names as well.
#include "host/mof/SchemaFiles.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <set>
#include <stdexcept>
#include <string>
#include <system_error>
#include <utility>

#include "base/Ascii.h"
#include "base/FileDescriptor.h"
#include "host/mof/MofParser.h"

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

std::string reasonOf(int error) {
    return std::error_code(error, std::generic_category()).message();
}

class SchemaReader {
  public:
    void read(const fs::path& path) {
        std::error_code error;
        const fs::file_status status = fs::status(path, error);
        if (!fs::exists(status)) {
            throw std::runtime_error("the schema " + path.string() +
                                     " cannot be read: " + error.message());
        }
        if (fs::is_directory(status)) {
            for (const fs::path& file : filesIn(path)) readFile(file);
        } else {
            readWithIncludes(path);
        }
    }

    std::vector<mof::Document> documents;

  private:
    static std::vector<fs::path> filesIn(const fs::path& folder);
    void readWithIncludes(const fs::path& first);
    /// Adds the file's document; false when the file was read before.
    bool readFile(const fs::path& file);
    /// The content of a file that was not read before.
    bool takeContent(const fs::path& file, std::string& content);

    std::set<std::pair<dev_t, ino_t>> read_;
};

std::vector<fs::path> SchemaReader::filesIn(const fs::path& folder) {
    std::vector<fs::path> files;
    std::error_code error;
    // Links to folders are not followed: they may lead in a circle.
    for (fs::recursive_directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        if (base::equalsIgnoreCase(entry->path().extension().string(), ".mof") &&
            !entry->is_directory(error))
            files.push_back(entry->path());
    }
    if (error) {
        throw std::runtime_error("the schema folder " + folder.string() +
                                 " cannot be read: " + error.message());
    }
    // Folders have an order of their own on each machine; complaints must not.
    std::sort(files.begin(), files.end());
    return files;
}

void SchemaReader::readWithIncludes(const fs::path& first) {
    if (!readFile(first)) return;
    // A list and no recursion, so that files which include each other in a long row cost no stack.
    for (std::size_t at = documents.size() - 1; at < documents.size(); ++at) {
        const std::vector<mof::Include> includes = documents[at].includes;
        const std::string file = documents[at].file;
        for (const mof::Include& include : includes) {
            const fs::path included = fs::path(file).parent_path() / include.file;
            if (!fs::exists(included)) {
                throw mof::MofError(file, include.position,
                                    "there is no file " + included.string() + " to include");
            }
            readFile(included);
        }
    }
}

bool SchemaReader::readFile(const fs::path& file) {
    std::string content;
    if (!takeContent(file, content)) return false;
    documents.push_back(mof::parse(content, file.string()));
    return true;
}

bool SchemaReader::takeContent(const fs::path& file, std::string& content) {
    const auto refuse = [&](const std::string& why) -> std::runtime_error {
        return std::runtime_error("the schema file " + file.string() + why);
    };
    const auto descriptor = base::FileDescriptor::open(file.c_str(), O_RDONLY);
    struct stat status {};
    if (!descriptor.isOpen() || ::fstat(descriptor.number(), &status) != 0)
        throw refuse(" cannot be read: " + reasonOf(errno));
    if (!S_ISREG(status.st_mode)) throw refuse(" is not a regular file");
    if (!read_.insert({status.st_dev, status.st_ino}).second) return false;

    // One byte more, so that the end shows without another turn.
    content.resize(static_cast<std::size_t>(status.st_size) + 1);
    std::size_t length = 0;
    for (;;) {
        const ssize_t part =
            ::read(descriptor.number(), content.data() + length, content.size() - length);
        if (part < 0) throw refuse(" cannot be read: " + reasonOf(errno));
        if (part == 0) break;
        length += static_cast<std::size_t>(part);
        if (length == content.size()) content.resize(2 * content.size());
    }
    content.resize(length);
    return true;
}

}  // namespace

std::vector<mof::Document> readSchemaFiles(const std::vector<fs::path>& paths) {
    SchemaReader reader;
    for (const fs::path& path : paths) reader.read(path);
    return std::move(reader.documents);
}

}  // namespace cmpihost
