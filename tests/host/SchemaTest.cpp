#include "host/mof/Schema.h"

#include <gmock/gmock.h>
#include <stdlib.h>

#include <fstream>

#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"

namespace {

namespace fs = std::filesystem;
using cmpihost::Schema;
using cmpihost::SchemaCatalogue;
using cmpihost::mof::MofError;
using cmpihost::mof::parse;

Schema schemaOf(const std::string& text) {
    Schema schema;
    schema.add(parse(text, "x.mof"));
    return schema;
}

const char* family =
    "class Base { [Key] string Id; uint16 Size; };"
    "class Derived : Base { string Name; [Override(\"Id\")] string ID; };"
    "[Association] class Link { [Key] Base REF From; [Key] Base REF To; };"
    "class SubLink : Link { };"
    "class Foreign : CIM_Elsewhere { datetime When; uint8 Codes[]; };";

TEST(Schema, FindsClassesWithoutCase) {
    const Schema schema = schemaOf(family);
    ASSERT_NE(schema.find("dERIVED"), nullptr);
    EXPECT_EQ(schema.find("dERIVED")->name, "Derived");
    EXPECT_EQ(schema.find("Nobody"), nullptr);
}

TEST(Schema, FindsTheNearestDeclarationOfAProperty) {
    const Schema schema = schemaOf(family);
    EXPECT_EQ(schema.findProperty("Derived", "id")->name, "ID");
    EXPECT_EQ(schema.findProperty("Derived", "SIZE")->name, "Size");
    EXPECT_EQ(schema.findProperty("Derived", "Weight"), nullptr);
    EXPECT_EQ(schema.findProperty("Nobody", "Id"), nullptr);
}

TEST(Schema, ListsOwnPropertiesBeforeInheritedOnes) {
    const Schema schema = schemaOf(family);
    std::vector<std::string> names;
    for (const auto* property : schema.properties("Derived")) {
        names.push_back(property->name);
    }
    EXPECT_THAT(names, testing::ElementsAre("Name", "ID", "Size"));
}

TEST(Schema, InheritsKeysAndAssociations) {
    const Schema schema = schemaOf(family);
    EXPECT_TRUE(schema.isKey("Derived", "ID"));
    EXPECT_FALSE(schema.isKey("Derived", "Name"));
    EXPECT_TRUE(schema.isAssociation("SubLink"));
    EXPECT_FALSE(schema.isAssociation("Derived"));
}

TEST(Schema, KnowsASuperclassThatNoFileDeclaresByItsName) {
    const Schema schema = schemaOf(family);
    EXPECT_TRUE(schema.isA("Foreign", "cim_elsewhere"));
    EXPECT_TRUE(schema.isA("Derived", "Base"));
    EXPECT_FALSE(schema.isA("Base", "Derived"));
}

TEST(Schema, RefusesAClassThatIsDeclaredTwice) {
    try {
        schemaOf("class A {};\nclass a {};");
        FAIL() << "no error";
    } catch (const MofError& error) {
        EXPECT_STREQ(error.what(), "x.mof:2:7: class 'a' is declared twice, first at x.mof:1");
    }
}

TEST(Schema, RefusesAClassThatDescendsFromItself) {
    EXPECT_THROW(schemaOf("class A : A {};"), MofError);
    try {
        schemaOf("class A : B {};\nclass B : C {};\nclass C : A {};");
        FAIL() << "no error";
    } catch (const MofError& error) {
        EXPECT_STREQ(error.what(), "x.mof:3:7: class 'C' descends from itself");
    }
}

TEST(Schema, PlacesAComplaintAboutAValueMapAtTheProperty) {
    try {
        schemaOf(
            "class A {\n [ValueMap{\"1\"}, Values{}] uint8 P;\n [ValueMap{\"z\"}, "
            "Values{\"n\"}] uint8 Q; };");
        FAIL() << "no error";
    } catch (const MofError& error) {
        EXPECT_STREQ(error.what(), "x.mof:3:37: property 'Q': 'z' in the ValueMap is no integer");
    }
}

class SchemaFolder : public testing::Test {
  protected:
    void SetUp() override {
        std::string name = (fs::temp_directory_path() / "schemaXXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        folder_ = name;
    }
    void TearDown() override { fs::remove_all(folder_); }
    void write(const char* name, const std::string& text) { std::ofstream(folder_ / name) << text; }

    fs::path folder_;
};

TEST_F(SchemaFolder, IsReadFileByFile) {
    write("a.mof", "#pragma include (\"b.mof\")\nclass A : B {};");
    write("b.MOF", "class B { uint8 P; };");
    write("readme.txt", "no MOF at all");
    const Schema schema = Schema::load(folder_);
    EXPECT_THAT(schema.classNames(), testing::ElementsAre("A", "B"));
    EXPECT_NE(schema.findProperty("A", "P"), nullptr);
}

TEST_F(SchemaFolder, WithABrokenFileSaysWhichOne) {
    write("a.mof", "class A {");
    try {
        Schema::load(folder_);
        FAIL() << "no error";
    } catch (const MofError& error) {
        EXPECT_THAT(error.what(), testing::HasSubstr("/a.mof:1:10: expected a type"));
    }
}

TEST_F(SchemaFolder, WithAFileThatLeadsNowhereSaysWhichOne) {
    fs::create_symlink(folder_ / "missing", folder_ / "a.mof");
    try {
        Schema::load(folder_);
        FAIL() << "no error";
    } catch (const std::runtime_error& error) {
        EXPECT_EQ(error.what(),
                  "the schema file " + (folder_ / "a.mof").string() + " cannot be read");
    }
}

TEST_F(SchemaFolder, WithoutAClassIsRefused) {
    EXPECT_THROW(Schema::load(folder_), std::runtime_error);
    EXPECT_THROW(Schema::load(folder_ / "missing"), std::runtime_error);
}

TEST(SchemaCatalogue, ShowsTheBrokerWhatTheSchemaDeclares) {
    const SchemaCatalogue catalogue(schemaOf(family));
    const cmpihost::ClassDeclaration* derived = catalogue.find("DERIVED");
    ASSERT_NE(derived, nullptr);
    EXPECT_EQ(derived->name, "Derived");
    EXPECT_EQ(derived->superclass, "Base");
    EXPECT_FALSE(derived->association);
    ASSERT_EQ(derived->properties.size(), 3U);
    EXPECT_EQ(derived->property("id")->type, CMPI_string);
    EXPECT_TRUE(derived->property("id")->key);
    EXPECT_EQ(derived->property("size")->type, CMPI_uint16);
    EXPECT_FALSE(derived->property("size")->key);
    EXPECT_EQ(catalogue.find("Nobody"), nullptr);
}

TEST(SchemaCatalogue, ShowsReferencesArraysAndDatetimes) {
    const SchemaCatalogue catalogue(schemaOf(family));
    EXPECT_TRUE(catalogue.find("Link")->association);
    EXPECT_EQ(catalogue.find("Link")->property("From")->type, CMPI_ref);
    EXPECT_EQ(catalogue.find("Link")->property("From")->referenceClass, "Base");
    EXPECT_EQ(catalogue.find("Foreign")->property("When")->type, CMPI_dateTime);
    EXPECT_EQ(catalogue.find("Foreign")->property("Codes")->type, CMPI_uint8 | CMPI_ARRAY);
}

}  // namespace
