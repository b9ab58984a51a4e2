#ifndef TESTS_INSTRUMENTATION_FAKE_DBUS_H
#define TESTS_INSTRUMENTATION_FAKE_DBUS_H

#include <chrono>
#include <string>
#include <thread>
#include <vector>

/// A message bus of one client at a time, for a real D-Bus library to talk to: it lets anybody in,
/// and answers the greeting and one property read after it.
class FakeDBus {
  public:
    enum class Behaviour {
        Answer,              ///< replies with the state, after the delay
        ErrorReply,          ///< replies with an error
        OtherType,           ///< replies with a number
        OtherReply,          ///< replies with the state to a question that nobody asked
        Garbage,             ///< replies with bytes that are no message
        GarbageAtTheDoor,    ///< the same, to the first bytes of the client
        SilentFromTheStart,  ///< accepts, and says nothing ever
        SilentAfterGreeting,
        HangsUp,  ///< ends the connection when asked
    };

    /// Listens on a socket at `path`, whose folder exists.
    FakeDBus(const std::string& path, Behaviour behaviour, std::string state = "running",
             std::chrono::milliseconds delay = {});
    ~FakeDBus();
    FakeDBus(const FakeDBus&) = delete;
    FakeDBus& operator=(const FakeDBus&) = delete;

    /// The bodies and headers of the messages received so far, as raw bytes. Called when the client
    /// has finished.
    const std::vector<std::string>& stop();

  private:
    void serve();
    void serveClient(int client);
    bool waitForStop() const;

    const Behaviour behaviour_;
    const std::string state_;
    const std::chrono::milliseconds delay_;
    int listener_ = -1;
    int stopPipe_[2] = {-1, -1};
    std::vector<std::string> messages_;
    std::thread thread_;
};

#endif
