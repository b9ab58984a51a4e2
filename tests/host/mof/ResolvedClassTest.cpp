// What a class has from its superclasses.
#include "host/mof/ResolvedClass.h"

#include <gmock/gmock.h>

#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

/// The classes of `text`, the last one resolved and shown: a line for the class and one a member,
/// with qualifiers as "Name=value@Class".
class ShownClass {
  public:
    explicit ShownClass(const std::string& text) {
        mof::Document document = mof::parse(text, "x.mof");
        const std::string name = document.classes.back().name;
        schema_.add(std::move(document));
        const std::optional<ResolvedClass> resolved = resolvedClass(schema_, name);
        shown_ = name + qualifiers(resolved->qualifiers) + "\n";
        for (const ResolvedFeature& property : resolved->properties) add("", property);
        for (const ResolvedMethod& method : resolved->methods) {
            add("()", method.result);
            for (const ResolvedFeature& parameter : method.parameters) add("(..)", parameter);
        }
    }

    const std::string& text() const { return shown_; }
    const Schema& schema() const { return schema_; }

  private:
    static std::string qualifiers(const std::vector<ResolvedQualifier>& all) {
        std::string result;
        for (const ResolvedQualifier& each : all) {
            const std::string value = mof::text(each.declared);
            result += " " + each.declared->name + (value.empty() ? "" : "=" + value) + "@" +
                      each.from->name;
        }
        return result;
    }
    void add(const std::string& kind, const ResolvedFeature& feature) {
        shown_ += feature.declared->name + kind + " of " + feature.origin->name + " by " +
                  feature.from->name + qualifiers(feature.qualifiers);
        if (feature.defaultValue != nullptr)
            shown_ +=
                " = " + std::to_string(std::get<std::uint64_t>(feature.defaultValue->items.at(0)));
        shown_ += "\n";
    }

    Schema schema_;
    std::string shown_;
};

TEST(ResolvedClass, HasPropertiesAndMethodsOfItsSuperclassesWithTheirOrigin) {
    const ShownClass shown(
        "class A { uint8 P = 1; uint8 Q = 2; uint8 Start([In] uint8 X); uint8 Stop(); };"
        "class B : A { uint8 q; uint8 R; };"
        "class C : B { uint8 S; uint8 Q = 3; uint8 START(uint8 x, uint8 Y); };");
    EXPECT_EQ(shown.text(),
              "C\n"
              "S of C by C\n"
              "Q of A by C = 3\n"
              "R of B by B\n"
              "P of A by A = 1\n"
              "START() of A by C\n"
              "x(..) of A by C In@A\n"
              "Y(..) of C by C\n"
              "Stop() of A by A\n");
}

TEST(ResolvedClass, KeepsTheDefaultOfAPropertyThatAnOverrideDoesNotRepeat) {
    EXPECT_EQ(ShownClass("class A { uint8 P = 7; }; class B : A { uint8 P; };").text(),
              "B\nP of A by B = 7\n");
}

TEST(ResolvedClass, InheritsQualifiersByTheFlavorsOfTheStandard) {
    const ShownClass shown(
        "[Abstract, Version(\"1\"), Association, Description(\"a\"), Experimental] class A {\n"
        "  [Key, Units(\"Bytes\"), Deprecated{\"Q\"}, Description(\"p\")] uint8 P; };\n"
        "[Association(false), Description(\"b\")] class B : A {\n"
        "  [Override(\"P\"), Key(false), Units(\"Bits\")] uint8 P; };");
    EXPECT_EQ(shown.text(),
              "B Association@A Description=b@B\n"
              "P of A by B Key@A Units=Bits@B Description=p@A Override=P@B\n");
}

TEST(ResolvedClass, InheritsQualifiersByDeclaredFlavorsAndByThoseWhereTheyStandBeforeAll) {
    const ShownClass shown(
        "Qualifier Mine : string, Scope(any), Flavor(Restricted);\n"
        "Qualifier Fixed : string, Scope(any), Flavor(DisableOverride);\n"
        "Qualifier Version : string, Scope(any);\n"
        "class A { [Mine(\"1\"), Fixed(\"1\"), Version(\"1\")] uint8 P;\n"
        "  [Mine(\"1\") : ToSubclass, Fixed(\"1\") : EnableOverride, Version(\"1\") : Restricted]\n"
        "  uint8 Q; };\n"
        "class B : A { [Fixed(\"2\")] uint8 P; [Fixed(\"2\")] uint8 Q; };");
    EXPECT_EQ(shown.text(),
              "B\n"
              "P of A by B Fixed=1@A Version=1@A\n"
              "Q of A by B Mine=1@A Fixed=2@B\n");
}

TEST(ResolvedClass, DoesNotPassOnWhatAClassBetweenRestricts) {
    const ShownClass shown(
        "class A { [Description(\"a\")] uint8 P; };\n"
        "class B : A { [Description(\"b\") : Restricted] uint8 P; };\n"
        "class C : B {};");
    EXPECT_EQ(shown.text(), "C\nP of A by B\n");
    EXPECT_EQ(shown.schema().propertyQualifier("c", "p", "description"), nullptr);
    EXPECT_EQ(mof::text(shown.schema().propertyQualifier("B", "P", "Description")), "b");
    EXPECT_EQ(shown.schema().propertyQualifier("C", "Q", "Description"), nullptr);
    EXPECT_EQ(shown.schema().propertyQualifier("D", "P", "Description"), nullptr);
    EXPECT_FALSE(resolvedClass(shown.schema(), "D").has_value());
}

}  // namespace
