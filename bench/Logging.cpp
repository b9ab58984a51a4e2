// Measured requests must not meet a configuration that this machine happens to have.
#include "bench/Logging.h"

#include "Trace.h"

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <thread>

namespace bench {

namespace {

std::string makeFolder() {
    std::string name = (std::filesystem::temp_directory_path() / "korva-bench-XXXXXX").string();
    if (::mkdtemp(name.data()) == nullptr) throw std::runtime_error("no folder for the logging");
    return name;
}

}  // namespace

LoggingConfiguration::LoggingConfiguration() : folder_(makeFolder()) {
    std::ofstream(folder_ + "/zblog.conf") << failuresOnly;
    ::setenv("ZBLOG_CONF", (folder_ + "/zblog.conf").c_str(), 1);
}

LoggingConfiguration::~LoggingConfiguration() {
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
}

void LoggingConfiguration::use(const std::string& settings) {
    std::ofstream(folder_ + "/zblog.conf") << settings;
    // The file is looked at again by the first record that comes a second after the last look.
    std::this_thread::sleep_for(std::chrono::milliseconds(1100));
    VA::writeRecord("use", "Logging.cpp", 0, "bench", VA::recordLevel,
                    [] { return VA::trace("Logging.cpp", "use", 0U, VA::Method); });
}

}  // namespace bench
