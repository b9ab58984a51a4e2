#include "load/Loaded.h"

#include "host/mof/Schema.h"

namespace load {

using namespace cmpihost;

namespace {

const ClassCatalogue& catalogue() {
    static const SchemaCatalogue classes(Schema::load(KORVA_SOURCE_DIR "/schema"));
    return classes;
}

// Calls the factory of one kind and cleanup of what it returns; true when both answer as they
// should.
template <class MI>
bool callAgain(const ProviderLibrary& library, const Broker& broker, const std::string& factory,
               MI* interface) {
    using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    MI* const made =
        reinterpret_cast<Factory>(library.symbol(factory.c_str()))(broker.cmpi(), nullptr, &status);
    return made == interface && made->ft->cleanup(made, nullptr, 0).rc == CMPI_RC_OK;
}

LoadOptions byName(const std::string& name) {
    LoadOptions options;
    options.providerName = name;
    return options;
}

}  // namespace

Loaded::Loaded(const Server& server)
    : name_(server.name), broker_(&catalogue()), library_(server.file, broker_, byName(name_)) {
    broker_.route(ComputerSystemService::className, computers_);
}

Outcome Loaded::answer(const OperationRequest& request) {
    return invoke(library_, broker_, request);
}

std::string Loaded::callEntryPointsAgain() {
    if (!callAgain(library_, broker_, name_ + "_Create_InstanceMI", library_.instanceMI()))
        return "instance interface";
    if (!callAgain(library_, broker_, name_ + "_Create_AssociationMI", library_.associationMI()))
        return "association interface";
    return {};
}

bool sameAnswer(const Outcome& left, const Outcome& right) {
    return left.rc == right.rc && left.message == right.message && left.paths == right.paths &&
           left.instances == right.instances && left.doneCount == right.doneCount &&
           left.violations == right.violations;
}

}  // namespace load
