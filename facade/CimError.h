#ifndef FACADE_CIM_ERROR_H
#define FACADE_CIM_ERROR_H

#include <cmpi/cmpidt.h>

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

#include "base/Utf8.h"

namespace VA::OSStatusFacade {

/// Whether a failure leaves a record.
enum class Recorded { yes, no };

/// Ends a request with a status other than OK. The text is for the client and for the log: what a
/// client wrote stands in it as printable() gives it.
class CimError : public std::runtime_error {
  public:
    CimError(CMPIrc rc, const std::string& text, Recorded recorded = Recorded::yes)
        : std::runtime_error(text), rc_(rc), recorded_(recorded) {}

    CMPIrc rc() const noexcept { return rc_; }
    Recorded recorded() const noexcept { return recorded_; }

  private:
    CMPIrc rc_;
    Recorded recorded_;
};

/// A client's text as it may stand in answers and records: bytes other than printable ASCII become
/// \xNN, and what is longer than `most` bytes is cut, with three dots in its place.
inline std::string printable(std::string_view text, std::size_t most = 64) {
    const std::string result = base::escape(text.substr(0, most), base::EscapeStyle::ascii);
    return text.size() > most ? result + "..." : result;
}

}  // namespace VA::OSStatusFacade

#endif
