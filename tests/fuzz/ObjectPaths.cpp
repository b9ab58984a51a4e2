// Object paths as clients write them: read, written and read back.
#include <algorithm>

#include "fuzz/Invariant.h"
#include "host/cli/PathParser.h"
#include "support/Requests.h"

using namespace cmpihost;

namespace {

void checkError(const PathError& error, const std::string& text) {
    const std::string shown = error.what();
    fuzz::expect(error.offset() <= text.size(), "a complaint is about a byte of the text");
    fuzz::expect(std::count(shown.begin(), shown.end(), '\n') == 2, "a complaint has three lines");
    fuzz::expect(std::all_of(shown.begin(), shown.end(),
                             [](char c) {
                                 const auto byte = static_cast<unsigned char>(c);
                                 return c == '\n' || (byte >= 0x20 && byte != 0x7F);
                             }),
                 "a complaint is safe to print");
}

void checkRoundTrip(const ObjectPathValue& path, const ClassCatalogue* classes) {
    const std::string written = toString(path);
    try {
        const ObjectPathValue again = parsePath(written, classes);
        fuzz::expect(again == path && again.hostName == path.hostName,
                     "a path is read back as it was written");
        fuzz::expect(toString(again) == written, "a path has one text");
    } catch (const PathError& error) {
        fuzz::broken("what was written is a path; " + written + ": " + error.what());
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(fuzz::textOf(data, size));
    for (const ClassCatalogue* classes : {static_cast<const ClassCatalogue*>(nullptr),
                                          static_cast<const ClassCatalogue*>(&schemaCatalogue())}) {
        try {
            checkRoundTrip(parsePath(text, classes), classes);
        } catch (const PathError& error) {
            checkError(error, text);
        }
    }
    return 0;
}
