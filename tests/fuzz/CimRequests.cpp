// Whole requests: what surrounds a message, the message, and the answer of an object manager over
// the shipped providers, which clients have to be able to read.
#include <dlfcn.h>

#include <algorithm>

#include "fuzz/Invariant.h"
#include "host/server/CimOverHttp.h"
#include "host/server/Dispatcher.h"
#include "host/server/ResponseValidator.h"

using namespace cmpihost::server;
using fuzz::expect;

namespace {

/// The instrumentation of the fixture host is there before the provider asks for one.
ObjectManager& shippedManager() {
    static void* const fixtureHost =
        dlopen(KORVA_BINARY_DIR "/fixture-host/libvainstrumentation.so.1", RTLD_NOW | RTLD_GLOBAL);
    expect(fixtureHost != nullptr, "the fixture host is built");
    static ObjectManager manager([] {
        ObjectManagerSetup setup;
        setup.schema = cmpihost::Schema::load(KORVA_SOURCE_DIR "/schema");
        setup.registrations =
            cmpihost::Registrations::read({KORVA_SOURCE_DIR "/schema/registration"});
        setup.libraryFolders = {KORVA_BINARY_DIR "/lib"};
        setup.hostName = "server.example";
        return setup;
    }());
    return manager;
}

class Everybody final : public AccessControl {
  public:
    Verdict judge(const HttpRequest&) override { return {true, {}}; }
};

std::string_view takeLine(std::string_view& text) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    return line;
}

/// The input is a method, headers and a body behind an empty line. A body alone comes with what
/// clients send.
HttpRequest requestOf(std::string_view input) {
    HttpRequest request;
    request.version = "HTTP/1.1";
    request.target = "/cimom";
    request.peer = "127.0.0.1";
    if (input.substr(0, 1) == "<") {
        request.method = "POST";
        request.headers = {{"Host", "localhost"},
                           {"Content-Type", "application/xml"},
                           {"CIMOperation", "MethodCall"},
                           {"CIMObject", "root%2Fcimv2"}};
    } else {
        request.method = takeLine(input);
        for (auto line = takeLine(input); !line.empty(); line = takeLine(input)) {
            const std::size_t colon = std::min(line.find(": "), line.size());
            request.headers.emplace_back(line.substr(0, colon),
                                         line.substr(std::min(colon + 2, line.size())));
        }
    }
    request.body = input;
    request.headers.emplace_back("Content-Length", std::to_string(input.size()));
    return request;
}

/// Headers that are set apart from the body have to agree with it: of those that an input does not
/// give, the method is made up.
void addMethod(HttpRequest& request) {
    if (request.header("CIMMethod") != nullptr) return;
    const std::size_t call = request.body.find("METHODCALL NAME=\"");
    if (call == std::string::npos) return;
    const std::size_t name = call + 17;
    request.headers.emplace_back("CIMMethod",
                                 request.body.substr(name, request.body.find('"', name) - name));
}

void checkHeaders(const HttpResponse& response) {
    for (const auto& [name, value] : response.headers) {
        for (const std::string& text : {name, value}) {
            expect(
                std::all_of(text.begin(), text.end(), [](char c) { return c >= ' ' && c <= '~'; }),
                "a header of a response is one line of ASCII");
        }
    }
}

void checkResponse(const HttpRequest& request, const HttpResponse& response) {
    checkHeaders(response);
    if (response.status != 200) {
        const auto known = {400U, 403U, 405U, 411U, 501U};
        expect(std::find(known.begin(), known.end(), response.status) != known.end(),
               "a request is refused by a status that tells why");
        return expect(response.body.empty(), "what is refused has no body");
    }
    const std::vector<std::string> complaints = complaintsAbout(response.body, response.operation);
    if (!complaints.empty()) {
        fuzz::broken("a response can be read by every client; but " + complaints.front() + "\n" +
                     request.body + "\n" + response.body);
    }
}

/// What was opened is closed, else there would soon be no place for more.
void closeWhatIsOpen(ObjectManager& manager, const HttpResponse& response) {
    const std::string opened = "NAME=\"EnumerationContext\" PARAMTYPE=\"string\"><VALUE>";
    const std::size_t start = response.body.find(opened);
    if (start == std::string::npos) return;
    const std::size_t text = start + opened.size();
    MessageParameter context{"EnumerationContext", {}, XmlElement{"VALUE"}};
    context.value->text = response.body.substr(text, response.body.find('<', text) - text);
    Message close;
    close.method = "CloseEnumeration";
    close.nameSpace = "root/cimv2";
    close.parameters.push_back(std::move(context));
    answer(manager, close, std::nullopt);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    ObjectManager& manager = shippedManager();
    static Everybody everybody;
    static CimOverHttp endpoint(manager, everybody, {});
    HttpRequest request = requestOf(fuzz::textOf(data, size));
    addMethod(request);
    const HttpResponse response = endpoint.answer(request);
    checkResponse(request, response);
    closeWhatIsOpen(manager, response);
    manager.takeComplaints();
    return 0;
}
