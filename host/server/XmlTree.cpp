// The parser sees the whole document in one piece and never more than the document: there is no
// handler for external entities, and a DOCTYPE that could declare others ends the parsing at once.
#include "host/server/XmlTree.h"

#include <expat.h>

#include <climits>
#include <cstring>
#include <exception>
#include <memory>
#include <utility>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t deepestLevel = 32;
constexpr std::size_t mostElements = 10000;
constexpr std::size_t mostAttributes = 16;
constexpr std::size_t longestName = 256;

/// A zero byte is a character of UTF-8, but not of XML; in UTF-16, which the parser would recognise
/// in spite of everything, every other byte is one.
bool isUtf8WithoutZeros(std::string_view text) {
    while (!text.empty()) {
        if (text.front() > 0) {
            text.remove_prefix(1);
        } else if (text.front() == 0 || !base::takeUtf8(text).valid) {
            return false;
        }
    }
    return true;
}

std::string checkedName(const char* name) {
    const std::size_t length = std::strlen(name);
    if (length > longestName) throw XmlError("a name is longer than 256 bytes");
    return {name, length};
}

/// Whether what follows an ampersand is a reference that needs no declaration.
bool isBuiltInReference(std::string_view text) {
    for (const std::string_view known : {"amp;", "lt;", "gt;", "quot;", "apos;", "#"}) {
        if (text.substr(0, known.size()) == known) return true;
    }
    return false;
}

class TreeBuilder {
  public:
    TreeBuilder(std::string_view document, XML_Parser parser)
        : document_(document), parser_(parser) {
        XML_SetUserData(parser, this);
        XML_SetXmlDeclHandler(parser, &TreeBuilder::onDeclaration);
        XML_SetStartDoctypeDeclHandler(parser, &TreeBuilder::onDoctype);
        XML_SetSkippedEntityHandler(parser, &TreeBuilder::onSkippedEntity);
        XML_SetElementHandler(parser, &TreeBuilder::onStart, &TreeBuilder::onEnd);
        XML_SetCharacterDataHandler(parser, &TreeBuilder::onText);
    }

    XmlElement build() {
        const XML_Status status =
            XML_Parse(parser_, document_.data(), static_cast<int>(document_.size()), XML_TRUE);
        if (failure_) std::rethrow_exception(failure_);
        if (status != XML_STATUS_OK) {
            throw XmlError("line " + std::to_string(XML_GetCurrentLineNumber(parser_)) + ": " +
                           XML_ErrorString(XML_GetErrorCode(parser_)));
        }
        return std::move(root_);
    }

  private:
    /// Runs what may throw: nothing may be thrown through the parser, which is C.
    template <class Action>
    static void guarded(void* self, Action action) noexcept {
        auto& builder = *static_cast<TreeBuilder*>(self);
        if (builder.failure_) return;
        try {
            action(builder);
        } catch (...) {
            builder.failure_ = std::current_exception();
            XML_StopParser(builder.parser_, XML_FALSE);
        }
    }

    static void XMLCALL onDeclaration(void* self, const char*, const char* encoding, int) {
        guarded(self, [encoding](TreeBuilder&) {
            if (encoding != nullptr && !base::equalsIgnoreCase(encoding, "utf-8")) {
                throw XmlError("the encoding is not UTF-8");
            }
        });
    }

    static void XMLCALL onDoctype(void* self, const char*, const char* systemId, const char*,
                                  int hasInternalSubset) {
        guarded(self, [systemId, hasInternalSubset](TreeBuilder& builder) {
            if (hasInternalSubset != 0) throw XmlError("the DOCTYPE has declarations");
            builder.hasUnreadDeclarations_ = systemId != nullptr;
        });
    }

    static void XMLCALL onSkippedEntity(void* self, const char*, int) {
        guarded(self, [](TreeBuilder&) { throw XmlError("an entity is not declared"); });
    }

    static void XMLCALL onStart(void* self, const char* name, const char** attributes) {
        guarded(self, [=](TreeBuilder& builder) { builder.start(name, attributes); });
    }

    static void XMLCALL onEnd(void* self, const char*) {
        guarded(self, [](TreeBuilder& builder) { builder.end(); });
    }

    static void XMLCALL onText(void* self, const char* text, int length) {
        guarded(self, [=](TreeBuilder& builder) {
            builder.open_.back().text.append(text, static_cast<std::size_t>(length));
        });
    }

    void start(const char* name, const char** attributes) {
        if (open_.size() == deepestLevel) throw XmlError("elements lie deeper than 32 levels");
        if (++count_ > mostElements) throw XmlError("there are more than 10000 elements");
        if (hasUnreadDeclarations_) checkReferences();
        XmlElement element;
        element.name = checkedName(name);
        for (; *attributes != nullptr; attributes += 2) {
            if (element.attributes.size() == mostAttributes) {
                throw XmlError("an element has more than 16 attributes");
            }
            element.attributes.push_back({checkedName(attributes[0]), attributes[1]});
        }
        open_.push_back(std::move(element));
    }

    void end() {
        XmlElement element = std::move(open_.back());
        open_.pop_back();
        (open_.empty() ? root_ : open_.back().children.emplace_back()) = std::move(element);
    }

    /// Where a DOCTYPE names declarations that are not read, the parser silently drops what it does
    /// not know from the values of attributes.
    void checkReferences() const {
        std::string_view tag =
            document_.substr(static_cast<std::size_t>(XML_GetCurrentByteIndex(parser_)),
                             static_cast<std::size_t>(XML_GetCurrentByteCount(parser_)));
        for (std::size_t at = tag.find('&'); at != std::string_view::npos; at = tag.find('&')) {
            tag.remove_prefix(at + 1);
            if (!isBuiltInReference(tag)) throw XmlError("an entity is not declared");
        }
    }

    const std::string_view document_;
    const XML_Parser parser_;
    /// From the root to the element that is being read.
    std::vector<XmlElement> open_{};
    XmlElement root_{};
    std::size_t count_ = 0;
    bool hasUnreadDeclarations_ = false;
    std::exception_ptr failure_{};
};

}  // namespace

const std::string* XmlElement::attribute(std::string_view attributeName) const {
    for (const XmlAttribute& each : attributes) {
        if (each.name == attributeName) return &each.value;
    }
    return nullptr;
}

const XmlElement* XmlElement::child(std::string_view childName) const {
    for (const XmlElement& each : children) {
        if (each.name == childName) return &each;
    }
    return nullptr;
}

XmlElement parseXml(std::string_view document) {
    constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
    if (document.substr(0, byteOrderMark.size()) == byteOrderMark) {
        document.remove_prefix(byteOrderMark.size());
    }
    if (document.size() > INT_MAX) throw XmlError("the document is too long");
    if (!isUtf8WithoutZeros(document)) throw XmlError("the document is not UTF-8");

    // Named here, else the parser would believe what the document says.
    const std::unique_ptr<XML_ParserStruct, decltype(&XML_ParserFree)> parser(
        XML_ParserCreate("UTF-8"), &XML_ParserFree);
    if (parser == nullptr) throw std::bad_alloc();
    return TreeBuilder(document, parser.get()).build();
}

}  // namespace cmpihost::server
