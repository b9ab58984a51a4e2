// Libraries are read as bytes of a file: nothing in one is believed before it is known to lie
// within. The symbols are found as the dynamic loader finds them, by the dynamic segment, since the
// sections of a library may have been removed.
#include "host/broker/LibraryFile.h"

#include <elf.h>
#include <link.h>

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <fstream>
#include <iterator>
#include <optional>
#include <system_error>

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

constexpr bool is64Bit = sizeof(void*) == 8;
constexpr int ownClass = is64Bit ? ELFCLASS64 : ELFCLASS32;

/// The front of the header, which is the same in both word sizes.
struct ElfStart {
    unsigned char ident[EI_NIDENT];
    Elf32_Half type;
    Elf32_Half machine;
};

/// Whether the front of a library says that it is of the other word size.
bool isOfOtherWordSize(const ElfStart& start) {
    return std::memcmp(start.ident, ELFMAG, SELFMAG) == 0 && start.ident[EI_CLASS] != ownClass;
}

/// The bytes of a file.
class Bytes {
  public:
    explicit Bytes(const fs::path& file) {
        std::ifstream stream(file, std::ios::binary);
        content_.assign(std::istreambuf_iterator<char>(stream), {});
    }

    std::uint64_t size() const noexcept { return content_.size(); }
    bool holds(std::uint64_t offset, std::uint64_t count) const noexcept {
        return count <= size() && offset <= size() - count;
    }
    /// The record at that place; none when the file ends before.
    template <class Record>
    std::optional<Record> at(std::uint64_t offset) const {
        if (!holds(offset, sizeof(Record))) return std::nullopt;
        Record record;
        std::memcpy(&record, content_.data() + offset, sizeof record);
        return record;
    }
    /// The text that begins there; empty when the file ends before the text does.
    std::string textAt(std::uint64_t offset) const {
        if (offset >= size()) return {};
        const std::size_t end = content_.find('\0', static_cast<std::size_t>(offset));
        if (end == std::string::npos) return {};
        return content_.substr(static_cast<std::size_t>(offset),
                               end - static_cast<std::size_t>(offset));
    }

  private:
    std::string content_;
};

/// The segments of a library; none when the file ends within their table.
std::optional<std::vector<ElfW(Phdr)>> segmentsOf(const Bytes& bytes) {
    const auto header = bytes.at<ElfW(Ehdr)>(0);
    if (!header) return std::nullopt;
    std::vector<ElfW(Phdr)> segments;
    for (std::uint64_t index = 0; index < header->e_phnum; ++index) {
        const auto segment = bytes.at<ElfW(Phdr)>(header->e_phoff + index * sizeof(ElfW(Phdr)));
        if (!segment) return std::nullopt;
        segments.push_back(*segment);
    }
    return segments;
}

/// Whether the file has every byte that the loader maps.
bool isWhole(const Bytes& bytes) {
    const auto segments = segmentsOf(bytes);
    return segments &&
           std::all_of(segments->begin(), segments->end(), [&](const ElfW(Phdr) & segment) {
               return segment.p_type != PT_LOAD || bytes.holds(segment.p_offset, segment.p_filesz);
           });
}

/// The symbols of a library that is read from its file.
class SymbolTable {
  public:
    explicit SymbolTable(const Bytes& bytes)
        : bytes_(bytes), segments_(segmentsOf(bytes).value_or(std::vector<ElfW(Phdr)>())) {
        for (const ElfW(Phdr) & segment : segments_) {
            if (segment.p_type == PT_DYNAMIC) readDynamic(segment);
        }
    }

    std::vector<std::string> functions() const {
        std::vector<std::string> names;
        const std::uint64_t last = count();
        for (std::uint64_t index = 0; index < last; ++index) {
            const auto symbol = bytes_.at<ElfW(Sym)>(symbols_ + index * sizeof(ElfW(Sym)));
            if (!symbol) break;
            // The types and bindings are coded alike in both word sizes.
            const unsigned char type = ELF32_ST_TYPE(symbol->st_info);
            const bool isFunction = type == STT_FUNC || type == STT_GNU_IFUNC;
            const bool isOffered = symbol->st_shndx != SHN_UNDEF &&
                                   ELF32_ST_BIND(symbol->st_info) != STB_LOCAL &&
                                   ELF32_ST_VISIBILITY(symbol->st_other) == STV_DEFAULT;
            if (!isFunction || !isOffered) continue;
            std::string name = bytes_.textAt(names_ + symbol->st_name);
            if (!name.empty()) names.push_back(std::move(name));
        }
        return names;
    }

  private:
    void readDynamic(const ElfW(Phdr) & segment) {
        const std::uint64_t entries = segment.p_filesz / sizeof(ElfW(Dyn));
        for (std::uint64_t index = 0; index < entries; ++index) {
            const auto entry = bytes_.at<ElfW(Dyn)>(segment.p_offset + index * sizeof(ElfW(Dyn)));
            if (!entry || entry->d_tag == DT_NULL) return;
            const std::uint64_t offset = offsetOf(entry->d_un.d_ptr);
            if (entry->d_tag == DT_SYMTAB) symbols_ = offset;
            if (entry->d_tag == DT_STRTAB) names_ = offset;
            if (entry->d_tag == DT_HASH) hash_ = offset;
            if (entry->d_tag == DT_GNU_HASH) gnuHash_ = offset;
        }
    }

    /// Where in the file an address of the library is; the file's size when it is nowhere.
    std::uint64_t offsetOf(std::uint64_t address) const {
        for (const ElfW(Phdr) & segment : segments_) {
            const std::uint64_t start = segment.p_vaddr;
            if (segment.p_type == PT_LOAD && address >= start &&
                address - start < segment.p_filesz) {
                return segment.p_offset + (address - start);
            }
        }
        return bytes_.size();
    }

    /// How many symbols there are: only the hash tables tell.
    std::uint64_t count() const {
        if (symbols_ == 0 || names_ == 0) return 0;
        // Behind the number of buckets stands that of the chains, one for each symbol.
        if (hash_ != 0) return bytes_.at<Elf32_Word>(hash_ + sizeof(Elf32_Word)).value_or(0);
        return gnuHash_ == 0 ? 0 : gnuCount();
    }

    /// Buckets name the first symbol of a chain; the last one of a chain has the lowest bit of its
    /// hash set. So the last symbol of the table ends the chain that starts last.
    std::uint64_t gnuCount() const {
        struct Header {
            Elf32_Word buckets;
            Elf32_Word firstSymbol;
            Elf32_Word bloomWords;
            Elf32_Word bloomShift;
        };
        const auto header = bytes_.at<Header>(gnuHash_);
        if (!header) return 0;
        const std::uint64_t buckets =
            gnuHash_ + sizeof(Header) + std::uint64_t{header->bloomWords} * sizeof(void*);
        const std::uint64_t chains = buckets + std::uint64_t{header->buckets} * sizeof(Elf32_Word);
        std::uint64_t last = 0;
        for (std::uint64_t at = buckets; at < chains; at += sizeof(Elf32_Word)) {
            const auto first = bytes_.at<Elf32_Word>(at);
            if (!first) return 0;
            last = std::max<std::uint64_t>(last, *first);
        }
        if (last < header->firstSymbol || last == 0) return 0;
        for (;; ++last) {
            const std::uint64_t chain = (last - header->firstSymbol) * sizeof(Elf32_Word);
            const auto hash = bytes_.at<Elf32_Word>(chains + chain);
            if (!hash) return 0;
            if ((*hash & 1U) != 0) return last + 1;
        }
    }

    const Bytes& bytes_;
    const std::vector<ElfW(Phdr)> segments_;
    /// Places in the file; 0: the library has no such table.
    std::uint64_t symbols_ = 0;
    std::uint64_t names_ = 0;
    std::uint64_t hash_ = 0;
    std::uint64_t gnuHash_ = 0;
};

bool isOfOtherWordSize(const fs::path& file) {
    ElfStart start{};
    std::ifstream(file, std::ios::binary).read(reinterpret_cast<char*>(&start), sizeof start);
    return isOfOtherWordSize(start);
}

}  // namespace

void examineLibrary(const std::string& file) {
    if (file.find('/') == std::string::npos) return;
    const auto refuse = [&](const std::string& why) { throw LoadError(file + ": " + why); };
    // Opening a named pipe would wait for its other end.
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (fs::exists(status) && !fs::is_regular_file(status)) refuse("not a regular file");
    if (!std::ifstream(file, std::ios::binary)) {
        refuse(std::error_code(errno, std::generic_category()).message());
    }
    const Bytes bytes(file);
    const auto start = bytes.at<ElfStart>(0);
    if (!start || std::memcmp(start->ident, ELFMAG, SELFMAG) != 0 || start->type != ET_DYN) {
        refuse("not a shared library");
    }
    if (isOfOtherWordSize(*start)) {
        refuse(is64Bit ? "a 32-bit library, this host is 64-bit"
                       : "a 64-bit library, this host is 32-bit");
    }
    if (!isWhole(bytes)) refuse("the file is cut off");
}

std::vector<std::string> exportedFunctions(const fs::path& file) {
    return SymbolTable(Bytes(file)).functions();
}

fs::path findLibrary(const std::string& location, const std::vector<fs::path>& folders) {
    if (location.find('/') != std::string::npos) return location;
    const std::string name = "lib" + location + ".so";
    fs::path other;
    for (const fs::path& folder : folders) {
        for (const std::string& file : {name, name + ".1"}) {
            std::error_code error;
            if (!fs::is_regular_file(folder / file, error)) continue;
            if (!isOfOtherWordSize(folder / file)) return folder / file;
            if (other.empty()) other = folder / file;
        }
    }
    return other.empty() ? fs::path(name) : other;
}

}  // namespace cmpihost
