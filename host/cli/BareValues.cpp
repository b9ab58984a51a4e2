#include "host/cli/BareValues.h"

#include <algorithm>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/cli/MethodAnswer.h"
#include "host/cli/PathParser.h"
#include "host/cli/Suggestion.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

bool yieldsAssociations(Operation operation) {
    return operation == Operation::References || operation == Operation::ReferenceNames;
}

/// The class from which all results are or descend; empty: they may be of any.
std::string classOfResults(const OperationRequest& request) {
    if (isAssociationOperation(request.operation)) return request.resultClass.value_or("");
    return request.operation == Operation::ExecQuery ? std::string() : request.path.className;
}

/// The names of what the answer of a method can have; none when the schema does not have it.
std::vector<std::string> answerNames(const OperationRequest& request, const Schema& schema) {
    std::vector<std::string> names;
    const Schema answers = answerSchema(request, schema);
    for (const mof::Feature* feature : answers.properties(request.path.className)) {
        names.push_back(feature->name);
    }
    return names;
}

/// The names of what the results can have.
std::vector<std::string> possibleNames(const OperationRequest& request, const Schema& schema) {
    if (request.operation == Operation::InvokeMethod) return answerNames(request, schema);
    const std::string base = classOfResults(request);
    std::vector<std::string> names;
    for (const std::string& className : schema.classNames()) {
        if (!base.empty() && !schema.isA(className, base)) continue;
        if (yieldsAssociations(request.operation) && !schema.isAssociation(className)) continue;
        for (const mof::Feature* property : schema.properties(className)) {
            if (!yieldsPaths(request.operation) || schema.isKey(className, property->name)) {
                names.push_back(property->name);
            }
        }
    }
    return names;
}

/// Who does not have the value, and as what.
std::string whatLacksIt(const OperationRequest& request, const std::string& base,
                        const Schema& schema) {
    if (request.operation == Operation::InvokeMethod) {
        return "the method " + base::escapeForTerminal(request.method) + " answers with no value";
    }
    const std::string what = yieldsPaths(request.operation) ? "key" : "property";
    if (!base.empty()) return "the class " + schema.find(base)->name + " declares no " + what;
    const std::string kind = yieldsAssociations(request.operation) ? "association" : "class";
    return "no " + kind + " of the schema declares a " + what;
}

std::string bareText(const Value& value) {
    if (categoryOf(value) == TypeCategory::Boolean) return value.boolean() ? "TRUE" : "FALSE";
    if (categoryOf(value) == TypeCategory::Character) return characterText(value.unsignedInteger());
    return value.toText();
}

class ValuePrinter final : public Printer {
  public:
    ValuePrinter(std::ostream& stream, const std::string& property)
        : stream_(stream), property_(property) {}

    void print(const std::vector<InstanceValue>& instances) override {
        for (const InstanceValue& instance : instances) print(instance.property(property_));
    }

    void print(const std::vector<ObjectPathValue>& paths) override {
        for (const ObjectPathValue& path : paths) print(path.key(property_));
    }

  private:
    void print(const Value* value) {
        if (value == nullptr || value->isNull()) return;
        if (value->isArray()) {
            for (const Value& element : value->elements()) print(&element);
        } else {
            stream_ << base::escapeForTerminal(bareText(*value)) << '\n';
        }
    }

    std::ostream& stream_;
    const std::string property_;
};

}  // namespace

void checkValueName(const std::string& property, const OperationRequest& request,
                    const Schema& schema) {
    const std::string base = classOfResults(request);
    if (schema.find(request.path.className) == nullptr) return;
    if (!base.empty() && schema.find(base) == nullptr) return;
    const std::vector<std::string> names = possibleNames(request, schema);
    const auto isMeant = [&](const std::string& name) {
        return base::equalsIgnoreCase(name, property);
    };
    const bool isUnknownMethod = request.operation == Operation::InvokeMethod && names.empty();
    if (isUnknownMethod || std::any_of(names.begin(), names.end(), isMeant)) return;
    throw UsageError("--value: " + whatLacksIt(request, base, schema) + " '" +
                     base::escapeForTerminal(property) + "'" + didYouMean(property, names));
}

std::unique_ptr<Printer> makeValuePrinter(std::ostream& stream, const std::string& property) {
    return std::make_unique<ValuePrinter>(stream, property);
}

std::string noteOnValues(const std::string& property, const OperationResult& result) {
    const auto isAbsent = [](const Value* value) { return value == nullptr || value->isNull(); };
    const auto lacksProperty = [&](const InstanceValue& instance) {
        return isAbsent(instance.property(property));
    };
    const auto lacksKey = [&](const ObjectPathValue& path) { return isAbsent(path.key(property)); };
    const auto lacking =
        std::count_if(result.instances.begin(), result.instances.end(), lacksProperty) +
        std::count_if(result.paths.begin(), result.paths.end(), lacksKey);
    if (lacking == 0) return {};
    const std::size_t all = result.instances.size() + result.paths.size();
    return std::to_string(lacking) + " of " + std::to_string(all) +
           (all == 1 ? " result has" : " results have") + " no value of " +
           base::escapeForTerminal(property);
}

}  // namespace cmpihost
