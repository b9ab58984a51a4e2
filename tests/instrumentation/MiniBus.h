#ifndef TESTS_INSTRUMENTATION_MINI_BUS_H
#define TESTS_INSTRUMENTATION_MINI_BUS_H

#include <atomic>
#include <string>
#include <thread>
#include <vector>

/// A message bus of one client at a time, for a real D-Bus library to talk to: it lets anybody in,
/// and answers the greeting and one property read after it.
class MiniBus {
  public:
    enum class Behaviour {
        Answer,              ///< replies with the state
        ErrorReply,          ///< replies with an error
        OtherType,           ///< replies with a number
        SilentFromTheStart,  ///< accepts, and says nothing ever
        SilentAfterGreeting,
        HangsUp,  ///< ends the connection when asked
    };

    /// Listens on a socket at `path`, whose folder exists.
    MiniBus(const std::string& path, Behaviour behaviour, std::string state);
    ~MiniBus();
    MiniBus(const MiniBus&) = delete;
    MiniBus& operator=(const MiniBus&) = delete;

    /// The bodies and headers of the messages received so far, as raw bytes. Called when the client
    /// has finished.
    const std::vector<std::string>& stop();

  private:
    void serve();
    void serveClient(int client);

    const Behaviour behaviour_;
    const std::string state_;
    int listener_ = -1;
    int stopPipe_[2] = {-1, -1};
    std::vector<std::string> messages_;
    std::thread thread_;
};

#endif
