// MOF: read, added to a schema, and its texts written and read back.
#include <algorithm>

#include "base/Utf8.h"
#include "fuzz/Invariant.h"
#include "host/mof/MofLexer.h"
#include "host/mof/MofParser.h"
#include "host/mof/ResolvedClass.h"
#include "host/mof/Schema.h"

using namespace cmpihost;

namespace {

void checkError(const mof::MofError& error, std::string_view text) {
    const auto lines = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n')) + 1;
    fuzz::expect(error.position().line >= 1 && error.position().line <= lines,
                 "an error lies on a line of the text");
    fuzz::expect(
        error.position().column >= 1 && error.position().column <= base::countUtf8(text) + 1,
        "an error lies on a column of the text");
    fuzz::expect(!error.complaint().empty(), "an error says what is wrong");
}

void checkSchema(const Schema& schema) {
    for (const std::string& name : schema.classNames()) {
        fuzz::expect(schema.find(name) != nullptr, "a class is found by its name");
        fuzz::expect(schema.isA(name, name), "a class is itself");
        schema.isAssociation(name);
        for (const mof::Feature* property : schema.properties(name)) {
            fuzz::expect(schema.findProperty(name, property->name) != nullptr,
                         "a property is found by its name");
            schema.isKey(name, property->name);
            schema.valueMap(name, property->name);
        }
    }
    for (const std::string& name : schema.classNames()) {
        const std::optional<ResolvedClass> resolved = resolvedClass(schema, name);
        fuzz::expect(resolved.has_value(), "a class can be resolved");
        fuzz::expect(resolved->properties.size() == schema.properties(name).size(),
                     "a class has the same properties in both lists");
        fuzz::expect(resolved->superclasses.empty() ||
                         !schema.subclasses(resolved->superclasses.front()->name).empty(),
                     "a superclass has subclasses");
    }
    const SchemaCatalogue catalogue(schema);
    for (const std::string& name : schema.classNames())
        fuzz::expect(catalogue.find(name) != nullptr, "the catalogue has every class");
}

void checkText(std::string_view text) {
    const std::string written = mof::stringLiteral(text);
    mof::Lexer lexer(written, "written");
    fuzz::expect(lexer.next().text == base::toValidUtf8(text),
                 "a text is read back as it was written");
    fuzz::expect(lexer.next().kind == mof::TokenKind::End, "a text is one token");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = fuzz::textOf(data, size);
    checkText(text);
    try {
        Schema schema;
        schema.add(mof::parse(text, "input"));
        checkSchema(schema);
    } catch (const mof::MofError& error) {
        checkError(error, text);
    }
    return 0;
}
