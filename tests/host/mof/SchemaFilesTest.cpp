// The files and folders that a schema is read from.
#include "host/mof/SchemaFiles.h"

#include <gmock/gmock.h>
#include <sys/stat.h>

#include "host/mof/ResolvedClass.h"
#include "support/GeneratedSchema.h"
#include "support/TemporaryDirectory.h"

namespace {

namespace fs = std::filesystem;
using cmpihost::Schema;
using testing::ElementsAre;
using testing::HasSubstr;

class SchemaFiles : public testing::Test {
  protected:
    void write(const char* name, const std::string& text) { directory_.write(name, text); }
    std::vector<std::string> classes(const std::vector<const char*>& names) const {
        return Schema::load(paths(names)).classNames();
    }
    std::string refusal(const std::vector<const char*>& names) const {
        try {
            Schema::load(paths(names));
        } catch (const std::runtime_error& error) {
            const std::string text = error.what();
            const std::size_t at = text.find(directory_.path());
            return at == std::string::npos
                       ? text
                       : text.substr(0, at) + text.substr(at + directory_.path().size() + 1);
        }
        return "no error";
    }

    const TemporaryDirectory directory_;

  private:
    std::vector<fs::path> paths(const std::vector<const char*>& names) const {
        std::vector<fs::path> result;
        for (const char* name : names) result.emplace_back(directory_.path(name));
        return result;
    }
};

TEST_F(SchemaFiles, AreThoseOfAFolderAndTheFoldersInIt) {
    write("all/System/a.mof", "class A : B {};");
    write("all/Core/deep/b.MOF", "class B { uint8 P; };");
    write("all/readme.txt", "no MOF at all");
    write("all/folder.mof/c.mof", "class C {};");
    // A folder is read as a whole: what its files include is not looked for.
    write("all/all.mof", "#pragma include (\"missing.mof\")");
    fs::create_directory_symlink("..", directory_.path("all/circle"));
    EXPECT_THAT(classes({"all"}), ElementsAre("A", "B", "C"));
}

TEST_F(SchemaFiles, GivenByNameBringWhatTheyIncludeAlong) {
    write("top.mof", "#pragma include (\"sub/a.mof\")\n#pragma include (\"b.mof\")\nclass T {};");
    write("sub/a.mof", "#pragma include (\"../b.mof\")\n#pragma include (\"c.mof\")\nclass A {};");
    write("sub/c.mof", "#pragma include (\"../top.mof\") class C {};");
    write("b.mof", "class B {};");
    write("other.mof", "class Other {};");
    EXPECT_THAT(classes({"top.mof"}), ElementsAre("A", "B", "C", "T"));
    EXPECT_THAT(classes({"other.mof", "b.mof"}), ElementsAre("B", "Other"));
}

TEST_F(SchemaFiles, ThatAreMetAgainAreReadOnce) {
    write("one/a.mof", "class A {};");
    fs::create_symlink("a.mof", directory_.path("one/link.mof"));
    EXPECT_THAT(classes({"one", "one/a.mof", "one/../one", "one"}), ElementsAre("A"));
    write("two/a.mof", "class A {};");
    EXPECT_THAT(refusal({"one", "two"}), HasSubstr("class 'A' is declared twice, first at "));
}

TEST_F(SchemaFiles, ThatCannotBeReadAreNamed) {
    write("a.mof", "class A {");
    EXPECT_THAT(refusal({""}), HasSubstr("a.mof:1:10: expected a type"));
    write("a.mof", "class A {};\n\n#pragma include (\"gone.mof\")");
    EXPECT_THAT(refusal({"a.mof"}), testing::EndsWith("/gone.mof to include"));
    EXPECT_THAT(refusal({"a.mof"}), HasSubstr("a.mof:3:1: there is no file "));
    write("folder/a.mof", "");
    EXPECT_EQ(refusal({"folder"}), "the schema folder holds no MOF class");
    EXPECT_EQ(refusal({"missing"}), "the schema missing cannot be read: No such file or directory");
    fs::create_symlink("missing", directory_.path("folder/b.mof"));
    EXPECT_EQ(refusal({"folder"}),
              "the schema file folder/b.mof cannot be read: No such file or directory");
    ASSERT_EQ(::mkfifo(directory_.path("pipe.mof").c_str(), 0600), 0);
    EXPECT_EQ(refusal({"pipe.mof"}), "the schema file pipe.mof is not a regular file");
}

TEST_F(SchemaFiles, OfAWholeSchemaGiveTheSameClassesAsAFolderAndByTheFileThatIncludesAll) {
    const GeneratedSchema generated;
    const Schema folder = Schema::load(generated.folder());
    EXPECT_EQ(folder.classNames().size(), GeneratedSchema::classCount);
    EXPECT_EQ(Schema::load(generated.folder() + "/all.mof").classNames(), folder.classNames());
    // Seven levels below the root, in files read before and after that of the class.
    const auto last = cmpihost::resolvedClass(folder, "GEN_Class1441");
    ASSERT_TRUE(last.has_value());
    EXPECT_EQ(last->superclasses.size(), 7U);
    EXPECT_EQ(last->superclasses.back()->name, "GEN_Class0");
    EXPECT_TRUE(folder.isKey("GEN_Class1441", "Id"));
}

}  // namespace
