// Paths of clients, and what they become before a provider sees them.
#include "host/server/RequestPath.h"

#include <gtest/gtest.h>

#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"
#include "host/server/CimError.h"

namespace cmpihost::server {
namespace {

using namespace std::string_literals;

const char* const pathSchema =
    "class T_One { [Key] string InstanceID; string Text; };"
    "class T_Many { [Key] string Name; [Key] uint16 Number; [Key] boolean Flag; };"
    "class T_Sub : T_One { uint8 Extra; };"
    "class T_None { string Text; };"
    "class T_Rest { [Key] datetime When; [Key] char16 Letter; [Key] sint8 Sign; };"
    "[Association] class T_Link { [Key] T_One REF From; [Key] T_Many REF To; };";

class RequestPaths : public testing::Test {
  protected:
    RequestPaths() : catalogue_(schema()) {}

    /// The typed path, or the error.
    std::string typed(const std::string& xml) const {
        try {
            return toString(typedPath(readPath(parseXml(xml)), catalogue_, "root/x"));
        } catch (const CimError& error) {
            return std::to_string(error.code()) + ": " + error.what();
        }
    }
    std::string instance(const std::string& className, const std::string& keys) const {
        return typed("<INSTANCENAME CLASSNAME='" + className + "'>" + keys + "</INSTANCENAME>");
    }

  private:
    static Schema schema() {
        Schema schema;
        schema.add(mof::parse(pathSchema, "x.mof"));
        return schema;
    }

    const SchemaCatalogue catalogue_;
};

std::string key(const std::string& name, const std::string& text,
                const std::string& attributes = "VALUETYPE='string'") {
    return "<KEYBINDING NAME='" + name + "'><KEYVALUE " + attributes + ">" + text +
           "</KEYVALUE></KEYBINDING>";
}

std::string referenceKey(const std::string& name, const std::string& path) {
    return "<KEYBINDING NAME='" + name + "'><VALUE.REFERENCE>" + path +
           "</VALUE.REFERENCE></KEYBINDING>";
}

TEST_F(RequestPaths, HaveTheSchemasSpellingAndOrder) {
    EXPECT_EQ(instance("t_many", key("FLAG", "true") + key("number", "5") + key("NAME", "Az")),
              "root/x:T_Many.Name=\"Az\",Number=5,Flag=TRUE");
    EXPECT_EQ(instance("T_SUB", key("instanceid", " a ")), "root/x:T_Sub.InstanceID=\" a \"");
}

TEST_F(RequestPaths, HaveTheSchemasTypesWhateverTheClientSays) {
    const struct {
        std::string keys;
        const char* className;
        const char* path;
    } rows[] = {
        {key("InstanceID", "5", "VALUETYPE='numeric'"), "T_One", "root/x:T_One.InstanceID=\"5\""},
        {key("InstanceID", "TRUE", "VALUETYPE='boolean'"), "T_One",
         "root/x:T_One.InstanceID=\"TRUE\""},
        {key("InstanceID", "", ""), "T_One", "root/x:T_One.InstanceID=\"\""},
        {key("InstanceID", "a", "VALUETYPE='string' TYPE='string'"), "T_One",
         "root/x:T_One.InstanceID=\"a\""},
        {key("Name", "0x1F", "") + key("Number", "0x1F", "") + key("Flag", "False", ""), "T_Many",
         "root/x:T_Many.Name=\"0x1F\",Number=31,Flag=FALSE"},
        {key("Name", "1") + key("Number", "+007", "VALUETYPE='numeric' TYPE='uint16'") +
             key("Flag", "tRUE", "VALUETYPE='boolean'"),
         "T_Many", "root/x:T_Many.Name=\"1\",Number=7,Flag=TRUE"},
        {key("When", "20250301101500.000000+060") + key("Letter", "&lt;") + key("Sign", "-5"),
         "T_Rest", "root/x:T_Rest.When=\"20250301101500.000000+060\",Letter=\"<\",Sign=-5"},
    };
    for (const auto& row : rows) EXPECT_EQ(instance(row.className, row.keys), row.path);
}

TEST_F(RequestPaths, MayLeaveTheNameOfAnOnlyKeyOut) {
    EXPECT_EQ(instance("T_One", "<KEYVALUE>a</KEYVALUE>"), "root/x:T_One.InstanceID=\"a\"");
    EXPECT_EQ(instance("T_Many", "<KEYVALUE>a</KEYVALUE>"),
              "4: T_Many: a key has no name, and the class has not one key");
    EXPECT_EQ(instance("T_None", "<KEYVALUE>a</KEYVALUE>"),
              "4: T_None: a key has no name, and the class has not one key");
    EXPECT_EQ(instance("Other", "<KEYVALUE>a</KEYVALUE>"),
              "4: Other: a key has no name, and the class is not declared");
    EXPECT_EQ(instance("T_One", "<VALUE.REFERENCE><CLASSNAME NAME='T_One'/></VALUE.REFERENCE>"),
              "4: T_One.InstanceID: this key is no reference");
}

TEST_F(RequestPaths, AreRefusedByTheKeyThatIsWrong) {
    const struct {
        const char* className;
        std::string keys;
        const char* error;
    } rows[] = {
        {"T_One", "", "4: T_One.InstanceID: this key is missing"},
        {"t_many", key("Name", "a") + key("Flag", "TRUE"), "4: t_many.Number: this key is missing"},
        {"T_One", key("InstanceID", "a") + key("INSTANCEID", "a"),
         "4: T_One.INSTANCEID: this key is given twice"},
        {"T_One", key("InstanceID", "a") + key("Text", "a"),
         "4: T_One.Text: the class has no such key"},
        {"T_None", key("Text", "a"), "4: T_None.Text: the class has no such key"},
        {"T_Many", key("Name", "a") + key("Number", "-1") + key("Flag", "TRUE"),
         "4: T_Many.Number: its value is no uint16"},
        {"T_Many", key("Name", "a") + key("Number", "") + key("Flag", "TRUE"),
         "4: T_Many.Number: its value is no uint16"},
        {"T_Many", key("Name", "a") + key("Number", "1") + key("Flag", "yes"),
         "4: T_Many.Flag: its value is no boolean"},
        {"T_One", referenceKey("InstanceID", "<CLASSNAME NAME='X'/>"),
         "4: T_One.InstanceID: this key is no reference"},
        {"T_Link", key("From", "T_One.InstanceID=\"a\"") + key("To", "a"),
         "4: T_Link.From: this key is a reference"},
        {"T_Link",
         referenceKey("From", "<INSTANCENAME CLASSNAME='T_One'/>") +
             referenceKey("To", "<CLASSNAME NAME='T_Many'/>"),
         "4: T_One.InstanceID: this key is missing"},
    };
    for (const auto& row : rows) EXPECT_EQ(instance(row.className, row.keys), row.error);
}

TEST_F(RequestPaths, OfUndeclaredClassesAreAsTheClientSays) {
    EXPECT_EQ(instance("Other", key("B", "a") + key("A", "-5", "VALUETYPE='numeric'") +
                                    key("C", "true", "VALUETYPE='boolean'") +
                                    key("D", "1.5", "VALUETYPE='NUMERIC'") + key("E", "5", "") +
                                    referenceKey("F", "<CLASSNAME NAME='t_one'/>")),
              "root/x:Other.B=\"a\",A=-5,C=TRUE,D=1.5,E=\"5\",F=\"root/x:T_One\"");
    EXPECT_EQ(instance("Other", ""), "root/x:Other");
    EXPECT_EQ(instance("Other", key("A", "x", "VALUETYPE='numeric'")),
              "4: Other.A: its value is not of the type that is told");
    EXPECT_EQ(instance("Other", key("A", "x", "VALUETYPE='boolean'")),
              "4: Other.A: its value is not of the type that is told");
    EXPECT_EQ(instance("Other", key("A", "x") + key("a", "y")),
              "4: Other.a: this key is given twice");
}

TEST_F(RequestPaths, OfReferencesHaveAnyOfSixForms) {
    const std::string one =
        "<INSTANCENAME CLASSNAME='t_one'>" + key("instanceid", "a&amp;b") + "</INSTANCENAME>";
    const std::string local =
        "<LOCALNAMESPACEPATH><NAMESPACE NAME='root'/><NAMESPACE NAME='y'/>"
        "</LOCALNAMESPACEPATH>";
    const std::string remote = "<NAMESPACEPATH><HOST>elsewhere</HOST>" + local + "</NAMESPACEPATH>";
    const struct {
        std::string form;
        const char* from;
    } rows[] = {
        {one, "root/x:T_One.InstanceID=\\\"a&b\\\""},
        {"<LOCALINSTANCEPATH>" + local + one + "</LOCALINSTANCEPATH>",
         "root/y:T_One.InstanceID=\\\"a&b\\\""},
        {"<INSTANCEPATH>" + remote + one + "</INSTANCEPATH>",
         "root/y:T_One.InstanceID=\\\"a&b\\\""},
        {"<CLASSNAME NAME='t_one'/>", "root/x:T_One"},
        {"<LOCALCLASSPATH>" + local + "<CLASSNAME NAME='t_one'/></LOCALCLASSPATH>", "root/y:T_One"},
        {"<CLASSPATH>" + remote + "<CLASSNAME NAME='t_one'/></CLASSPATH>", "root/y:T_One"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(instance("T_Link", referenceKey("to", "<CLASSNAME NAME='Other'/>") +
                                         referenceKey("from", row.form)),
                  "root/x:T_Link.From=\""s + row.from + "\",To=\"root/x:Other\"")
            << row.form;
    }
}

TEST_F(RequestPaths, AreOfClassesOrOfInstancesWithOrWithoutKeys) {
    const RequestPath ofClass = readPath(parseXml("<CLASSNAME NAME='t_One'/>"));
    EXPECT_FALSE(ofClass.instance);
    EXPECT_EQ(ofClass.className, "t_One");
    EXPECT_EQ(ofClass.nameSpace, "");
    const RequestPath withoutKeys = readPath(parseXml("<INSTANCENAME CLASSNAME='t_One'/>"));
    EXPECT_TRUE(withoutKeys.instance);
    EXPECT_TRUE(withoutKeys.keys.empty());
    EXPECT_EQ(typed("<CLASSNAME NAME='t_One'/>"), "root/x:T_One");
    EXPECT_EQ(typed("<VALUE.REFERENCE><CLASSNAME NAME='t_One'/></VALUE.REFERENCE>"),
              "root/x:T_One");
    EXPECT_EQ(instance("t_none", ""), "root/x:T_None");
}

TEST(RequestNameSpace, HasNoSlashesButBetweenItsNames) {
    const struct {
        const char* names;
        const char* nameSpace;
    } rows[] = {
        {"<NAMESPACE NAME='root'/><NAMESPACE NAME='cimv2'/>", "root/cimv2"},
        {"<NAMESPACE NAME='root/cimv2'/>", "root/cimv2"},
        {"<NAMESPACE NAME='//root///cimv2/'/>", "root/cimv2"},
        {"<NAMESPACE NAME='/root/'/><NAMESPACE NAME='/'/><NAMESPACE NAME='cimv2/'/>", "root/cimv2"},
        {"<NAMESPACE NAME='Interop'/>", "Interop"},
        {"<NAMESPACE NAME=''/>", ""},
        {"<NAMESPACE NAME='/'/><NAMESPACE NAME='//'/>", ""},
    };
    for (const auto& row : rows) {
        const std::string xml = "<LOCALNAMESPACEPATH>"s + row.names + "</LOCALNAMESPACEPATH>";
        EXPECT_EQ(readNameSpace(parseXml(xml)), row.nameSpace) << row.names;
    }
}

}  // namespace
}  // namespace cmpihost::server
