// Measured requests must not meet a configuration that this machine happens to have.
#include "bench/Logging.h"

#include "Trace.h"

#include <chrono>
#include <cstdlib>
#include <thread>

namespace bench {

LoggingConfiguration::LoggingConfiguration() {
    folder_.write("zblog.conf", failuresOnly);
    ::setenv("ZBLOG_CONF", folder_.path("zblog.conf").c_str(), 1);
}

void LoggingConfiguration::use(const std::string& settings) {
    folder_.write("zblog.conf", settings);
    // The file is looked at again by the first record that comes a second after the last look.
    std::this_thread::sleep_for(std::chrono::milliseconds(1100));
    VA::writeRecord("use", "Logging.cpp", 0, "bench", VA::recordLevel,
                    [] { return VA::trace("Logging.cpp", "use", 0U, VA::Method); });
}

}  // namespace bench
