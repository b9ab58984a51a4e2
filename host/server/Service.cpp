#include "host/server/Service.h"

#include <pthread.h>
#include <signal.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <future>
#include <memory>
#include <optional>
#include <system_error>
#include <thread>
#include <utility>

#include "host/InstallPaths.h"
#include "host/server/AccessLog.h"
#include "host/server/CimOverHttp.h"
#include "host/server/Listeners.h"
#include "host/server/ObjectManager.h"
#include "host/server/ServiceManager.h"
#include "host/server/Users.h"

namespace cmpihost::server {

namespace fs = std::filesystem;

namespace {

/// How long requests may go on after the signal to end.
constexpr std::chrono::seconds lastRequests{10};

std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename[0] == '\0' ? "localhost" : names.nodename;
}

std::vector<fs::path> pathsOf(const std::vector<std::string>& given, const fs::path& otherwise) {
    if (given.empty()) return {otherwise};
    return {given.begin(), given.end()};
}

ObjectManagerSetup managerSetup(const ServiceOptions& options, const fs::path& programFolder,
                                Log& log) {
    ObjectManagerSetup setup;
    try {
        setup.schema = Schema::load(pathsOf(options.schemas, schemaFolder(programFolder)));
        setup.registrations =
            Registrations::read(pathsOf(options.registrations, registrationFolder(programFolder)));
    } catch (const std::runtime_error& error) {
        throw ServiceError(serviceNotLoaded, error.what());
    }
    if (setup.registrations.all().empty()) {
        const std::string where = options.registrations.empty()
                                      ? registrationFolder(programFolder).string()
                                      : options.registrations.front();
        throw ServiceError(serviceNotLoaded, where + ": there are no registrations of providers");
    }
    setup.libraryFolders = libraryFolders(programFolder);
    setup.messageSink = [&log](const ProviderMessage& message) {
        logProviderMessage(log, message);
    };
    setup.hostName = nodeName();
    return setup;
}

/// Nobody is asked for a password.
class Everybody final : public AccessControl {
  public:
    Verdict judge(const HttpRequest&) override { return {true, std::nullopt}; }
};

CimOverHttp::Options httpOptions(const ServiceOptions& options) {
    CimOverHttp::Options result;
    result.hostNames = options.hostNames;
    result.hostNames.insert(result.hostNames.end(), {"localhost", nodeName()});
    return result;
}

sigset_t handledSignals() {
    sigset_t signals;
    sigemptyset(&signals);
    for (const int signal : {SIGTERM, SIGINT, SIGHUP, SIGUSR1}) sigaddset(&signals, signal);
    return signals;
}

/// Ends the process when it is not gone in time.
class Deadline {
  public:
    Deadline(std::chrono::seconds time, Log& log)
        : thread_([this, time, &log] {
              if (done_.get_future().wait_for(time) == std::future_status::ready) return;
              log.write(Priority::Error, "requests still run; they are given up");
              _exit(serviceFailed);
          }) {}
    ~Deadline() {
        done_.set_value();
        thread_.join();
    }
    Deadline(const Deadline&) = delete;
    Deadline& operator=(const Deadline&) = delete;

  private:
    std::promise<void> done_;
    std::thread thread_;
};

class Service {
  public:
    Service(const ServiceOptions& options, const fs::path& programFolder, Log& log);
    ServiceStatus run();

  private:
    HttpEvents events();
    void reload();
    template <class Read>
    void readAgain(const char* what, const Read& read);
    void logCounters();
    void stop();

    const ServiceOptions& options_;
    Log& log_;
    ObjectManager manager_;
    /// Null: nobody is asked for a password.
    std::unique_ptr<Users> users_;
    Everybody everybody_;
    CimOverHttp cim_;
    AccessLog accessLog_;
    Listeners listeners_;
};

Service::Service(const ServiceOptions& options, const fs::path& programFolder, Log& log)
    : options_(options),
      log_(log),
      manager_(managerSetup(options, programFolder, log)),
      users_(options.users.empty() ? nullptr : std::make_unique<Users>(options.users, log)),
      cim_(manager_, users_ ? static_cast<AccessControl&>(*users_) : everybody_,
           httpOptions(options)),
      accessLog_(log, [this] { return manager_.takeComplaints(); }),
      listeners_(options, cim_, events()) {}

HttpEvents Service::events() {
    HttpEvents result;
    result.answered = [this](const HttpRequest& request, const HttpResponse& response,
                             std::chrono::nanoseconds took) {
        if (response.status != 200) manager_.statistics().countRefusal();
        accessLog_.answered(request, response, took);
    };
    result.cut = [this](const std::string& peer, const char* reason) {
        manager_.statistics().countCut();
        accessLog_.cut(peer, reason);
    };
    return result;
}

ServiceStatus Service::run() {
    for (const std::string& url : listeners_.urls())
        log_.write(Priority::Info, "listening on " + url);
    notifyServiceManager("READY=1");
    const sigset_t signals = handledSignals();
    for (;;) {
        int signal = 0;
        sigwait(&signals, &signal);
        if (signal == SIGTERM || signal == SIGINT) break;
        if (signal == SIGHUP) reload();
        if (signal == SIGUSR1) logCounters();
    }
    stop();
    return serviceEnded;
}

void Service::reload() {
    notifyServiceManager(reloadingState());
    if (users_) readAgain("users", [this] { users_->reload(); });
    if (!options_.certificate.empty())
        readAgain("certificate and key", [this] { listeners_.replaceIdentity(); });
    notifyServiceManager("READY=1");
}

/// Where it fails, what was in force stays so.
template <class Read>
void Service::readAgain(const char* what, const Read& read) {
    try {
        read();
        log_.write(Priority::Info, std::string("read again: ") + what);
    } catch (const std::exception& error) {
        log_.write(Priority::Error, std::string("kept ") + what + ": " + error.what());
    }
}

void Service::logCounters() {
    const Statistics& counted = manager_.statistics();
    const auto microseconds = [](std::chrono::nanoseconds time) {
        return std::to_string(std::chrono::duration_cast<std::chrono::microseconds>(time).count());
    };
    log_.write(Priority::Info, "counters: operations " + std::to_string(counted.operations()) +
                                   ", failed " + std::to_string(counted.failures()) +
                                   ", requests refused " + std::to_string(counted.refusals()) +
                                   ", connections cut " + std::to_string(counted.cuts()) +
                                   ", busy " + microseconds(counted.busyTime()) + "us, up " +
                                   microseconds(counted.upTime()) + "us, log lines lost " +
                                   std::to_string(log_.lost()));
}

void Service::stop() {
    notifyServiceManager("STOPPING=1");
    const Deadline deadline(lastRequests, log_);
    listeners_.stop();
    manager_.unload();
    accessLog_.logComplaints();
}

}  // namespace

ServiceStatus serve(const ServiceOptions& options, const fs::path& programFolder, Log& log) {
    const sigset_t signals = handledSignals();
    // Before the first thread: all of them leave the signals to this one.
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    signal(SIGPIPE, SIG_IGN);
    try {
        return Service(options, programFolder, log).run();
    } catch (const ServiceError&) {
        throw;
    } catch (const std::invalid_argument& error) {
        throw ServiceError(serviceRefused, error.what());
    } catch (const std::system_error& error) {
        throw ServiceError(serviceFailed, error.what());
    } catch (const std::runtime_error& error) {
        throw ServiceError(serviceRefused, error.what());
    }
}

}  // namespace cmpihost::server
