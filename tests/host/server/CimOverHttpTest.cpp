#include "host/server/CimOverHttp.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <ostream>

#include "base/Ascii.h"
#include "host/server/HttpTestServer.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Pair;

/// Lets in whoever sends "Authorization: NAME", as NAME; those who send none too, where told so.
class NamedAccess final : public AccessControl {
  public:
    explicit NamedAccess(bool open) : open_(open) {}
    Verdict judge(const HttpRequest& request) override {
        const std::string* name = request.header("Authorization");
        if (name == nullptr) return {open_, std::nullopt};
        if (*name == "stranger") return {false, std::nullopt, std::chrono::milliseconds(250)};
        return {true, *name};
    }

  private:
    const bool open_;
};

/// A request that is answered.
HttpRequest goodRequest() {
    HttpRequest request;
    request.method = "POST";
    request.version = "HTTP/1.1";
    request.target = "/cimom";
    request.peer = "127.0.0.1";
    request.body =
        operation("EnumerateInstanceNames", className("ClassName", "KORVA_OperatingSystem"));
    request.headers = {{"Host", "localhost:5988"},
                       {"Content-Type", "application/xml; charset=\"utf-8\""},
                       {"Content-Length", std::to_string(request.body.size())},
                       {"CIMProtocolVersion", "1.0"},
                       {"CIMOperation", "MethodCall"},
                       {"CIMMethod", "EnumerateInstanceNames"},
                       {"CIMObject", "root%2Fcimv2"}};
    return request;
}

/// The header of that name with another value, none for a null.
HttpRequest withHeader(HttpRequest request, const std::string& name, const char* value) {
    auto& headers = request.headers;
    headers.erase(
        std::remove_if(headers.begin(), headers.end(),
                       [&](const auto& each) { return base::equalsIgnoreCase(each.first, name); }),
        headers.end());
    if (value != nullptr) headers.emplace_back(name, value);
    return request;
}

std::string valueOf(const HttpResponse& response, const std::string& name) {
    for (const auto& [each, value] : response.headers) {
        if (each == name) return value;
    }
    return {};
}

/// "400 header-mismatch"; "200" is an answer.
std::string verdictOf(const HttpResponse& response) {
    const std::string error = valueOf(response, "CIMError");
    EXPECT_EQ(response.body.empty(), response.status != 200);
    return std::to_string(response.status) + (error.empty() ? "" : " ") + error;
}

class CimOverHttpTest : public testing::Test {
  protected:
    CimOverHttpTest() : cim(manager(), access, options()) {}

    static ObjectManager& manager() { return shippedManager(); }
    static CimOverHttp::Options options() {
        CimOverHttp::Options result;
        result.hostNames = {"server.example"};
        return result;
    }

    NamedAccess access{true};
    CimOverHttp cim;
};

TEST_F(CimOverHttpTest, AnswersAMessage) {
    const HttpResponse response = cim.answer(goodRequest());
    EXPECT_EQ(response.status, 200U);
    EXPECT_THAT(
        response.headers,
        ElementsAre(Pair("Content-Type", "application/xml; charset=\"utf-8\""),
                    Pair("CIMOperation", "MethodResponse"), Pair("Cache-Control", "no-cache")));
    EXPECT_THAT(response.body,
                testing::StartsWith("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM "));
    EXPECT_THAT(response.body, HasSubstr("<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">"));
    EXPECT_EQ(response.operation, "EnumerateInstanceNames");
    EXPECT_EQ(response.cimStatus, 0U);
    EXPECT_EQ(response.user, "");
    EXPECT_FALSE(response.close);
}

TEST_F(CimOverHttpTest, TellsTheLogWhoAskedAndWhichStatusItWas) {
    HttpRequest request = withHeader(goodRequest(), "Authorization", "joe");
    request.body = operation("EnumerateInstanceNames", className("ClassName", "No_Class"));
    const HttpResponse response = cim.answer(request);
    EXPECT_EQ(verdictOf(response), "200");
    EXPECT_EQ(response.cimStatus, 5U);
    EXPECT_EQ(response.user, "joe");
}

struct HeaderRow {
    const char* name;
    const char* value;
    const char* verdict;
};

void PrintTo(const HeaderRow& row, std::ostream* out) {
    *out << row.name << ": " << (row.value == nullptr ? "(none)" : row.value);
}

constexpr HeaderRow headerRows[] = {
    {"CIMOperation", "methodcall", "200"},
    {"CIMOperation", "MethodResponse", "400 unsupported-operation"},
    {"CIMOperation", nullptr, "400"},
    {"CIMProtocolVersion", nullptr, "200"},
    {"CIMProtocolVersion", "1.1", "400 header-mismatch"},
    {"CIMProtocolVersion", "2.0", "501 unsupported-protocol-version"},
    {"CIMProtocolVersion", "1.", "501 unsupported-protocol-version"},
    {"CIMProtocolVersion", "1.x", "501 unsupported-protocol-version"},
    {"CIMMethod", "enumerateinstancenames", "200"},
    {"CIMMethod", "Enumerate%49nstanceNames", "200"},
    {"CIMMethod", "EnumerateInstances", "400 header-mismatch"},
    {"CIMMethod", nullptr, "400 header-mismatch"},
    {"CIMObject", "root/cimv2", "200"},
    {"CIMObject", "ROOT%2fCIMV2", "200"},
    {"CIMObject", "/root/cimv2/", "200"},
    {"CIMObject", "%2Froot%2Fcimv2", "200"},
    {"CIMObject", "root%2Finterop", "400 header-mismatch"},
    {"CIMObject", "root%2Fcimv2%3AKORVA_OperatingSystem", "400 header-mismatch"},
    {"CIMObject", "root%2Fcimv2%", "400 header-mismatch"},
    {"CIMObject", "root%2", "400 header-mismatch"},
    {"CIMObject", "root%zzcimv2", "400 header-mismatch"},
    {"CIMObject", "", "400 header-mismatch"},
    {"CIMObject", nullptr, "400 header-mismatch"},
    {"CIMBatch", "", "501 multiple-requests-unsupported"},
    {"CIMExport", "MethodRequest", "400 unsupported-operation"},
    {"CIMExportMethod", "ExportIndication", "400 unsupported-operation"},
    {"Content-Type", "application/xml", "200"},
    {"Content-Type", "text/xml; charset=utf-8", "200"},
    {"Content-Type", "TEXT/XML;CHARSET=\"UTF-8\"", "200"},
    {"Content-Type", "application/xml ; other=x; charset = utf-8", "200"},
    {"Content-Type", "application/xml;", "200"},
    {"Content-Type", "application/xml; charset=iso-8859-1", "400"},
    {"Content-Type", "application/xml; charset=\"\"", "400"},
    {"Content-Type", "application/xml; charset=", "400"},
    {"Content-Type", "application/xml2", "400"},
    {"Content-Type", "text/plain", "400"},
    {"Content-Type", "application/json; charset=utf-8", "400"},
    {"Content-Type", "", "400"},
    {"Content-Type", nullptr, "400"},
    {"Content-Length", nullptr, "411"},
    {"Accept", "text/html", "200"},
    {"Accept-Encoding", "gzip", "200"},
    {"Accept-Language", "tlh", "200"},
    {"TE", "chunked, trailers", "200"},
    {"Man", "http://www.dmtf.org/cim/mapping/http/v1.0; ns=73", "200"},
    {"Origin", "http://evil.example", "403"},
    {"Origin", "null", "403"},
    {"Host", "localhost", "200"},
    {"Host", "LOCALHOST.:5988", "200"},
    {"Host", "127.0.0.1:5988", "200"},
    {"Host", "192.0.2.7", "200"},
    {"Host", "[::1]", "200"},
    {"Host", "[2001:db8::1]:5989", "200"},
    {"Host", "Server.Example:5988", "200"},
    {"Host", nullptr, "200"},
    {"Host", "evil.example", "403"},
    {"Host", "server.example.evil.example", "403"},
    {"Host", "127.0.0.1.evil.example", "403"},
    {"Host", "[evil.example]", "403"},
    {"Host", "[::1", "403"},
    {"Host", "::1", "403"},
    {"Host", "127.1", "403"},
    {"Host", "localhost:", "200"},
    {"Host", "localhost:abc", "403"},
    {"Host", "localhost:5988:1", "403"},
    {"Host", "[::1]5988", "403"},
    {"Host", "[::1]]:5988", "403"},
    {"Host", "localhost..", "403"},
    {"Host", "[", "403"},
    {"Host", "]", "403"},
    {"Host", ".", "403"},
    {"Host", ":5988", "403"},
    {"Host", "", "403"},
};

TEST_F(CimOverHttpTest, JudgesEachHeader) {
    for (const HeaderRow& row : headerRows) {
        SCOPED_TRACE(testing::PrintToString(row));
        EXPECT_EQ(verdictOf(cim.answer(withHeader(goodRequest(), row.name, row.value))),
                  row.verdict);
    }
}

TEST_F(CimOverHttpTest, BelievesNoHeaderThatIsThereTwice) {
    for (const auto& [name, verdict] :
         {std::pair("CIMMethod", "400 header-mismatch"),
          std::pair("CIMObject", "400 header-mismatch"),
          std::pair("CIMProtocolVersion", "400 header-mismatch"), std::pair("Authorization", "400"),
          std::pair("Content-Type", "400")}) {
        HttpRequest request = withHeader(goodRequest(), "Authorization", "joe");
        request.headers.emplace_back(name, "other");
        EXPECT_EQ(verdictOf(cim.answer(request)), verdict) << name;
    }
}

TEST_F(CimOverHttpTest, WantsMessagesPosted) {
    HttpRequest request = goodRequest();
    for (const char* method : {"GET", "HEAD", "PUT", "OPTIONS", "post"}) {
        request.method = method;
        const HttpResponse response = cim.answer(request);
        EXPECT_EQ(verdictOf(response), "405");
        EXPECT_EQ(valueOf(response, "Allow"), "POST");
    }
    request.method = "M-POST";
    EXPECT_EQ(verdictOf(cim.answer(request)), "501");
    request = goodRequest();
    request.target = "/elsewhere?a";
    EXPECT_EQ(verdictOf(cim.answer(request)), "200");
    request.version = "HTTP/1.0";
    EXPECT_EQ(verdictOf(cim.answer(request)), "200");
    request = withHeader(request, "Content-Length", nullptr);
    EXPECT_EQ(verdictOf(cim.answer(withHeader(request, "Transfer-Encoding", "chunked"))), "200");
}

TEST_F(CimOverHttpTest, AsksWhoeverMayNotComeIn) {
    NamedAccess closed(false);
    CimOverHttp guarded(manager(), closed, options());
    for (const char* name : {"stranger", static_cast<const char*>(nullptr)}) {
        const HttpResponse response =
            guarded.answer(withHeader(goodRequest(), "Authorization", name));
        EXPECT_EQ(verdictOf(response), "401");
        EXPECT_THAT(response.headers,
                    ElementsAre(Pair("WWW-Authenticate", "Basic realm=\"cimom\"")));
        EXPECT_EQ(response.user, "");
        EXPECT_FALSE(response.close);
        EXPECT_EQ(response.delay.count(), name == nullptr ? 0 : 250);
    }
    EXPECT_EQ(verdictOf(guarded.answer(withHeader(goodRequest(), "Authorization", "joe"))), "200");
}

struct BodyRow {
    std::string was;
    std::string is;
    const char* verdict;
};

TEST_F(CimOverHttpTest, TellsWhatIsWrongWithAMessage) {
    const std::vector<BodyRow> rows = {
        {"</CIM>", "", "400 request-not-well-formed"},
        {"EnumerateInstanceNames\">", "\xFF\">", "400 request-not-well-formed"},
        {"<CIM ", "<!DOCTYPE CIM [<!ENTITY a \"b\">]><CIM ", "400 request-not-well-formed"},
        {"<SIMPLEREQ>", "<SIMPLEREQ><OTHER></OTHER>", "400 request-not-valid"},
        {" ID=\"7\"", "", "400 request-not-valid"},
        {"CIMVERSION=\"2.0\"", "CIMVERSION=\"3.0\"", "501 unsupported-cim-version"},
        {"DTDVERSION=\"2.0\"", "DTDVERSION=\"3.0\"", "501 unsupported-dtd-version"},
        {"PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"2.0\"", "501 unsupported-protocol-version"},
        {"PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"1.1\"", "400 header-mismatch"},
        {"SIMPLEREQ", "MULTIREQ", "501 multiple-requests-unsupported"},
        {"\"EnumerateInstanceNames\"", "\"DeleteInstance\"", "400 header-mismatch"},
        {"\"cimv2\"", "\"cimv3\"", "400 header-mismatch"},
        {"\"ClassName\"", "\"Nonsense\"", "200"},
        {"KORVA_OperatingSystem", "No_Class", "200"},
    };
    for (const BodyRow& row : rows) {
        SCOPED_TRACE(row.is);
        HttpRequest request = goodRequest();
        for (auto at = request.body.find(row.was); at != std::string::npos;
             at = request.body.find(row.was, at + row.is.size())) {
            request.body.replace(at, row.was.size(), row.is);
        }
        const HttpResponse response = cim.answer(request);
        EXPECT_EQ(verdictOf(response), row.verdict);
        EXPECT_EQ(valueOf(response, "CIMProtocolVersion"),
                  std::string(row.verdict).find("-version") == std::string::npos ? "" : "1.0");
    }
    HttpRequest empty = goodRequest();
    empty.body = "";
    EXPECT_EQ(verdictOf(cim.answer(empty)), "400 request-not-well-formed");
}

TEST_F(CimOverHttpTest, ComparesNoPathsOfMethodsAndSpellsTheirNames) {
    HttpRequest request = goodRequest();
    request.body = methodCall("Reboot", operatingSystem());
    request = withHeader(request, "CIMMethod", "Reboot");
    for (const char* object : {"root/cimv2:KORVA_OperatingSystem.Name=\"x\"", "", "\xE4"}) {
        EXPECT_EQ(verdictOf(cim.answer(withHeader(request, "CIMObject", object))), "200");
    }
    EXPECT_EQ(verdictOf(cim.answer(withHeader(request, "CIMMethod", "reboot"))),
              "400 header-mismatch");
}

TEST_F(CimOverHttpTest, LetsNoByteOfAClientIntoAHeader) {
    HttpRequest request = goodRequest();
    request.body = "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><x\xC3\xA4&#13;&#10;A:/></CIM>";
    const HttpResponse response = cim.answer(request);
    EXPECT_EQ(response.status, 400U);
    const std::string detail = valueOf(response, "PGErrorDetail");
    EXPECT_NE(detail, "");
    EXPECT_EQ(detail.find_first_not_of("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ"
                                       "0123456789-._~%"),
              std::string::npos);
    EXPECT_EQ(
        valueOf(cim.answer(withHeader(goodRequest(), "CIMMethod", "a\r\nB: c")), "PGErrorDetail"),
        "CIMMethod%20differs%20from%20the%20method%20of%20the%20message");
}

TEST_F(CimOverHttpTest, TestsInAnOrderThatTellsStrangersLittle) {
    NamedAccess closed(false);
    CimOverHttp guarded(manager(), closed, options());
    HttpRequest request = goodRequest();
    request.headers = {{"Host", "evil.example"}, {"Origin", "evil.example"}, {"CIMBatch", ""}};
    request.body = "<";
    request.method = "GET";
    EXPECT_EQ(verdictOf(guarded.answer(request)), "405");
    request.method = "POST";
    EXPECT_EQ(verdictOf(guarded.answer(request)), "403");
    request = withHeader(request, "Origin", nullptr);
    EXPECT_EQ(verdictOf(guarded.answer(request)), "403");
    request = withHeader(request, "Host", "localhost");
    EXPECT_EQ(verdictOf(guarded.answer(request)), "401");
    request = withHeader(request, "Authorization", "joe");
    EXPECT_EQ(verdictOf(guarded.answer(request)), "411");
    request = withHeader(request, "Content-Length", "1");
    EXPECT_EQ(verdictOf(guarded.answer(request)), "400");
    request = withHeader(request, "Content-Type", "text/xml");
    EXPECT_EQ(verdictOf(guarded.answer(request)), "501 multiple-requests-unsupported");
    request = withHeader(request, "CIMBatch", nullptr);
    EXPECT_EQ(verdictOf(guarded.answer(request)), "400");
    request = withHeader(request, "CIMOperation", "MethodCall");
    EXPECT_EQ(verdictOf(guarded.answer(request)), "400 request-not-well-formed");
}

TEST_F(CimOverHttpTest, RunsNoMoreAtOnceThanItMay) {
    CimOverHttp::Options none = options();
    none.mostAtOnce = 0;
    CimOverHttp full(manager(), access, none);
    const HttpResponse response = full.answer(goodRequest());
    EXPECT_EQ(verdictOf(response), "503");
    EXPECT_EQ(valueOf(response, "Retry-After"), "1");
    CimOverHttp::Options one = options();
    one.mostAtOnce = 1;
    CimOverHttp narrow(manager(), access, one);
    for (int i = 0; i < 3; ++i) EXPECT_EQ(verdictOf(narrow.answer(goodRequest())), "200");
}

TEST_F(CimOverHttpTest, AnswersOverASocket) {
    HttpServer server(listeningSocket(), cim, HttpLimits{});
    base::FileDescriptor listener = server.stopListening();
    const std::uint16_t port = portOf(listener.number());
    HttpServer second(std::move(listener), cim, HttpLimits{});
    HttpTestClient client(port);
    const HttpRequest request = goodRequest();
    std::string bytes = "POST /cimom HTTP/1.1\r\n";
    for (const auto& [name, value] : request.headers) bytes += name + ": " + value + "\r\n";
    client.send(bytes + "\r\n" + request.body);
    EXPECT_THAT(client.receive(),
                testing::AllOf(testing::StartsWith("HTTP/1.1 200 OK\r\n"),
                               HasSubstr("<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">")));
}

}  // namespace
}  // namespace cmpihost::server
