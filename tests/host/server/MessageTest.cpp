// Requests as clients send them, and what is wrong with those that are none.
#include "host/server/Message.h"

#include <gtest/gtest.h>

namespace cmpihost::server {
namespace {

const std::string enumerateInstances = R"(<?xml version="1.0" encoding="utf-8" ?>
<CIM CIMVERSION="2.0" DTDVERSION="2.0">
<MESSAGE ID="4711" PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME="EnumerateInstances">
  <LOCALNAMESPACEPATH><NAMESPACE NAME="root"></NAMESPACE><NAMESPACE NAME="cimv2"></NAMESPACE></LOCALNAMESPACEPATH>
  <IPARAMVALUE NAME="ClassName"><CLASSNAME NAME="KORVA_OperatingSystem"/></IPARAMVALUE>
  <IPARAMVALUE NAME="DeepInheritance"><VALUE>TRUE</VALUE></IPARAMVALUE>
  <IPARAMVALUE NAME="LocalOnly"><VALUE>FALSE</VALUE></IPARAMVALUE>
  <IPARAMVALUE NAME="IncludeQualifiers"><VALUE>FALSE</VALUE></IPARAMVALUE>
  <IPARAMVALUE NAME="IncludeClassOrigin"><VALUE>TRUE</VALUE></IPARAMVALUE>
</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>
)";

TEST(Message, OfAnIntrinsicCallHasItsNamesAndParameters) {
    const Message message = readMessage(enumerateInstances);
    EXPECT_EQ(message.id, "4711");
    EXPECT_EQ(message.protocolVersion, "1.0");
    EXPECT_TRUE(message.intrinsic);
    EXPECT_EQ(message.method, "EnumerateInstances");
    EXPECT_EQ(message.nameSpace, "root/cimv2");
    ASSERT_EQ(message.parameters.size(), 5U);
    EXPECT_EQ(message.parameters[0].name, "ClassName");
    EXPECT_EQ(message.parameters[0].value->name, "CLASSNAME");
    EXPECT_EQ(message.parameters[1].value->text, "TRUE");
}

}  // namespace
}  // namespace cmpihost::server
