#include "host/broker/Registrations.h"

#include "support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;

const std::string section =
    "# comment\n\n  [TEST_Thing] \n\tProvider: Things\n location: things\r\n"
    "   type: instance Association indication\n namespace: root/a root/b\n"
    "  parameters: a: b c\n user: nobody\n group: g\n unload: never\n#\n";

Registrations read(const std::string& text) {
    Registrations registrations;
    registrations.add(text, "x.reg");
    return registrations;
}

std::string complaint(const std::string& text) {
    try {
        read(text);
        return {};
    } catch (const RegistrationError& error) {
        return error.what();
    }
}

TEST(RegistrationFile, SaysWhoServesAClassWhereAndHow) {
    const Registrations registrations = read(section);
    ASSERT_EQ(registrations.all().size(), 1U);
    const Registration& found = registrations.all().front();
    EXPECT_EQ(found.className, "TEST_Thing");
    EXPECT_EQ(found.provider, "Things");
    EXPECT_EQ(found.location, "things");
    EXPECT_THAT(found.types, ElementsAre(Interface::Instance, Interface::Association));
    EXPECT_EQ(found.parameters, "a: b c");
    EXPECT_EQ(found.file, "x.reg");
    EXPECT_EQ(found.line, 3U);
    EXPECT_EQ(registrations.find("test_thing", "ROOT/B", Interface::Association), &found);
    EXPECT_EQ(registrations.find("TEST_Thing", "root/b", Interface::Method), nullptr);
    EXPECT_EQ(registrations.find("TEST_Thing", "root/c", Interface::Instance), nullptr);
    EXPECT_EQ(registrations.find("TEST_Other", "root/a", Interface::Instance), nullptr);
    EXPECT_TRUE(registrations.names("root/A"));
    EXPECT_FALSE(registrations.names("root/c"));
    EXPECT_THAT(registrations.nameSpaces(), ElementsAre("root/a", "root/b"));
}

TEST(RegistrationFile, MayServeAllNamespaces) {
    const Registrations registrations =
        read("[A]\nprovider: P\nlocation: l\ntype: method property\nnamespace: *\n");
    EXPECT_NE(registrations.find("A", "any/where", Interface::Property), nullptr);
    EXPECT_TRUE(registrations.names("any/where"));
    EXPECT_THAT(registrations.nameSpaces(), ElementsAre());
}

TEST(RegistrationFile, IsRefusedWithTheLineThatIsWrong) {
    const std::string good = "[A]\nprovider: P\nlocation: l\ntype: instance\nnamespace: n\n";
    const struct {
        std::string text;
        std::string complaint;
    } rows[] = {
        {"provider: P\n", "x.reg:1: provider stands before the first [CLASS]"},
        {"[A\n", "x.reg:1: expected [CLASS], found [A"},
        {"# c\n[]\n", "x.reg:2: expected [CLASS], found []"},
        {"[A] [B]\n", "x.reg:1: expected [CLASS], found [A] [B]"},
        {"[A]\nprovider P\n", "x.reg:2: expected NAME: VALUE, found provider P"},
        {"[A]\nprovider:\n", "x.reg:2: provider has no value"},
        {"[A]\nprovider: P\nprovider: Q\n", "x.reg:3: provider stands twice"},
        {"[A]\ncolour: red\n",
         "x.reg:2: there is no entry 'colour'; known are provider, location, type, namespace, "
         "parameters, user, group and unload"},
        {"[A]\ntype: instance instanz\n",
         "x.reg:2: there is no type 'instanz'; known are instance, association, method, property, "
         "indication, class and qualifier"},
        {"[A]\nprovider: P\nlocation: l\ntype: instance\n[B]\n", "x.reg:1: [A] has no namespace"},
        {"\n[A]\n", "x.reg:2: [A] has no provider"},
        {good + "[a]\nprovider: Q\nlocation: l\ntype: method instance\nnamespace: m N\n",
         "x.reg:6: [a] is registered already, at x.reg:1, for the provider P"},
    };
    for (const auto& row : rows) EXPECT_EQ(complaint(row.text), row.complaint);
    EXPECT_EQ(complaint(good + good), "");
    EXPECT_EQ(complaint(good + "[A]\nprovider: Q\nlocation: l\ntype: method\nnamespace: n\n"), "");
    EXPECT_EQ(complaint(good + "[A]\nprovider: Q\nlocation: l\ntype: instance\nnamespace: m\n"),
              "");
}

TEST(RegistrationFiles, AreReadFromFilesAndFolders) {
    const TemporaryDirectory folder;
    const std::string rest = "\nprovider: P\nlocation: l\ntype: instance\nnamespace: n\n";
    folder.write("many/b.reg", "[B]" + rest);
    folder.write("many/a.reg", "[A]" + rest);
    folder.write("many/c.txt", "no registration");
    folder.write("one.txt", "[C]" + rest);
    const Registrations all = Registrations::read({folder.path("one.txt"), folder.path("many")});
    std::string names;
    for (const Registration& each : all.all()) names += each.className;
    EXPECT_EQ(names, "CAB");
    for (const char* path : {"nowhere", "/dev/null"}) {
        EXPECT_THROW(Registrations::read({path}), std::runtime_error) << path;
    }
}

}  // namespace
}  // namespace cmpihost
