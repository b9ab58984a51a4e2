#ifndef FACADE_REFUSAL_H
#define FACADE_REFUSAL_H

#include <cmpi/cmpidt.h>

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

#include "base/SourceLocation.h"

namespace VA::OSStatusFacade {

using base::SourceLocation;

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

/// A client's text as it may stand in answers and records: bytes other than printable ASCII become
/// \xNN, and what is longer than `most` bytes is cut, which three dots tell.
std::string printable(std::string_view text, std::size_t most = 64);

/// Writes the one record of a refused request, if any, and makes its status. Without memory for
/// record or message, those are left out. Nothing but the end of a cancelled thread passes here.
CMPIStatus refuse(const CMPIBroker* broker, CMPIrc rc, const char* text, SourceLocation handler,
                  Recorded recorded);

}  // namespace VA::OSStatusFacade

#endif
