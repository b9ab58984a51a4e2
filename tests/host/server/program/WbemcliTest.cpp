// The built endpoint as the WBEM command line client of the distributions sees it: every operation
// that this client has, on a host that is the same everywhere. What it prints stands in runs/.
#include <gmock/gmock.h>

#include <sys/utsname.h>

#include <regex>

#include "support/EndpointProcess.h"
#include "support/GoldenFile.h"
#include "support/ProgramRun.h"
#include "support/TemporaryDirectory.h"

namespace {

using Words = std::vector<std::string>;

/// The host's name, as uname tells it.
std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename;
}

std::string replaced(std::string text, const std::string& part, const std::string& by) {
    for (std::size_t at = text.find(part); at != std::string::npos;
         at = text.find(part, at + by.size()))
        text.replace(at, part.size(), by);
    return text;
}

/// Each command line, with what wbemcli printed. A word that begins with "@" is an object of the
/// endpoint. Addresses have the same names on every machine.
std::string transcript(const EndpointProcess& endpoint, const std::vector<Words>& runs) {
    const std::string address = "127.0.0.1:" + std::to_string(endpoint.port());
    std::string text;
    for (const Words& words : runs) {
        text += "$ wbemcli";
        Words arguments;
        for (const std::string& word : words) {
            const bool object = word[0] == '@';
            arguments.push_back(object ? "http://" + address + '/' + word.substr(1) : word);
            const bool plain = word.find_first_of(" \"*{}") == std::string::npos;
            text += plain ? ' ' + word : " '" + word + "'";
        }
        const ProgramRun run = runProgram("/usr/bin/wbemcli", arguments);
        text += "\n" + run.out;
        if (!run.out.empty() && run.out.back() != '\n') text += '\n';
        for (const std::string& line : lines(run.err)) text += "! " + line + "\n";
        text += "exit " + std::to_string(run.status) + "\n\n";
    }
    text = replaced(std::move(text), address, "ENDPOINT");
    text = replaced(std::move(text), nodeName() + "/root", "HOST/root");
    text = replaced(std::move(text), '"' + nodeName() + '"', "\"HOST\"");
    text = replaced(std::move(text), "<HOST>" + nodeName(), "<HOST>HOST");
    return std::regex_replace(text, std::regex("(Date|Content-Length): [^\n]*"), "$1: ...");
}

void expectTranscript(const char* file, const Words& options, const std::vector<Words>& runs) {
    EndpointProcess endpoint(KORVA_SERVE, options);
    expectGolden(std::string(KORVA_TEST_DATA "/runs/") + file, transcript(endpoint, runs));
    const EndpointProcess::End end = endpoint.stop();
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.err, "");
}

const std::string operatingSystem =
    "@root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
    "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Fixture "
    "Linux\"";
const std::string computer =
    "@root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\","
    "Name=\"fixture.example\"";
const std::string capabilities =
    "@root/"
    "cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"Fixture Linux\"";

TEST(Wbemcli, SeesTheInstancesOfTheHost) {
    std::vector<Words> runs;
    for (const char* name :
         {"KORVA_OperatingSystem", "KORVA_ComputerSystem", "KORVA_OperatingSystemCapabilities",
          "KORVA_InstalledOS", "KORVA_RunningOS", "KORVA_OSElementCapabilities"}) {
        runs.push_back({"ein", std::string("@root/cimv2:") + name});
        runs.push_back({"ei", "-nl", std::string("@root/cimv2:") + name});
    }
    const std::vector<Words> others = {
        {"ei", "@root/cimv2:KORVA_OperatingSystem"},
        {"ei", "-nl", "-t", "@root/cimv2:korva_operatingsystem"},
        {"ei", "-nl", "@root/cimv2:KORVA_OperatingSystem", "OSType,Version,OperationalStatus"},
        {"ei", "-nl", "@root/cimv2:KORVA_OperatingSystem", "ostype,Nonsense"},
        {"ei", "-nl", "@root/cimv2:CIM_OperatingSystem", "Name,NumberOfProcesses"},
        {"ein", "@root/cimv2:CIM_ManagedElement"},
        {"ein", "@root/cimv2:CIM_Dependency"},
        {"ein", "@ROOT/CIMV2:CIM_System"},
        {"ein", "@root/cimv2:KORVA_Nothing"},
        {"ei", "@root/cimv2:KORVA_Nothing"},
        {"ein", "@root/nowhere:KORVA_OperatingSystem"},
        {"ei", "@root/nowhere:KORVA_OperatingSystem"},
        // One instance.
        {"gi", "-nl", operatingSystem},
        {"gi", "-nl", operatingSystem, "Name,MaxNumberOfProcesses,LastBootUpTime,Distributed"},
        {"gi", "-nl", computer},
        {"gi", "-nl", capabilities},
        {"gi", "-nl",
         "@root/cimv2:KORVA_OperatingSystem.Name=\"Fixture Linux\",CreationClassName="
         "\"KORVA_OperatingSystem\",csname=\"fixture.example\",CSCreationClassName="
         "\"KORVA_ComputerSystem\"",
         "OSType"},
        {"gi",
         "@root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
         "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Other\""},
        {"gi", "@root/cimv2:KORVA_OperatingSystem.CSName=\"fixture.example\""},
        {"gi", "@root/cimv2:KORVA_OperatingSystem.Nonsense=\"fixture.example\""},
        {"gi", "@root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"other\""},
        {"gi", "@root/cimv2:KORVA_Nothing.InstanceID=\"other\""},
        {"gi", "@root/nowhere:KORVA_OperatingSystem.Name=\"other\""},
        // One property.
        {"gp", operatingSystem, "Version"},
        {"gp", operatingSystem, "OperationalStatus"},
        {"gp", operatingSystem, "Nonsense"},
        // What the provider refuses.
        {"sp", operatingSystem, "Version=\"13\""},
        {"ci",
         "@root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
         "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Other\"",
         "Name=\"Other\",Version=\"13\""},
        {"mi", operatingSystem, "Version=\"13\""},
        {"di", operatingSystem},
        {"cm", operatingSystem, "Reboot"},
        {"cm", operatingSystem, "Nonsense"},
        {"cmx", operatingSystem, "Reboot"},
    };
    runs.insert(runs.end(), others.begin(), others.end());
    expectTranscript("Instances.txt", {}, runs);
}

TEST(Wbemcli, FollowsTheAssociationsOfTheHost) {
    std::vector<Words> runs;
    for (const std::string& source : {operatingSystem, computer, capabilities}) {
        for (const char* operation : {"ain", "rin"}) runs.push_back({operation, source});
        for (const char* operation : {"ai", "ri"}) runs.push_back({operation, "-nl", source});
    }
    const std::vector<Words> others = {
        {"ain", "-ac", "KORVA_InstalledOS", operatingSystem},
        {"ain", "-ac", "CIM_RunningOS", operatingSystem},
        {"ain", "-ac", "CIM_Dependency", operatingSystem},
        {"ain", "-ac", "KORVA_OSElementCapabilities", operatingSystem},
        {"ain", "-ac", "KORVA_Nothing", operatingSystem},
        {"ain", "-ac", "KORVA_ComputerSystem", operatingSystem},
        {"ain", "-arc", "CIM_System", operatingSystem},
        {"ain", "-arc", "KORVA_OperatingSystemCapabilities", operatingSystem},
        {"ain", "-arc", "CIM_OperatingSystem", operatingSystem},
        {"ain", "-ar", "PartComponent", operatingSystem},
        {"ain", "-ar", "GroupComponent", operatingSystem},
        {"ain", "-arr", "dependent", operatingSystem},
        {"ain", "-arr", "Antecedent", operatingSystem},
        {"ain", "-ac", "CIM_InstalledOS", "-arc", "CIM_ComputerSystem", "-ar", "PartComponent",
         "-arr", "GroupComponent", operatingSystem},
        {"ai", "-nl", "-ac", "KORVA_InstalledOS", operatingSystem, "Name"},
        {"ai", "-nl", "-arc", "CIM_Capabilities", operatingSystem},
        {"rin", "-arc", "KORVA_RunningOS", operatingSystem},
        {"rin", "-arc", "CIM_Component", operatingSystem},
        {"rin", "-ar", "Antecedent", operatingSystem},
        {"rin", "-dr", "-ar", "Antecedent", operatingSystem},
        {"ri", "-nl", "-arc", "CIM_ElementCapabilities", "-ar", "ManagedElement", operatingSystem,
         "Capabilities"},
        // From classes.
        {"ain", "@root/cimv2:KORVA_OperatingSystem"},
        {"rin", "@root/cimv2:KORVA_OperatingSystem"},
        {"ai", "-nl", "@root/cimv2:KORVA_OperatingSystem"},
        {"ri", "-nl", "@root/cimv2:KORVA_OperatingSystem"},
        // From what is not there.
        {"ain",
         "@root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
         "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Other\""},
        {"rin", "@root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"other\""},
        {"ain", "@root/cimv2:KORVA_Nothing.Name=\"x\""},
        {"ai", "@root/cimv2:KORVA_OperatingSystem.Name=\"Fixture Linux\""},
        {"ri", "@root/nowhere:KORVA_OperatingSystem.Name=\"Fixture Linux\""},
    };
    runs.insert(runs.end(), others.begin(), others.end());
    expectTranscript("Associations.txt", {}, runs);
}

TEST(Wbemcli, SeesTheClasses) {
    expectTranscript("Classes.txt", {},
                     {
                         {"ecn", "@root/cimv2"},
                         {"ecn", "@root/cimv2:CIM_Dependency"},
                         {"ecn", "@root/cimv2:KORVA_Nothing"},
                         {"ecn", "@root/interop"},
                         {"ecn", "@root/nowhere"},
                         {"ec", "-nl", "@root/cimv2:CIM_ElementCapabilities"},
                         {"ec", "-nl", "@root/cimv2:KORVA_Nothing"},
                         {"gc", "-nl", "@root/cimv2:KORVA_OperatingSystem"},
                         {"gc", "-nl", "-t", "@root/cimv2:KORVA_InstalledOS"},
                         {"gc", "-nl", "@root/cimv2:KORVA_OperatingSystem", "Name,OSType"},
                         {"gc", "@root/cimv2:KORVA_Nothing"},
                         {"gc", "@root/nowhere:KORVA_OperatingSystem"},
                         {"gcd", "@root/cimv2:KORVA_OperatingSystem"},
                         {"gcd", "@root/cimv2:KORVA_OSElementCapabilities"},
                         {"gcd", "@root/cimv2:KORVA_Nothing"},
                         {"dc", "@root/cimv2:KORVA_OperatingSystem"},
                     });
}

TEST(Wbemcli, FindsTheNamespaces) {
    expectTranscript("Interop.txt", {},
                     {
                         {"ein", "@root/interop:CIM_Namespace"},
                         {"ei", "-nl", "@root/interop:CIM_Namespace"},
                         {"ein", "@root/interop:CIM_ObjectManager"},
                         {"ein", "@root/interop:__Namespace"},
                         {"ein", "@root/interop:CIM_ManagedElement"},
                         {"ein", "@root/interop:KORVA_OperatingSystem"},
                         {"ein", "@interop:CIM_Namespace"},
                         {"ein", "@root/PG_InterOp:CIM_Namespace"},
                         {"gc", "-nl", "@root/interop:CIM_Namespace"},
                         {"ei", "@root/cimv2:CIM_Namespace"},
                     });
}

TEST(Wbemcli, WorksWithProvidersOfOtherMakers) {
    const std::string folder = KORVA_SOURCE_DIR "/tests/host/providers";
    const std::string first = "@root/test:TEST_Thing.Name=\"first\"";
    const std::string second = "@root/test:TEST_Thing.Name=\"second\"";
    const std::string all = "@root/test:TEST_Thing.Name=\"all\"";
    expectTranscript(
        "Foreign.txt", {"--registration", folder, "--schema", folder},
        {
            {"ei", "-nl", "@root/test:TEST_Thing"},
            {"ein", "@root/test:TEST_Part"},
            {"ein", "@root/other:TEST_Part"},
            {"ein", "@root/other:TEST_SparePart"},
            {"ein", "@root/third:TEST_Part"},
            {"ain", first},
            {"ai", "-nl", first},
            {"ain", "-ac", "TEST_SpareLink", first},
            {"ain", "-ac", "TEST_Part", first},
            {"ain", "@root/test:TEST_Part.Id=\"wheel\""},
            {"rin", first},
            // What is created, changed and deleted is there for the next request.
            {"ci", second, "Name=\"second\",Text=\"one two\""},
            {"ci", second, "Name=\"second\""},
            // wbemcli does not escape what it sends.
            {"ci", all, "Name=\"a & b\""},
            {"ein", "@root/test:TEST_Thing"},
            {"gi", "-nl", second},
            {"mi", second, "Text=\"new\""},
            {"gp", second, "Text"},
            {"sp", second, "Text=\"newer\""},
            {"di", second},
            {"di", second},
            {"ein", "@root/test:TEST_Thing"},
            // Each type, as the provider gets it.
            {"ci", all,
             "Name=\"all\",Flag=true,Letter=\"a\",Made=\"20260102030405.000000+000\",U8=1,U16=2,"
             "U32=3,U64=4,S8=-1,S16=-2,S32=-3,S64=-4,R32=1.5,R64=2.5,List=1,2"},
            {"ci", all, "Name=\"all\",U8=256,U16=1"},
            // Methods of the class and of an instance.
            {"cm", "@root/test:TEST_Thing", "Sum.A=2,B=3"},
            {"cmx", "@root/test:TEST_Thing", "Sum.A=2,B=3"},
            {"cm", first, "Describe"},
            {"cmx", first, "Describe"},
            {"cm", second, "Describe"},
            {"cm", first, "Destroy"},
            {"cm", first, "Sum.A=-2"},
            {"cm", "@root/test:TEST_Part.Id=\"wheel\"", "Roll"},
        });
}

TEST(Wbemcli, IsServedOverTlsWithAPassword) {
    const TemporaryDirectory folder;
    const std::string certificate = folder.path("certificate.pem");
    const std::string key = folder.path("key.pem");
    const ProgramRun made = runProgram(
        "/usr/bin/openssl", {"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:P-256",
                             "-nodes", "-days", "2", "-subj", "/CN=localhost", "-addext",
                             "subjectAltName=IP:127.0.0.1", "-keyout", key, "-out", certificate});
    ASSERT_EQ(made.status, 0) << made.err;
    folder.write("users", "ali:" + runProgram("/usr/bin/openssl", {"passwd", "-6", "sesame"}).out);
    std::filesystem::permissions(folder.path("users"), std::filesystem::perms(0600));

    EndpointProcess endpoint(KORVA_SERVE, {"--tls-cert", certificate, "--tls-key", key, "--users",
                                           folder.path("users")});
    const auto names = [&](const std::string& scheme, const std::string& user, const Words& trust) {
        Words words = {"ein"};
        words.insert(words.end(), trust.begin(), trust.end());
        words.push_back(scheme + "://" + user + "127.0.0.1:" + std::to_string(endpoint.port()) +
                        "/root/cimv2:KORVA_OperatingSystem");
        return runProgram("/usr/bin/wbemcli", words);
    };
    const ProgramRun right = names("https", "ali:sesame@", {"-cacert", certificate});
    EXPECT_THAT(right.out, testing::HasSubstr("Name=\"Fixture Linux\""));
    EXPECT_EQ(right.err, "");
    EXPECT_EQ(names("https", "ali:sesame@", {"-noverify"}).out, right.out);
    for (const auto& [user, told] : {std::pair("ali:wrong@", "Invalid username/password."),
                                     std::pair("", "Username/password required.")}) {
        const ProgramRun wrong = names("https", user, {"-noverify"});
        EXPECT_EQ(wrong.out, "");
        EXPECT_THAT(wrong.err, testing::HasSubstr(told));
    }
    EXPECT_EQ(names("http", "ali:sesame@", {}).out, "");
    EXPECT_EQ(endpoint.stop().status, 0);
}

TEST(Wbemcli, ShowsTheMessageAsItCame) {
    expectTranscript("Message.txt", {},
                     {{"ei", "-dx", "@root/cimv2:KORVA_ComputerSystem"},
                      {"ain", "-dx", "-ac", "KORVA_RunningOS", operatingSystem},
                      {"ei", "-dx", "@root/cimv2:KORVA_Nothing"}});
}

}  // namespace
