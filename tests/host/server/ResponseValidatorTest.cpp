#include "host/server/ResponseValidator.h"

#include <gmock/gmock.h>

namespace cmpihost::server {
namespace {

TEST(ResponseValidator, AGoodResponseHasNoComplaint) {
    EXPECT_THAT(complaintsAbout("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
                                "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"4711\" "
                                "PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE "
                                "NAME=\"EnumerateInstances\"><IRETURNVALUE>\n"
                                "</IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n"),
                testing::ElementsAre());
}

}  // namespace
}  // namespace cmpihost::server
