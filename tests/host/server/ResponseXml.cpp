// Well-formedness is the parser's business. The scan of the bytes looks at what a parser hides, and
// trusts nothing: the document may be anything.
#include "host/server/ResponseXml.h"

#include <expat.h>

#include <algorithm>
#include <memory>
#include <string_view>

namespace cmpihost::server::validator {

namespace {

constexpr std::size_t deepest = 64;

/// Builds the tree while expat reads.
struct Builder {
    XML_Parser parser = nullptr;
    Element root{};
    std::vector<Element*> open{};
    bool tooDeep = false;

    static void XMLCALL begin(void* self, const char* name, const char** attributes) {
        auto& builder = *static_cast<Builder*>(self);
        if (builder.open.size() == deepest) {
            builder.tooDeep = true;
            XML_StopParser(builder.parser, XML_FALSE);
            return;
        }
        Element* added = &builder.root;
        if (!builder.open.empty()) added = &builder.open.back()->children.emplace_back();
        added->name = name;
        for (const char** each = attributes; *each != nullptr; each += 2)
            added->attributes.emplace_back(each[0], each[1]);
        builder.open.push_back(added);
    }
    static void XMLCALL end(void* self, const char*) {
        static_cast<Builder*>(self)->open.pop_back();
    }
    static void XMLCALL text(void* self, const char* characters, int length) {
        auto& builder = *static_cast<Builder*>(self);
        builder.open.back()->text.append(characters, static_cast<std::size_t>(length));
    }
};

/// Goes through the bytes behind the declaration.
class ByteScan {
  public:
    ByteScan(std::string_view document, Complaints& complaints)
        : document_(document), complaints_(complaints) {}

    void run(std::size_t start) {
        at_ = start;
        while (at_ < document_.size()) {
            const char letter = document_[at_];
            if (letter == '<') {
                scanMarkup();
                continue;
            }
            checkLetter(letter);
            ++at_;
        }
    }

  private:
    void complain(const std::string& what) {
        complaints_.push_back("byte " + std::to_string(at_) + ": " + what);
    }

    void checkLetter(char letter) {
        if (letter == '\r') complain("a carriage return that stands for itself");
        if (letter == '&') checkReference();
    }

    void checkReference() {
        constexpr std::string_view allowed[] = {"&lt;",   "&gt;",   "&amp;",
                                                "&quot;", "&apos;", "&#13;"};
        const auto rest = document_.substr(at_, 6);
        const bool known =
            std::any_of(std::begin(allowed), std::end(allowed),
                        [&](std::string_view each) { return rest.substr(0, each.size()) == each; });
        if (!known) complain("a reference that clients do not resolve");
    }

    void scanMarkup() {
        const char second = at_ + 1 < document_.size() ? document_[at_ + 1] : ' ';
        if (second == '?' || second == '!') {
            complain(second == '?' ? "a processing instruction"
                                   : "a comment, a CDATA section or a document type");
            ++at_;
            return;
        }
        const std::size_t start = at_ + 1;
        const std::size_t nameEnd =
            std::min(document_.find_first_of(" \t\r\n/>", start), document_.size());
        scanAttributes();
        const bool selfClosing = document_[at_ - 1] == '/' && at_ > nameEnd;
        if (selfClosing) checkSelfClosing(document_.substr(start, nameEnd - start));
    }

    /// Moves on to the end of the tag.
    void scanAttributes() {
        bool quoted = false;
        for (++at_; at_ < document_.size(); ++at_) {
            const char letter = document_[at_];
            if (letter == '"') quoted = !quoted;
            if (!quoted && letter == '>') return;
            if (!quoted && letter == '\'') complain("an attribute in single quotes");
            if (quoted && (letter == '\t' || letter == '\n'))
                complain("white space in an attribute that parsers change");
            checkLetter(letter);
        }
    }

    void checkSelfClosing(std::string_view name) {
        if (name != "CLASSNAME" && name != "NAMESPACE" && name != "ERROR")
            complain(std::string(name) + " has no end tag");
    }

    std::string_view document_;
    Complaints& complaints_;
    std::size_t at_ = 0;
};

}  // namespace

const std::string* Element::attribute(const std::string& attributeName) const {
    for (const auto& [each, value] : attributes)
        if (each == attributeName) return &value;
    return nullptr;
}

std::optional<Element> readTree(const std::string& document, Complaints& complaints) {
    const std::unique_ptr<std::remove_pointer_t<XML_Parser>, void (*)(XML_Parser)> parser(
        XML_ParserCreate("UTF-8"), XML_ParserFree);
    Builder builder;
    builder.parser = parser.get();
    XML_SetUserData(parser.get(), &builder);
    XML_SetElementHandler(parser.get(), Builder::begin, Builder::end);
    XML_SetCharacterDataHandler(parser.get(), Builder::text);
    const auto status =
        XML_Parse(parser.get(), document.data(), static_cast<int>(document.size()), XML_TRUE);
    if (status == XML_STATUS_OK) return std::move(builder.root);
    complaints.push_back("line " + std::to_string(XML_GetCurrentLineNumber(parser.get())) +
                         ", column " + std::to_string(XML_GetCurrentColumnNumber(parser.get())) +
                         ": " +
                         (builder.tooDeep ? "deeper than any response"
                                          : XML_ErrorString(XML_GetErrorCode(parser.get()))));
    return std::nullopt;
}

void checkBytes(const std::string& document, Complaints& complaints) {
    constexpr std::string_view declaration = "<?xml version=\"1.0\" encoding=\"utf-8\"?>";
    const bool declared = document.compare(0, declaration.size(), declaration) == 0;
    if (!declared) complaints.push_back("it does not begin with " + std::string(declaration));
    ByteScan(document, complaints).run(declared ? declaration.size() : 0);
}

}  // namespace cmpihost::server::validator
