#include "host/cli/Tree.h"

#include <gtest/gtest.h>
#include <stdlib.h>
#include <time.h>

#include <sstream>

namespace {

using namespace cmpihost;

// A host with one computer system and one operating system, as answers to requests.
class FakeHost {
  public:
    OperationResult operator()(const OperationRequest& request) {
        OperationResult result;
        result.rc = failing == request.assocClass.value_or(request.path.className)
                        ? CMPI_RC_ERR_FAILED
                        : CMPI_RC_OK;
        const std::string wanted = request.assocClass.value_or(request.path.className);
        if (wanted == "KORVA_ComputerSystem") {
            if (hasComputer)
                result.instances = {instance("KORVA_ComputerSystem", {{"Name", "vm"}})};
        } else if (wanted == "KORVA_OSElementCapabilities") {
            result.instances = {instance("KORVA_OperatingSystemCapabilities", capabilities)};
        } else {
            result.instances = {instance("KORVA_OperatingSystem", system)};
        }
        return result;
    }

    bool hasComputer = true;
    std::string failing;
    std::vector<NamedValue> system = {{"Name", "Linux"},
                                      {"Version", "12"},
                                      {"EnabledState", Value::fromUnsigned(2, CMPI_uint16)},
                                      {"HealthState", Value::fromUnsigned(5, CMPI_uint16)}};
    std::vector<NamedValue> capabilities = {
        {"InstanceID", "Linux"},
        {"ElementNameEditSupported", Value::fromBoolean(false)},
        {"HostShutdownBehavior", Value::fromUnsigned(3, CMPI_uint16)}};

  private:
    static InstanceValue instance(const std::string& className,
                                  const std::vector<NamedValue>& properties) {
        InstanceValue result;
        result.path.className = className;
        for (const NamedValue& property : properties)
            result.properties.push_back({property.name, property.value});
        return result;
    }
};

const Schema& classesOfTheTree() {
    static const Schema instance = Schema::load(KORVA_SOURCE_DIR "/schema");
    return instance;
}

std::string drawn(const FakeHost& host, const Terminal& terminal = {}) {
    std::ostringstream stream;
    for (const TreeNode& root : hostTree(host, "root/cimv2", classesOfTheTree())) {
        drawTree(root, stream, terminal);
    }
    return stream.str();
}

TEST(Tree, NamesWhatItKnowsAndNumbersWhatItCannotName) {
    FakeHost host;
    host.system = {{"Name", "Linux"},
                   {"InstallDate", "20240102030405.000000+000"},
                   {"EnabledState", Value::fromUnsigned(40000, CMPI_uint16)},
                   {"HealthState", Value::null(CMPI_uint16)},
                   {"LastBootUpTime", "not a date"}};
    host.capabilities = {{"ElementNameEditSupported", Value::fromBoolean(true)},
                         {"HostShutdownBehavior", Value::fromUnsigned(65000, CMPI_uint16)}};
    setenv("TZ", "UTC0", 1);
    tzset();
    EXPECT_EQ(drawn(host), R"(vm (KORVA_ComputerSystem)
├── KORVA_InstalledOS
│   └── Linux (not known) (KORVA_OperatingSystem): installed 2024-01-02 03:04:05 +00:00
│       └── KORVA_OSElementCapabilities
│           └── (not known) (KORVA_OperatingSystemCapabilities): name editable, shutdown of the host: 65000
└── KORVA_RunningOS
    └── Linux (not known) (KORVA_OperatingSystem): Vendor Reserved, health (not known), up since not a date
)");
    host.capabilities = {};
    EXPECT_NE(drawn(host).find("name not known, shutdown of the host: (not known)\n"),
              std::string::npos);
}

TEST(Tree, WithoutAComputerShowsTheOperatingSystemsAlone) {
    FakeHost host;
    host.hasComputer = false;
    EXPECT_EQ(drawn(host), R"(no KORVA_ComputerSystem, so nothing is associated
└── Linux 12 (KORVA_OperatingSystem): installed (not known)
    └── KORVA_OSElementCapabilities
        └── Linux (KORVA_OperatingSystemCapabilities): name fixed, shutdown of the host: No effect
)");
}

TEST(Tree, IsDrawnWithAsciiWhereTheLocaleHasNoLinesAndWithinItsWidth) {
    FakeHost host;
    EXPECT_EQ(drawn(host, {60, false}), R"(vm (KORVA_ComputerSystem)
|-- KORVA_InstalledOS
|   `-- Linux 12 (KORVA_OperatingSystem): installed (not
|       |   known)
|       `-- KORVA_OSElementCapabilities
|           `-- Linux (KORVA_OperatingSystemCapabilities):
|               name fixed, shutdown of the host: No effect
`-- KORVA_RunningOS
    `-- Linux 12 (KORVA_OperatingSystem): Enabled, health
        OK, up since (not known)
)");
    EXPECT_EQ(drawn(host, {0, false}).find("└"), std::string::npos);
}

TEST(Tree, HasAFormForPrograms) {
    FakeHost host;
    host.hasComputer = false;
    host.system = {{"Name", "Linux"}, {"HealthState", Value::fromUnsigned(5, CMPI_uint16)}};
    host.capabilities = {};
    std::ostringstream stream;
    writeTreeJson(hostTree(host, "root/cimv2", classesOfTheTree()), stream, classesOfTheTree());
    EXPECT_EQ(stream.str(), R"json([
  {
    "label": "no KORVA_ComputerSystem, so nothing is associated",
    "branches": [
      {
        "label": "Linux (not known) (KORVA_OperatingSystem): installed (not known)",
        "element": {
          "class": "KORVA_OperatingSystem",
          "path": "KORVA_OperatingSystem",
          "keys": {},
          "properties": {
            "Name": "Linux",
            "HealthState": 5
          },
          "names": {
            "HealthState": "OK"
          },
          "times": {},
          "units": {}
        },
        "branches": [
          {
            "label": "(not known) (KORVA_OperatingSystemCapabilities): name not known, shutdown of the host: (not known)",
            "association": "KORVA_OSElementCapabilities",
            "element": {
              "class": "KORVA_OperatingSystemCapabilities",
              "path": "KORVA_OperatingSystemCapabilities",
              "keys": {},
              "properties": {},
              "names": {},
              "times": {},
              "units": {}
            },
            "branches": []
          }
        ]
      }
    ]
  }
]
)json");
}

TEST(Tree, WritesControlCharactersOut) {
    FakeHost host;
    host.system = {{"Name", "a\x1b[31m\n"}, {"Version", "1"}};
    host.hasComputer = false;
    EXPECT_EQ(drawn(host).find('\x1b'), std::string::npos);
}

TEST(Tree, FailedAnswerEndsIt) {
    for (const char* failing : {"KORVA_ComputerSystem", "KORVA_InstalledOS", "KORVA_RunningOS",
                                "KORVA_OSElementCapabilities"}) {
        FakeHost host;
        host.failing = failing;
        EXPECT_THROW(drawn(host), TreeFailure) << failing;
    }
}

}  // namespace
