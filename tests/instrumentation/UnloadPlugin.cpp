// Uses the library in every way, on behalf of LibraryFileTest.
#include <Instrumentation.h>

#include "framework/instrumentation/HostSource.h"
#include "support/SimulatedHost.h"

namespace {

bool readEverything() {
    using namespace VA::NodeLexicon;
    VA::Instrumentation cursor;
    if (!cursor.selectNode(OperatingSystemNode)) return false;
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    for (unsigned int id = 100; id < 160; ++id) {
        cursor.getProperty(Properties(id), text);
        cursor.getProperty(Properties(id), number);
        cursor.getProperty(Properties(id), flag);
        cursor.isPropertyReadOnly(Properties(id), flag);
    }
    cursor.getNodeStatus();
    return cursor.getComputerName(text);
}

}  // namespace

extern "C" [[gnu::visibility("default")]] int useLibrary(const char* root);

// 1 when all went well. Leaves a source behind, for the unloading to release.
int useLibrary(const char* root) {
    bool good = readEverything();
    VA::setHostSource(VA::SimulatedHost::withOneNode());
    good = readEverything() && good;
    VA::setHostSource(VA::makeLinuxHost(root));
    return readEverything() && good ? 1 : 0;
}
