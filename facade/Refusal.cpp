// A client hears why a request is refused, and so does the log: the provider itself says nothing.

#include "Refusal.h"

#include <cmpi/cmpift.h>
#include <cxxabi.h>

#include "Trace.h"
#include "base/Utf8.h"

namespace VA::OSStatusFacade {

namespace {

constexpr const char* sourceFile = "Facade.cpp";
const std::string category("Zumbrel.OSStatusFacade");

// A message record, since those pass the log as it is shipped. It is put together here: the buffer
// of VA::trace is shared by all threads.
void record(const std::string& text, SourceLocation handler) {
    const std::string whole = std::string("MESSAGE [File: ") + sourceFile +
                              ", Line: " + std::to_string(handler.line) + "]: " + text;
    writeRecord(handler.function, sourceFile, handler.line, category, parameterRecordLevel,
                [&whole] { return whole.c_str(); });
}

}  // namespace

std::string printable(std::string_view text, std::size_t most) {
    const std::string result = base::escape(text.substr(0, most), base::EscapeStyle::ascii);
    return text.size() > most ? result + "..." : result;
}

CMPIStatus refuse(const CMPIBroker* broker, CMPIrc rc, const char* text, SourceLocation handler,
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
