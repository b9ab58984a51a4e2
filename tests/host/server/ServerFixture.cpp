// The libraries are loaded into this process. The instrumentation of the fixture host is there
// before the provider asks for one, and the loader takes what bears the name already.
#include "host/server/ServerFixture.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <stdexcept>

#include "host/mof/MofParser.h"
#include "host/server/Dispatcher.h"
#include "host/server/ResponseValidator.h"

namespace cmpihost::server::fixture {

namespace {

void loadFixtureHost() {
    static void* const library =
        dlopen(KORVA_BINARY_DIR "/fixture-host/libvainstrumentation.so.1", RTLD_NOW | RTLD_GLOBAL);
    if (library == nullptr) throw std::runtime_error(dlerror());
}

/// The only manager there is, null at first.
std::unique_ptr<ObjectManager>& current() {
    static std::unique_ptr<ObjectManager> manager;
    return manager;
}

/// Where current() came from; empty: it is nobody's but one test's.
std::string& currentName() {
    static std::string name;
    return name;
}

ObjectManager& make(const std::string& name, Schema schema, Registrations registrations) {
    loadFixtureHost();
    current().reset();
    ObjectManagerSetup setup;
    setup.schema = std::move(schema);
    setup.registrations = std::move(registrations);
    setup.libraryFolders = {KORVA_BINARY_DIR "/lib"};
    setup.hostName = "server.example";
    current() = std::make_unique<ObjectManager>(std::move(setup));
    currentName() = name;
    return *current();
}

std::string message(const std::string& call) {
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" PROTOCOLVERSION=\"1.0\">"
           "<SIMPLEREQ>" +
           call + "</SIMPLEREQ></MESSAGE></CIM>\n";
}

std::string nameSpacePath(const std::string& nameSpace) {
    std::string xml = "<LOCALNAMESPACEPATH>";
    for (std::size_t start = 0; start <= nameSpace.size();) {
        const std::size_t end = std::min(nameSpace.find('/', start), nameSpace.size());
        xml += "<NAMESPACE NAME=\"" + nameSpace.substr(start, end - start) + "\"/>";
        start = end + 1;
    }
    return xml + "</LOCALNAMESPACEPATH>";
}

}  // namespace

ObjectManager& shippedManager() {
    if (currentName() == "shipped") return *current();
    return make("shipped", Schema::load(KORVA_SOURCE_DIR "/schema"),
                Registrations::read({KORVA_SOURCE_DIR "/schema/registration"}));
}

ObjectManager& foreignManager(const std::string& registrations, const std::string& mof) {
    const bool plain = registrations.empty() && mof.empty();
    if (plain && currentName() == "foreign") return *current();
    Schema schema = Schema::load(KORVA_SOURCE_DIR "/tests/host/providers/test.mof");
    schema.add(mof::parse(mof, "more.mof"));
    auto all = Registrations::read({KORVA_SOURCE_DIR "/tests/host/providers/test.reg"});
    all.add(registrations, "more.reg");
    return make(plain ? "foreign" : "", std::move(schema), std::move(all));
}

ObjectManager& newManager(const std::string& schema, const std::string& registrations) {
    return newManager(Schema::load(KORVA_SOURCE_DIR "/" + schema), registrations);
}

ObjectManager& newManager(Schema schema, const std::string& registrations) {
    Registrations read;
    read.add(registrations, "test.reg");
    return make("", std::move(schema), std::move(read));
}

Schema schemaOf(const std::string& mof) {
    Schema schema;
    schema.add(mof::parse(mof, "test.mof"));
    return schema;
}

std::string registration(const std::string& className, const std::string& provider,
                         const std::string& location, const std::string& types,
                         const std::string& nameSpaces) {
    return "[" + className + "]\nprovider: " + provider + "\nlocation: " + location +
           "\ntype: " + types + "\nnamespace: " + nameSpaces + "\n";
}

std::string respond(const std::string& request) {
    return respond(shippedManager(), request);
}

std::string respond(ObjectManager& manager, const std::string& request,
                    const std::optional<std::string>& user) {
    try {
        const Message read = readMessage(request);
        std::string document = answer(manager, read, user).document;
        for (const std::string& complaint : complaintsAbout(document, read.method))
            ADD_FAILURE() << complaint << "\n" << document;
        return document;
    } catch (const MessageError& wrong) {
        return "HTTP " + std::to_string(wrong.httpStatus()) + ": " + wrong.what();
    }
}

std::string operation(const std::string& name, const std::string& parameters,
                      const std::string& nameSpace) {
    return message("<IMETHODCALL NAME=\"" + name + "\">" + nameSpacePath(nameSpace) + parameters +
                   "</IMETHODCALL>");
}

std::string methodCall(const std::string& name, const std::string& object,
                       const std::string& parameters, const std::string& nameSpace) {
    const std::string path =
        object.rfind("<CLASSNAME", 0) == 0 ? "LOCALCLASSPATH" : "LOCALINSTANCEPATH";
    return message("<METHODCALL NAME=\"" + name + "\"><" + path + ">" + nameSpacePath(nameSpace) +
                   object + "</" + path + ">" + parameters + "</METHODCALL>");
}

std::string parameter(const std::string& name, const std::string& content) {
    return "<IPARAMVALUE NAME=\"" + name + "\">" + content + "</IPARAMVALUE>";
}

std::string className(const std::string& parameterName, const std::string& name) {
    return parameter(parameterName, "<CLASSNAME NAME=\"" + name + "\"/>");
}

std::string value(const std::string& parameterName, const std::string& text) {
    return parameter(parameterName, "<VALUE>" + text + "</VALUE>");
}

std::string list(const std::string& parameterName, const std::vector<std::string>& names) {
    std::string values;
    for (const std::string& each : names) values += "<VALUE>" + each + "</VALUE>";
    return parameter(parameterName, "<VALUE.ARRAY>" + values + "</VALUE.ARRAY>");
}

std::string instanceName(const std::string& name,
                         const std::vector<std::pair<std::string, std::string>>& keys) {
    std::string xml = "<INSTANCENAME CLASSNAME=\"" + name + "\">";
    for (const auto& [key, text] : keys) {
        xml += "<KEYBINDING NAME=\"" + key + "\"><KEYVALUE VALUETYPE=\"string\">" + text +
               "</KEYVALUE></KEYBINDING>";
    }
    return xml + "</INSTANCENAME>";
}

std::string operatingSystem() {
    return instanceName("KORVA_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                                  {"CSName", "fixture.example"},
                                                  {"CreationClassName", "KORVA_OperatingSystem"},
                                                  {"Name", "Fixture Linux"}});
}

std::string computerSystem() {
    return instanceName("KORVA_ComputerSystem", {{"CreationClassName", "KORVA_ComputerSystem"},
                                                 {"Name", "fixture.example"}});
}

std::string capabilities() {
    return instanceName("KORVA_OperatingSystemCapabilities", {{"InstanceID", "Fixture Linux"}});
}

std::string content(const std::string& document) {
    const std::size_t start = document.find("METHODRESPONSE NAME=");
    const std::size_t begin = document.find('>', start);
    const std::size_t end = document.rfind("METHODRESPONSE>");
    if (start == std::string::npos || end == std::string::npos || end < begin) return document;
    const std::string inner = document.substr(begin + 1, end - begin - 1);
    return inner.substr(0, inner.rfind("</"));
}

std::string error(const std::string& document) {
    const std::string code = "<ERROR CODE=\"";
    const std::string description = "\" DESCRIPTION=\"";
    const std::size_t start = document.find(code);
    if (start == std::string::npos) return {};
    const std::size_t middle = document.find(description, start);
    if (middle == std::string::npos) return document;
    const std::size_t text = middle + description.size();
    return document.substr(start + code.size(), middle - start - code.size()) + ": " +
           document.substr(text, document.find('"', text) - text);
}

std::size_t count(const std::string& text, const std::string& part) {
    std::size_t found = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++found;
    return found;
}

}  // namespace cmpihost::server::fixture
