#include "host/cli/MethodAnswer.h"

#include "base/Ascii.h"
#include "host/cli/Json.h"
#include "host/cli/ValueText.h"
#include "host/mof/ResolvedClass.h"

namespace cmpihost {

namespace {

/// The declaration with the qualifiers that it inherits.
mof::Feature wholeFeature(const ResolvedFeature& resolved) {
    mof::Feature feature = *resolved.declared;
    feature.qualifiers.clear();
    for (const ResolvedQualifier& qualifier : resolved.qualifiers) {
        feature.qualifiers.push_back(*qualifier.declared);
    }
    return feature;
}

std::vector<mof::Feature> answerFeatures(const ResolvedMethod& method) {
    std::vector<mof::Feature> features = {wholeFeature(method.result)};
    features.front().name = returnValueName;
    for (const ResolvedFeature& parameter : method.parameters) {
        mof::Feature feature = wholeFeature(parameter);
        if (mof::isSet(feature.qualifiers, "Out")) features.push_back(std::move(feature));
    }
    return features;
}

}  // namespace

Schema answerSchema(const OperationRequest& request, const Schema& schema) {
    Schema answers;
    const auto resolved = resolvedClass(schema, request.path.className);
    if (!resolved) return answers;
    for (const ResolvedMethod& method : resolved->methods) {
        if (!base::equalsIgnoreCase(method.result.declared->name, request.method)) continue;
        mof::Document document;
        document.classes.emplace_back();
        document.classes.back().name = resolved->declared->name;
        document.classes.back().properties = answerFeatures(method);
        answers.add(std::move(document));
        break;
    }
    return answers;
}

InstanceValue answerInstance(const OperationRequest& request, const OperationResult& result) {
    InstanceValue instance{request.path, {}};
    if (result.value) instance.properties.push_back({returnValueName, *result.value});
    for (const NamedValue& argument : result.arguments) {
        instance.properties.push_back({argument.name, argument.value});
    }
    return instance;
}

void writeAnswerJson(const OperationRequest& request, const OperationResult& result,
                     const Schema& schema, std::ostream& stream) {
    const Schema answers = answerSchema(request, schema);
    const std::string& className = request.path.className;
    JsonValue out = JsonValue::object();
    Annotations annotations;
    const auto annotate = [&](const std::string& name, const Value& value) {
        annotations.add(name, value, answers.valueMap(className, name),
                        unitsOf(answers, className, name));
    };
    if (result.value) annotate(returnValueName, *result.value);
    for (const NamedValue& argument : result.arguments) {
        out[argument.name] = valueJson(argument.value, schema);
        annotate(argument.name, argument.value);
    }
    JsonValue object = {{"method", request.method},
                        {"returnValue", result.value ? valueJson(*result.value, schema) : nullptr},
                        {"out", std::move(out)}};
    std::move(annotations).addTo(object);
    writeJson(object, stream);
}

}  // namespace cmpihost
