#include "Refusal.h"

#include <cmpi/cmpift.h>
#include <cxxabi.h>

#include "Names.h"
#include "Trace.h"

namespace VA::OSStatusFacade {

namespace {

constexpr const char* sourceFile = "Facade.cpp";
const std::string category("Zumbrel.OSStatusFacade");

// A message record, since those pass the log as it is shipped. It is put together here: the buffer
// of VA::trace is shared by all threads.
void record(const std::string& text, Handler handler) {
    const std::string whole = std::string("MESSAGE [File: ") + sourceFile +
                              ", Line: " + std::to_string(handler.line) + "]: " + text;
    writeRecord(handler.function, sourceFile, handler.line, category, parameterRecordLevel,
                [&whole] { return whole.c_str(); });
}

}  // namespace

CMPIStatus refuse(const CMPIBroker* broker, CMPIrc rc, const char* text, Handler handler,
                  Recorded recorded) {
    CMPIStatus status = {rc, nullptr};
    try {
        const std::string safe = printable(text, 400);
        status.msg = broker->eft->newString(broker, safe.c_str(), nullptr);
        if (recorded == Recorded::yes) record(safe, handler);
    } catch (const abi::__forced_unwind&) {
        throw;
    } catch (...) {
        // The status alone tells it then.
    }
    return status;
}

}  // namespace VA::OSStatusFacade
