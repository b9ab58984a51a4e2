#include "facade/FacadeFixture.h"

#include <algorithm>

namespace facade {

const char* const file = KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1";

LoadOptions loadOptions() {
    LoadOptions options;
    options.providerName = "OSStatusFacade";
    return options;
}

ObjectPathValue operatingSystemWith(const std::vector<KeyBinding>& changes) {
    ObjectPathValue result = operatingSystemPath("host1", "Linux");
    for (const KeyBinding& change : changes) {
        const auto same = [&change](const KeyBinding& key) { return key.name == change.name; };
        const auto found = std::find_if(result.keys.begin(), result.keys.end(), same);
        if (found == result.keys.end())
            result.keys.push_back(change);
        else
            found->value = change.value;
    }
    return result;
}

Texts propertyNames(const InstanceValue& instance) {
    Texts result;
    for (const PropertyValue& property : instance.properties) result.push_back(property.name);
    return result;
}

FacadeFixture::FacadeFixture(BrokerOptions options)
    : LibraryFixture(options), facade(file, broker, loadOptions()) {}

Outcome FacadeFixture::ask(const OperationRequest& request) {
    recording::clear();
    return cmpihost::invoke(facade, broker, request);
}

Outcome FacadeFixture::ask(Operation operation, const ObjectPathValue& path,
                           std::optional<Texts> properties) {
    OperationRequest request = requestFor(operation, path);
    request.properties = std::move(properties);
    return ask(request);
}

Texts FacadeFixture::delivered(const OperationRequest& request) {
    const Outcome outcome = ask(request);
    EXPECT_EQ(outcome.rc, CMPI_RC_OK) << outcome.message.value_or("");
    EXPECT_FALSE(outcome.message.has_value());
    EXPECT_EQ(outcome.doneCount, 1U);
    for (const recording::Record& record : recording::take())
        EXPECT_NE(record.category, "Zumbrel.OSStatusFacade") << record.text;
    Texts result = texts(outcome.paths);
    for (const std::string& text : texts(outcome.instances)) result.push_back(text);
    return result;
}

unsigned FacadeFixture::upcalls(const OperationRequest& request) {
    FaultPlan plan;
    broker.setFaultPlan(&plan);
    ask(request);
    broker.setFaultPlan(nullptr);
    unsigned count = 0;
    for (const auto& [entry, calls] : plan.callsByEntry())
        if (entry.rfind("CMPIBrokerFT.", 0) == 0) count += calls;
    return count;
}

std::string FacadeFixture::refusal(const OperationRequest& request) {
    const Outcome outcome = ask(request);
    EXPECT_THAT(outcome.paths, testing::IsEmpty());
    EXPECT_THAT(outcome.instances, testing::IsEmpty());
    EXPECT_EQ(outcome.doneCount, 0U);
    const std::string text = outcome.message.value_or("(no message)");
    std::vector<recording::Record> records;
    for (const recording::Record& record : recording::take())
        if (record.category == "Zumbrel.OSStatusFacade") records.push_back(record);
    const std::string rendered = recording::rendered(records);
    EXPECT_THAT(rendered,
                testing::MatchesRegex("both OSStatusFacade_[A-Za-z]* Facade.cpp:# "
                                      "Zumbrel.OSStatusFacade 3000 null 0 0 . MESSAGE .File: "
                                      "Facade.cpp, Line: #.: [^\n]*\n"));
    EXPECT_THAT(rendered, testing::EndsWith("]: " + text + "\n"));
    return std::to_string(outcome.rc) + " " + text;
}

OperationRequest associationRequest(Operation operation, const ObjectPathValue& source,
                                    const std::string& associationClass) {
    OperationRequest request = requestFor(operation, source);
    if (!associationClass.empty())
        (ofReferences(operation) ? request.resultClass : request.assocClass) = associationClass;
    return request;
}

}  // namespace facade
