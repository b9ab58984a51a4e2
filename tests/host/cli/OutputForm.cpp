#include "host/cli/OutputForm.h"

#include <fstream>
#include <nlohmann/json.hpp>
#include <valijson/adapters/nlohmann_json_adapter.hpp>
#include <valijson/schema.hpp>
#include <valijson/schema_parser.hpp>
#include <valijson/validation_results.hpp>
#include <valijson/validator.hpp>

#include "host/mof/MofParser.h"

namespace {

nlohmann::json schemaOf(const std::string& form) {
    std::ifstream file(KORVA_SOURCE_DIR "/docs/cmpihost.schema.json");
    nlohmann::json document = nlohmann::json::parse(file);
    if (form.empty()) return document;
    if (!document["definitions"].contains(form)) throw std::runtime_error("no form " + form);
    return {{"$ref", "#/definitions/" + form}, {"definitions", document["definitions"]}};
}

}  // namespace

std::string complaintOnJson(const std::string& text, const std::string& form) {
    const nlohmann::json document = nlohmann::json::parse(text, nullptr, false);
    if (document.is_discarded()) return "no JSON\n";
    const nlohmann::json rules = schemaOf(form);
    valijson::Schema schema;
    valijson::SchemaParser().populateSchema(valijson::adapters::NlohmannJsonAdapter(rules), schema);
    valijson::ValidationResults results;
    valijson::Validator(valijson::Validator::kStrongTypes)
        .validate(schema, valijson::adapters::NlohmannJsonAdapter(document), &results);
    std::string complaint;
    for (const auto& error : results) {
        for (const std::string& step : error.context) complaint += step;
        complaint += ": " + error.description + '\n';
    }
    return complaint;
}

std::string complaintOnMof(const std::string& text) {
    try {
        cmpihost::mof::parse(text, "output");
    } catch (const cmpihost::mof::MofError& error) {
        return error.what();
    }
    return {};
}
