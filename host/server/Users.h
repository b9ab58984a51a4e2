#ifndef HOST_SERVER_USERS_H
#define HOST_SERVER_USERS_H

#include <chrono>
#include <map>
#include <mutex>
#include <string>

#include "host/server/CimOverHttp.h"
#include "host/server/Log.h"

namespace cmpihost::server {

/// Basic authentication against a file of lines "name:hash", hashes as crypt(3) makes them. Who
/// gives no credentials, two of them or some that are not understood may not ask. A name that is
/// not in the file costs the time of a wrong password. A client whose passwords are wrong waits for
/// the answer, the longer the more often it fails; each failure is logged with its address.
class Users final : public AccessControl {
  public:
    using Clock = std::chrono::steady_clock;

    struct Waits {
        /// After the first failure of an address; twice as long after each further one.
        std::chrono::milliseconds first{250};
        std::chrono::milliseconds longest{4000};
        /// An address without a failure for so long begins anew.
        std::chrono::seconds forgotten{300};
    };
    /// How long credentials that were accepted are known again without the cost of their hash.
    static constexpr std::chrono::seconds remembered{60};

    /// Reads the file. Throws std::runtime_error with one line that says what is wrong with it. The
    /// log outlives this object.
    Users(std::string file, Log& log, Waits waits);
    Users(std::string file, Log& log) : Users(std::move(file), log, Waits()) {}

    /// Reads the file again, on any thread; where it throws as the constructor does, everything
    /// stays as it was.
    void reload();

    Verdict judge(const HttpRequest& request) override;

  private:
    using Hashes = std::map<std::string, std::string>;

    struct Acceptance {
        std::string shortHash{};
        Clock::time_point until{};
    };
    struct Failures {
        unsigned count = 0;
        Clock::time_point last{};
    };

    Hashes readFile() const;
    bool isRemembered(const std::string& name, const std::string& shortHash);
    bool accept(const std::string& name, const std::string& password, std::string shortHash);
    std::chrono::milliseconds countFailure(const std::string& peer);
    Verdict refuse(const std::string& peer, const std::string& what);

    const std::string file_;
    Log& log_;
    const Waits waits_;
    /// Makes hashes for this process only.
    const std::string shortSetting_;
    /// Guards what follows.
    std::mutex mutex_;
    Hashes hashes_;
    std::map<std::string, Acceptance> accepted_;
    std::map<std::string, Failures> failures_;
    /// One hash at a time: some kinds take much memory.
    std::mutex hashing_;
};

}  // namespace cmpihost::server

#endif
