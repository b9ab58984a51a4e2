#include <algorithm>

#include "base/Ascii.h"
#include "facade/FacadeFixture.h"

// The facade beside another association provider, asked in the two ways that object managers have.

namespace {

using namespace facade;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

const CMPIBroker* linkBroker;

CMPIObjectPath* linkPath(const char* className, const char* name) {
    CMPIObjectPath* const path =
        linkBroker->eft->newObjectPath(linkBroker, "root/cimv2", className, nullptr);
    path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name), CMPI_chars);
    return path;
}

enum class What { farEnd, link };
enum class Form { path, instance };

// The other provider: TEST_Link ties TEST_Thing to the computer system. It looks at nothing but
// association class and source class, as simple providers do.
template <What what, Form form, class... Filters>
CMPIStatus answer(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                  const CMPIObjectPath* source, const char* associationClass, Filters...) {
    const CMPIString* const sourceClass = source->ft->getClassName(source, nullptr);
    const char* const name = sourceClass->ft->getCharPtr(sourceClass, nullptr);
    const bool fromThing = base::equalsIgnoreCase(name, "TEST_Thing");
    const bool isTied = associationClass == nullptr ||
                        base::equalsIgnoreCase(associationClass, "TEST_Link") ||
                        base::equalsIgnoreCase(associationClass, "CIM_Dependency");
    if (isTied && (fromThing || base::equalsIgnoreCase(name, "KORVA_ComputerSystem"))) {
        const CMPIObjectPath* const path = what == What::link ? linkPath("TEST_Link", "link")
                                           : fromThing ? linkPath("KORVA_ComputerSystem", "host1")
                                                       : linkPath("TEST_Thing", "thing");
        if (form == Form::path)
            result->ft->returnObjectPath(result, path);
        else
            result->ft->returnInstance(result,
                                       linkBroker->eft->newInstance(linkBroker, path, nullptr));
    }
    result->ft->returnDone(result);
    return {CMPI_RC_OK, nullptr};
}

constexpr CMPIAssociationMIFT linkTable = {
    CMPIVersion200,
    CMPIVersion200,
    "associationTestLink",
    nullptr,
    answer<What::farEnd, Form::instance>,
    answer<What::farEnd, Form::path>,
    answer<What::link, Form::instance>,
    answer<What::link, Form::path>,
};

class ObjectManagers : public FacadeFixture {
  protected:
    struct Registered {
        ManagementInterfaces interfaces;
        std::vector<std::pair<const char*, Texts>> associations;  // and the classes they refer to
    };

    ObjectManagers() : FacadeFixture() {
        linkBroker = plainBroker.cmpi();
        plainBroker.route(ComputerSystemService::className, computers);
    }

    void registerProviders(const ProviderLibrary& ours) {
        const Texts systems = {"KORVA_OperatingSystem", "KORVA_ComputerSystem"};
        providers = {{ours.interfaces(),
                      {{"KORVA_InstalledOS", systems},
                       {"KORVA_RunningOS", systems},
                       {"KORVA_OSElementCapabilities",
                        {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities"}}}},
                     {{nullptr, &link}, {{"TEST_Link", {"TEST_Thing", "KORVA_ComputerSystem"}}}}};
    }

    static void append(Texts& all, const Outcome& outcome) {
        for (const std::string& text : texts(outcome.paths)) all.push_back(text);
        for (const std::string& text : texts(outcome.instances)) all.push_back(text);
    }

    // As sfcb: every association provider gets the client's filters, and the first failure is the
    // answer.
    Texts everyProvider(const OperationRequest& request) {
        Texts result;
        for (const Registered& provider : providers) {
            const Outcome outcome = cmpihost::invoke(provider.interfaces, plainBroker, request);
            if (outcome.rc != CMPI_RC_OK) return {"failed: " + std::to_string(outcome.rc)};
            append(result, outcome);
        }
        return result;
    }

    // As OpenPegasus: one call for each association class that refers to the source's class, with
    // its name; a provider that supports no such operation is forgiven.
    Texts everyClass(OperationRequest request) {
        Texts result;
        for (const Registered& provider : providers)
            for (const auto& [association, classes] : provider.associations) {
                if (std::find(classes.begin(), classes.end(), request.path.className) ==
                    classes.end())
                    continue;
                (ofReferences(request.operation) ? request.resultClass : request.assocClass) =
                    association;
                const Outcome outcome = cmpihost::invoke(provider.interfaces, plainBroker, request);
                if (outcome.rc == CMPI_RC_ERR_NOT_SUPPORTED) continue;
                if (outcome.rc != CMPI_RC_OK) return {"failed: " + std::to_string(outcome.rc)};
                append(result, outcome);
            }
        return result;
    }

    CMPIAssociationMI link = {nullptr, const_cast<CMPIAssociationMIFT*>(&linkTable)};
    Broker plainBroker;  // knows no schema, so that there may be other classes
    ProviderLibrary bareProvider{providerFile, plainBroker};
    ProviderLibrary inFront{file, plainBroker, loadOptions()};
    std::vector<Registered> providers;
};

const ObjectPathValue thing = path("TEST_Thing", {{"Name", "thing"}});
const std::string farOfThing = R"(root/cimv2:KORVA_ComputerSystem.Name="host1")";
const std::string linkOfThing = R"(root/cimv2:TEST_Link.Name="link")";

TEST_F(ObjectManagers, AnotherProvidersObjectsAreAnsweredAsIfTheFacadeWereNotThere) {
    registerProviders(inFront);
    for (const Operation operation : associationOperations) {
        const std::string expected = ofReferences(operation) ? linkOfThing : farOfThing;
        for (const char* associationClass : {"", "TEST_Link", "CIM_Dependency"})
            EXPECT_THAT(everyProvider(associationRequest(operation, thing, associationClass)),
                        ElementsAre(expected));
        EXPECT_THAT(everyClass(associationRequest(operation, thing)), ElementsAre(expected));
        EXPECT_THAT(everyProvider(associationRequest(operation, thing, "CIM_Other")), IsEmpty());
    }
}

// Both providers know it.
TEST_F(ObjectManagers, ComputerSystemIsAnsweredByBothProviders) {
    registerProviders(inFront);
    const ObjectPathValue source = computerSystemPath("host1");
    for (const Operation operation : {Operation::AssociatorNames, Operation::Associators}) {
        const auto request = [&](const char* associationClass) {
            return associationRequest(operation, source, associationClass);
        };
        const std::string far = R"(root/cimv2:TEST_Thing.Name="thing")";
        EXPECT_THAT(everyProvider(request("")), ElementsAre(operatingSystem, far));
        EXPECT_THAT(everyProvider(request("CIM_Dependency")), ElementsAre(operatingSystem, far));
        EXPECT_THAT(everyProvider(request("KORVA_InstalledOS")), ElementsAre(operatingSystem));
        EXPECT_THAT(everyProvider(request("TEST_Link")), ElementsAre(far));
        EXPECT_THAT(everyClass(request("")), ElementsAre(operatingSystem, operatingSystem, far));
    }
    for (const Operation operation : {Operation::ReferenceNames, Operation::References}) {
        const auto request = [&](const char* associationClass) {
            return associationRequest(operation, source, associationClass);
        };
        const auto installed = StartsWith("root/cimv2:KORVA_InstalledOS.");
        const auto running = StartsWith("root/cimv2:KORVA_RunningOS.");
        EXPECT_THAT(everyProvider(request("")), ElementsAre(installed, running, linkOfThing));
        EXPECT_THAT(everyProvider(request("CIM_Dependency")), ElementsAre(running, linkOfThing));
        EXPECT_THAT(everyProvider(request("KORVA_InstalledOS")), ElementsAre(installed));
        EXPECT_THAT(everyProvider(request("TEST_Link")), ElementsAre(linkOfThing));
        EXPECT_THAT(everyClass(request("")), ElementsAre(installed, running, linkOfThing));
    }
}

TEST_F(ObjectManagers, WithoutComputerSystemsAnotherProvidersObjectsAreAnsweredToo) {
    registerProviders(inFront);
    computers.failEnumerations(CMPI_RC_ERR_NOT_FOUND);
    EXPECT_THAT(everyProvider(associationRequest(Operation::AssociatorNames, thing)),
                ElementsAre(farOfThing));
    EXPECT_THAT(everyProvider(associationRequest(Operation::AssociatorNames,
                                                 operatingSystemPath("host1", "Linux"))),
                ElementsAre(capabilities));
}

TEST_F(ObjectManagers, FacadesObjectsAreAnsweredBesideAnotherProvider) {
    registerProviders(inFront);
    const ObjectPathValue source = operatingSystemPath("host1", "Linux");
    const OperationRequest names = associationRequest(Operation::AssociatorNames, source);
    EXPECT_THAT(everyProvider(names), ElementsAre(computerSystem, capabilities));
    // Class by class, what two associations lead to comes twice, as from any provider.
    EXPECT_THAT(everyClass(names), ElementsAre(computerSystem, computerSystem, capabilities));
    EXPECT_EQ(everyProvider(associationRequest(Operation::ReferenceNames, source)).size(), 3U);
    EXPECT_EQ(everyClass(associationRequest(Operation::ReferenceNames, source)).size(), 3U);
    OperationRequest filtered = names;
    filtered.role = "ManagedElement";
    EXPECT_THAT(everyProvider(filtered), ElementsAre(capabilities));
    EXPECT_THAT(everyClass(filtered), ElementsAre(capabilities));
}

/// Serves computer systems of any paths.
class Systems final : public UpcallService {
  public:
    UpcallAnswer perform(Broker&, const OperationRequest&) override {
        UpcallAnswer answer;
        for (const ObjectPathValue& path : paths) answer.instances.push_back({path, {}});
        answer.paths = paths;
        return answer;
    }

    std::vector<ObjectPathValue> paths;
};

TEST_F(ObjectManagers, ComputerSystemsAreTheSameExactlyIfTheirKeysAre) {
    struct Row {
        const char* what;
        std::vector<KeyBinding> keys, others;
        std::size_t systems;
    };
    const auto dateTime = [](const char* text) { return Value::fromText(text, CMPI_dateTime); };
    const Value day = dateTime("20260101000000.000000+000");
    const Row rows[] = {
        {"equal reals", {{"Name", Value::fromReal(1)}}, {{"Name", Value::fromReal(1)}}, 1},
        {"reals", {{"Name", Value::fromReal(1)}}, {{"Name", Value::fromReal(2)}}, 2},
        {"short reals",
         {{"Name", Value::fromReal(1, CMPI_real32)}},
         {{"Name", Value::fromReal(2, CMPI_real32)}},
         2},
        {"a real and nothing", {{"Name", Value::fromReal(0)}}, {{"Name", ""}}, 2},
        {"equal dates", {{"Name", day}}, {{"Name", day}}, 1},
        {"dates", {{"Name", day}}, {{"Name", dateTime("20260102000000.000000+000")}}, 2},
        {"a date and a real", {{"Name", day}}, {{"Name", Value::fromReal(1)}}, 2},
        {"a date and its text", {{"Name", day}}, {{"Name", "20260101000000.000000+000"}}, 2},
        {"two keys and a name that looks like them",
         {{"a", "x"}, {"b", "y"}},
         {{"a=6:text x\nb", "y"}},
         2},
    };
    registerProviders(inFront);
    setNodes({"Linux", "Linux"});  // each with one of the two computer systems
    Systems systems;
    plainBroker.route(ComputerSystemService::className, systems);
    for (const Row& row : rows) {
        systems.paths = {path(ComputerSystemService::className, row.keys),
                         path(ComputerSystemService::className, row.others),
                         computerSystemPath("last")};  // in no pair, as the last of several
        for (const Operation operation : {Operation::ReferenceNames, Operation::AssociatorNames})
            EXPECT_EQ(
                everyProvider(associationRequest(operation, operatingSystemPath("host1", "Linux"),
                                                 "KORVA_InstalledOS"))
                    .size(),
                row.systems)
                << row.what;
    }
    plainBroker.route(ComputerSystemService::className, computers);
}

// Why there is a facade.
TEST_F(ObjectManagers, ProviderAloneBreaksTheRequestsOfAnother) {
    registerProviders(bareProvider);
    for (const Operation operation : associationOperations)
        EXPECT_THAT(everyProvider(associationRequest(operation, thing)),
                    ElementsAre(ofReferences(operation) ? "failed: 7" : "failed: 5"));
}

}  // namespace
