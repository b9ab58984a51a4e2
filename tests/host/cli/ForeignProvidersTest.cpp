// The built program with providers of other makers, which are plain C: by registration, several
// libraries behind one broker, and each by itself. What whole runs print stands in runs/.
#include <gmock/gmock.h>

#include "host/cli/Cmpihost.h"
#include "support/GoldenFile.h"
#include "support/TemporaryDirectory.h"

namespace {

constexpr const char* foreignProviders = KORVA_TEST_DATA "/providers";
const std::string libraryFolder = KORVA_BINARY_DIR "/lib/";

Words withForeignSchema(Words arguments) {
    arguments.insert(arguments.begin(), {"--schema", foreignProviders});
    return arguments;
}

Words registered(Words arguments) {
    arguments.insert(arguments.begin(), {"--registration", foreignProviders});
    return withForeignSchema(std::move(arguments));
}

Words alone(const char* library, Words arguments) {
    arguments.insert(arguments.begin(), {"--provider", libraryFolder + library});
    return withForeignSchema(std::move(arguments));
}

/// Each command line as one types it, but for the options that are always there, and what it
/// printed.
std::string transcriptOf(const std::vector<Words>& runs, Words (*options)(Words)) {
    std::string text;
    for (const Words& arguments : runs) {
        const ProgramRun run = cmpihost(options(arguments));
        text += "$ cmpihost";
        for (const std::string& word : arguments) text += " '" + word + "'";
        text += "\n" + run.out;
        for (const std::string& line : lines(run.err)) text += "! " + line + "\n";
        text += "exit " + std::to_string(run.status) + "\n\n";
    }
    return text;
}

TEST(ForeignProviders, WorkTogetherByTheirRegistrations) {
    const std::string first = "root/test:TEST_Thing.Name=\"first\"";
    const std::vector<Words> runs = {
        // What a registration tells its provider.
        {"ei", "root/test:TEST_Thing"},
        // Polymorphic, each provider asked for its own class.
        {"ein", "root/test:TEST_Part"},
        {"ein", "root/test:TEST_SparePart"},
        {"ein", "root/other:TEST_Part"},
        {"ein", "root/other:TEST_SparePart"},
        {"ein", "root/third:TEST_Part"},
        {"ein", "root/test:TEST_Nothing"},
        // An association that asks the providers of other libraries.
        {"ain", first},
        {"ai", first},
        {"ain", first, "--assoc-class", "TEST_SpareLink"},
        {"ain", "root/test:TEST_Part.Id=\"wheel\"", "--assoc-class", "TEST_Link"},
        {"ain", first, "--assoc-class", "TEST_Part"},
        // Methods of the class and of an instance.
        {"im", "root/test:TEST_Thing", "Sum", "A=2", "b=3"},
        {"im", "root/test:TEST_Thing", "Sum", "--format", "json"},
        {"im", "root/test:TEST_Thing", "sum", "A=2", "--format", "mof"},
        {"im", "root/test:TEST_Thing", "Sum", "A=2", "--value", "Total"},
        {"im", first, "Describe"},
        {"im", "root/test:TEST_Thing.Name=\"second\"", "Describe"},
        {"im", first, "Destroy"},
        {"im", first, "Describe", "How=loudly"},
        {"im", first, "Sum", "A=2", "C=3"},
        {"im", first, "Sum", "A=-2"},
        {"im", first, "Sum", "A=2", "a=2"},
        {"im", "root/test:TEST_Part.Id=\"wheel\"", "Roll"},
        // What is written reaches the provider.
        {"ci", "root/test:TEST_Thing", "Name=second", "Text=two"},
        {"ci", "root/test:TEST_Thing", "Name=first"},
        {"ci", "root/test:TEST_Thing", "Name=all", "Text=NULL", "Flag=TRUE", "Letter='a'",
         "Made=20260102030405.000000+000", "U8=1", "U16=2", "U32=3", "U64=4", "S8=-1", "S16=-2",
         "S32=-3", "S64=-4", "R32=1.5", "R64=2.5", "List={1, 2}", "Part=TEST_Part.Id=\"wheel\""},
        {"mi", first, "Text=new"},
        {"mi", "root/test:TEST_Thing.Name=\"third\"", "Text=new", "U8=5", "List=NULL"},
        {"di", first},
        {"di", "root/test:TEST_Thing.Name=\"third\""},
        {"xq", "SELECT * FROM TEST_Thing", "--lang", "DMTF:CQL", "--namespace", "root/test"},
        {"xq", "SELECT * FROM TEST_Thing", "--namespace", "root/test"},
        {"xq", "SELECT Name FROM TEST_Thing", "--lang", "DMTF:CQL", "--namespace", "root/test"},
        {"xq", "SELECT", "--namespace", "root/test"},
    };
    expectGolden(KORVA_TEST_DATA "/cli/runs/Foreign.txt", transcriptOf(runs, registered));
}

TEST(ForeignProviders, LoadByThemselves) {
    const std::string wheel = "root/x:TEST_Part.Id=\"wheel\"\n";
    const ProgramRun several = cmpihost(alone("libforeign_parts.so", {"ein", "root/x:TEST_Part"}));
    EXPECT_EQ(several.status, 3);
    EXPECT_EQ(several.err, "cmpihost: " + libraryFolder +
                               "libforeign_parts.so: several providers (Parts, Spares): choose "
                               "with --name NAME\n");
    const ProgramRun chosen =
        cmpihost(alone("libforeign_parts.so", {"--name", "Parts", "ein", "root/x:TEST_Part"}));
    EXPECT_EQ(chosen.out, wheel);
    EXPECT_EQ(chosen.err, "");
    const ProgramRun things =
        cmpihost(alone("libforeign_things.so", {"ein", "root/test:TEST_Thing"}));
    EXPECT_EQ(things.out, "root/test:TEST_Thing.Name=\"first\"\n");
    EXPECT_EQ(things.err, "");
}

TEST(ForeignProviders, AreCheckedByWhatTheFileOfASuperclassDeclares) {
    const TemporaryDirectory folder;
    folder.write("a.mof", "class TEST_Part : STD_Base { };");
    const auto names = [&](const char* superclass) {
        folder.write("b.mof", superclass);
        return cmpihost({"--schema", folder.path(), "--provider",
                         libraryFolder + "libforeign_parts.so", "--name", "Parts", "ein",
                         "root/x:TEST_Part"});
    };
    EXPECT_EQ(names("class STD_Base { [Key] string Id; };").err, "");
    const ProgramRun other = names("class STD_Base { [Key] uint8 Id; [Key] string Site; };");
    EXPECT_EQ(other.err,
              "caught: TEST_Part.Id is uint8, not string\n"
              "caught: path of TEST_Part without key Site\n");
    EXPECT_EQ(other.status, 5);
}

TEST(ForeignProviders, TellWhichInterfaceIsMissing) {
    const std::string first = "root/test:TEST_Thing.Name=\"first\"";
    const ProgramRun instances = cmpihost(alone("libforeign_links.so", {"ein", "TEST_Thing"}));
    EXPECT_EQ(instances.status, 1);
    EXPECT_EQ(instances.err,
              "cmpihost: EnumerateInstanceNames of TEST_Thing in root/cimv2: "
              "CIM_ERR_NOT_SUPPORTED (7): libforeign_links.so has no instance interface: it "
              "exports no foreign_links_Create_InstanceMI\n");
    const ProgramRun associations = cmpihost(alone("libforeign_things.so", {"ain", first}));
    EXPECT_EQ(associations.status, 1);
    EXPECT_EQ(associations.err,
              "cmpihost: AssociatorNames of TEST_Thing in root/test: CIM_ERR_NOT_SUPPORTED (7): "
              "libforeign_things.so has no association interface: it exports no "
              "Things_Create_AssociationMI\n");
}

TEST(ForeignProviders, AreToldWhereTheirRegistrationPromisesTooMuch) {
    const TemporaryDirectory folder;
    folder.write("a.reg",
                 "[TEST_Part]\nprovider: Parts\nlocation: foreign_parts\n"
                 "type: instance method\nnamespace: *\n"
                 "[TEST_Thing]\nprovider: Things\nlocation: nowhere\n"
                 "type: instance\nnamespace: *\n");
    const auto ask = [&](const char* className) {
        return cmpihost(withForeignSchema({"--registration", folder.path(), "ein", className}));
    };
    const ProgramRun part = ask("TEST_Part");
    EXPECT_EQ(part.status, 3);
    EXPECT_EQ(part.err, "cmpihost: " + folder.path("a.reg") +
                            ":1: the provider of TEST_Part: libforeign_parts.so has no method "
                            "interface: it exports no Parts_Create_MethodMI\n");
    const ProgramRun thing = ask("TEST_Thing");
    EXPECT_EQ(thing.status, 3);
    EXPECT_THAT(thing.err,
                testing::StartsWith("cmpihost: " + folder.path("a.reg") +
                                    ":6: the provider of TEST_Thing: libnowhere.so: cannot open"));
}

}  // namespace
