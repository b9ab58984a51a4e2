#ifndef HOST_CLI_STOPWATCH_H
#define HOST_CLI_STOPWATCH_H

#include <chrono>
#include <iomanip>
#include <sstream>
#include <string>

namespace cmpihost {

/// How long each part of a run took, from when the object was made. One thread uses it.
class Stopwatch {
  public:
    using Time = std::chrono::duration<double, std::milli>;

    /// Schema, registrations and libraries.
    Time load{};
    /// The providers' answer.
    Time request{};
    Time output{};

    /// Adds the time since the last lap to a part.
    void lap(Time Stopwatch::*part) {
        const auto now = std::chrono::steady_clock::now();
        this->*part += now - last_;
        last_ = now;
    }

    /// Counts a time to another part than so far.
    void move(Time time, Time Stopwatch::*from, Time Stopwatch::*to) {
        this->*from -= time;
        this->*to += time;
    }

    std::string text() const {
        std::ostringstream text;
        text << std::fixed << std::setprecision(1) << "time: load " << load.count()
             << " ms (schema, libraries), request " << request.count()
             << " ms (the providers' answer), output " << output.count() << " ms";
        return text.str();
    }

  private:
    std::chrono::steady_clock::time_point last_ = std::chrono::steady_clock::now();
};

}  // namespace cmpihost

#endif
