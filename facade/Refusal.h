#ifndef OSSTATUS_FACADE_REFUSAL_H
#define OSSTATUS_FACADE_REFUSAL_H

#include <cmpi/cmpidt.h>

#include <stdexcept>
#include <string>

namespace VA::OSStatusFacade {

/// Whether a refusal leaves a record.
enum class Recorded { yes, no };

/// Ends a request with a status other than OK. The text is for the client and for the log: what a
/// client wrote stands in it as printable() gives it.
class Refusal : public std::runtime_error {
  public:
    Refusal(CMPIrc rc, const std::string& text, Recorded recorded = Recorded::yes)
        : std::runtime_error(text), rc_(rc), recorded_(recorded) {}

    CMPIrc rc() const noexcept { return rc_; }
    Recorded recorded() const noexcept { return recorded_; }

  private:
    CMPIrc rc_;
    Recorded recorded_;
};

/// Where a request arrived: the function that the object manager called, and a line of it.
struct Handler {
    const char* function;
    unsigned int line;

    static constexpr Handler here(const char* function = __builtin_FUNCTION(),
                                  unsigned int line = __builtin_LINE()) {
        return {function, line};
    }
};

/// Writes the one record of a refused request, if any, and makes its status. Without memory for
/// record or message, those are left out. Nothing but the end of a cancelled thread passes here.
CMPIStatus refuse(const CMPIBroker* broker, CMPIrc rc, const char* text, Handler handler,
                  Recorded recorded);

}  // namespace VA::OSStatusFacade

#endif
