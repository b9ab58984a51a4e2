#include "host/server/Users.h"

#include <crypt.h>
#include <string.h>
#include <sys/random.h>

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <memory>
#include <set>
#include <sstream>
#include <stdexcept>
#include <string_view>
#include <system_error>
#include <utility>

#include "base/Ascii.h"
#include "host/server/ConfigurationFile.h"

namespace cmpihost::server {

namespace {

/// Addresses whose failures are counted; beyond, the one that is longest ago is forgotten.
constexpr std::size_t mostAddresses = 1024;

constexpr std::size_t longestCredentials = 512;
constexpr std::string_view base64Digits =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

/// Four digits, of which the last `padding` are signs of equality: their bytes are appended. False:
/// one is no digit, or bits that stand for nothing are set.
bool appendQuartet(std::string_view quartet, std::size_t padding, std::string& bytes) {
    std::uint32_t bits = 0;
    for (std::size_t index = 0; index < 4; ++index) {
        const bool padded = index >= 4 - padding;
        const std::size_t digit = padded ? 0 : base64Digits.find(quartet[index]);
        if (digit == std::string_view::npos || (padded && quartet[index] != '=')) return false;
        bits = bits << 6U | static_cast<std::uint32_t>(digit);
    }
    for (unsigned shift = 16, count = 0; count < 3 - padding; shift -= 8, ++count)
        bytes += static_cast<char>(bits >> shift & 0xFFU);
    return (bits & ((1U << 8U * static_cast<unsigned>(padding)) - 1U)) == 0;
}

/// False: it is not base64 in the form that encoders write.
bool decodeBase64(std::string_view text, std::string& bytes) {
    if (text.empty() || text.size() % 4 != 0) return false;
    std::size_t padding = 0;
    while (padding < 2 && text[text.size() - 1 - padding] == '=') ++padding;
    // Grows no more: a buffer that moves would leave a copy behind.
    bytes.reserve(text.size());
    for (; !text.empty(); text.remove_prefix(4))
        if (!appendQuartet(text.substr(0, 4), text.size() == 4 ? padding : 0, bytes)) return false;
    return true;
}

bool isControl(char byte) {
    const auto code = static_cast<unsigned char>(byte);
    return code < 0x20 || code == 0x7F;
}

void wipe(std::string& text) {
    explicit_bzero(text.data(), text.size());
}

/// A name with its password, which is wiped out of memory at the end of the object's life.
class BasicCredentials {
  public:
    BasicCredentials() = default;
    ~BasicCredentials() { wipe(password); }
    BasicCredentials(const BasicCredentials&) = delete;
    BasicCredentials& operator=(const BasicCredentials&) = delete;

    /// Reads the value of a header Authorization of the scheme Basic. False: it is of another
    /// scheme, is longer than any honest one, is not base64 in its strict form, or holds no colon,
    /// no name or a control character.
    bool read(std::string_view header);

    std::string name{};
    std::string password{};
};

bool BasicCredentials::read(std::string_view header) {
    constexpr std::string_view scheme = "Basic ";
    if (header.size() > longestCredentials ||
        !base::equalsIgnoreCase(header.substr(0, scheme.size()), scheme))
        return false;
    header.remove_prefix(std::min(header.find_first_not_of(' ', scheme.size()), header.size()));
    std::string decoded;
    bool understood =
        decodeBase64(header, decoded) && std::none_of(decoded.begin(), decoded.end(), isControl);
    // A password may hold colons, a name cannot.
    const std::size_t colon = decoded.find(':');
    understood = understood && colon != std::string::npos && colon > 0;
    if (understood) {
        name.assign(decoded, 0, colon);
        password.assign(decoded, colon + 1);
    }
    wipe(decoded);
    return understood;
}

/// The hash of a password; empty: crypt does not know the kind of hash.
std::string hashOf(const std::string& password, const std::string& setting) {
    const auto data = std::make_unique<crypt_data>();
    const char* const hash = crypt_r(password.c_str(), setting.c_str(), data.get());
    const std::string result = hash == nullptr || hash[0] == '*' ? "" : hash;
    explicit_bzero(data.get(), sizeof *data);
    return result;
}

/// Takes the same time wherever texts of one length differ.
bool isEqual(const std::string& left, const std::string& right) {
    if (left.size() != right.size() || left.empty()) return false;
    unsigned difference = 0;
    for (std::size_t index = 0; index < left.size(); ++index)
        difference |=
            static_cast<unsigned char>(left[index]) ^ static_cast<unsigned char>(right[index]);
    return difference == 0;
}

/// SHA-256 at the fewest rounds that there are, with a salt that no other process has.
std::string makeShortSetting() {
    constexpr char digits[] = "./0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz";
    unsigned char random[16];
    if (getrandom(random, sizeof random, 0) != static_cast<ssize_t>(sizeof random))
        throw std::system_error(errno, std::generic_category(), "no random numbers");
    std::string setting = "$5$rounds=1000$";
    for (const unsigned char byte : random) setting += digits[byte % 64U];
    return setting + "$";
}

/// What stands before the salt: "$6$".
std::string kindOf(const std::string& hash) {
    return hash.substr(0, hash.find('$', 1) + 1);
}

}  // namespace

Users::Users(std::string file, Log& log, Waits waits)
    : file_(std::move(file)),
      log_(log),
      waits_(waits),
      shortSetting_(makeShortSetting()),
      hashes_(readFile()) {}

void Users::reload() {
    Hashes hashes = readFile();
    const std::lock_guard<std::mutex> lock(mutex_);
    hashes_ = std::move(hashes);
    accepted_.clear();
}

Users::Hashes Users::readFile() const {
    std::istringstream text(readConfigurationFile(file_, true));
    Hashes hashes;
    std::set<std::string> knownKinds;
    unsigned number = 0;
    const auto refuse = [&](const char* why) {
        throw std::runtime_error(file_ + ":" + std::to_string(number) + ": " + why);
    };
    for (std::string line; std::getline(text, line);) {
        ++number;
        if (line.empty() || line.front() == '#') continue;
        const std::size_t colon = line.find(':');
        if (colon == std::string::npos || colon == 0) refuse("expected name:hash");
        const std::string hash = line.substr(colon + 1);
        const bool graphic =
            std::all_of(hash.begin(), hash.end(), [](char c) { return c > ' ' && c < '\x7F'; });
        if (hash.empty() || hash.front() != '$' || !graphic)
            refuse(
                "no hash stands behind the colon, as 'openssl passwd -6' prints it, without "
                "blanks");
        // Of each kind one is tried, for this takes time.
        if (knownKinds.insert(kindOf(hash)).second && hashOf("", hash).size() != hash.size())
            refuse("the hash is of a kind that this system does not know, or is cut off");
        if (!hashes.emplace(line.substr(0, colon), hash).second)
            refuse("the name stands in an earlier line, too");
    }
    if (hashes.empty()) throw std::runtime_error(file_ + ": holds no users");
    return hashes;
}

AccessControl::Verdict Users::judge(const HttpRequest& request) {
    const std::string* const header = request.header("Authorization");
    // That a client waits to be asked is no failure.
    if (header == nullptr) return {};
    if (request.count("Authorization") != 1) return refuse(request.peer, "more than one header");
    BasicCredentials given;
    if (!given.read(*header)) return refuse(request.peer, "credentials that are none");
    std::string shortHash = hashOf(given.password, shortSetting_);
    if (!isRemembered(given.name, shortHash) &&
        !accept(given.name, given.password, std::move(shortHash)))
        return refuse(request.peer, "wrong name or password of '" + given.name + "'");
    return {true, given.name};
}

bool Users::isRemembered(const std::string& name, const std::string& shortHash) {
    const std::lock_guard<std::mutex> lock(mutex_);
    const auto found = accepted_.find(name);
    return found != accepted_.end() && Clock::now() < found->second.until &&
           isEqual(found->second.shortHash, shortHash);
}

bool Users::accept(const std::string& name, const std::string& password, std::string shortHash) {
    std::unique_lock<std::mutex> lock(mutex_);
    const auto found = hashes_.find(name);
    const bool known = found != hashes_.end();
    const std::string expected = known ? found->second : hashes_.begin()->second;
    lock.unlock();
    {
        const std::lock_guard<std::mutex> alone(hashing_);
        if (!isEqual(hashOf(password, expected), expected) || !known) return false;
    }
    lock.lock();
    // The file may have been read again meanwhile.
    const auto current = hashes_.find(name);
    if (current == hashes_.end() || current->second != expected) return false;
    accepted_[name] = {std::move(shortHash), Clock::now() + remembered};
    return true;
}

AccessControl::Verdict Users::refuse(const std::string& peer, const std::string& what) {
    log_.write(Priority::Warning, peer + ": refused: " + what);
    return {false, std::nullopt, countFailure(peer)};
}

std::chrono::milliseconds Users::countFailure(const std::string& peer) {
    const std::lock_guard<std::mutex> lock(mutex_);
    const Clock::time_point now = Clock::now();
    if (failures_.size() >= mostAddresses && failures_.count(peer) == 0) {
        const auto earlier = [](const auto& left, const auto& right) {
            return left.second.last < right.second.last;
        };
        failures_.erase(std::min_element(failures_.begin(), failures_.end(), earlier));
    }
    Failures& failures = failures_[peer];
    if (now - failures.last > waits_.forgotten) failures.count = 0;
    failures.last = now;
    std::chrono::milliseconds wait = waits_.first;
    for (unsigned count = 0; count < failures.count && wait < waits_.longest; ++count) wait *= 2;
    ++failures.count;
    return std::min(wait, waits_.longest);
}

}  // namespace cmpihost::server
