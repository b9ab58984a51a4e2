#include "load/EndpointClients.h"

#include <mutex>
#include <stdexcept>
#include <thread>

#include "support/KeptConnection.h"

namespace {

std::string keyBinding(const std::string& name, const std::string& value) {
    return "<KEYBINDING NAME=\"" + name + "\"><KEYVALUE VALUETYPE=\"string\">" + value +
           "</KEYVALUE></KEYBINDING>";
}

/// The operating system of a host, as a parameter of that name.
std::string systemParameter(const std::string& name, const std::string& computer,
                            const std::string& system) {
    return "<IPARAMVALUE NAME=\"" + name + "\"><INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">" +
           keyBinding("CSCreationClassName", "KORVA_ComputerSystem") +
           keyBinding("CSName", computer) +
           keyBinding("CreationClassName", "KORVA_OperatingSystem") + keyBinding("Name", system) +
           "</INSTANCENAME></IPARAMVALUE>";
}

/// The text between two others, empty when they are not there.
std::string between(std::string_view text, std::string_view before, std::string_view after) {
    const std::size_t at = text.find(before);
    if (at == std::string_view::npos) return {};
    const std::size_t begin = at + before.size();
    return std::string(text.substr(begin, text.find(after, begin) - begin));
}

}  // namespace

/// What one connection asks, in turn.
class EndpointClients::Client {
  public:
    Client(std::uint16_t port, unsigned number, const EndpointClients& all)
        : connection_(port, 1 + number % 8), name_(std::to_string(number) + '-'), all_(all) {}

    void run(unsigned long requests) {
        for (unsigned long count = 0; count < requests; ++count) {
            const std::size_t turn = next_++ % (all_.kinds_.size() + 1);
            if (turn == all_.kinds_.size())
                pull();
            else
                ask(all_.kinds_[turn]);
        }
    }

  private:
    void ask(const Kind& kind) {
        const std::string id = name_ + std::to_string(next_);
        std::string answer(connection_.ask(intrinsicRequest(id, kind.operation, kind.parameters)));
        const std::string found = "ID=\"" + id + '"';
        const std::size_t at = answer.find(found);
        if (at != std::string::npos) answer.replace(at, found.size(), "ID=\"0\"");
        if (answer != kind.answer)
            throw std::runtime_error(id + ", " + kind.operation + ": " + answer);
    }

    /// Three associations, one by one.
    void pull() {
        const std::string one = valueParameter("MaxObjectCount", "1");
        std::string context = contextIn("OpenReferenceInstancePaths", all_.source_ + one, "FALSE");
        for (const char* last : {"FALSE", "TRUE"})
            context = contextIn("PullInstancePaths",
                                valueParameter("EnumerationContext", context) + one, last);
    }

    /// Asks for one path, the last one or not, and gives the context in the answer.
    std::string contextIn(const char* operation, const std::string& parameters, const char* last) {
        const std::string_view answer =
            connection_.ask(intrinsicRequest(name_, operation, parameters));
        const auto out = [&](const char* name) {
            return between(between(answer, name, "</PARAMVALUE>"), "<VALUE>", "</VALUE>");
        };
        if (between(answer, " ID=\"", "\"") != name_ || out("\"EndOfSequence\"") != last ||
            answer.find("<INSTANCEPATH>") == std::string_view::npos)
            throw std::runtime_error(name_ + ", " + operation + ": " + std::string(answer));
        return out("\"EnumerationContext\"");
    }

    KeptConnection connection_;
    const std::string name_;
    const EndpointClients& all_;
    std::size_t next_ = 0;
};

EndpointClients::EndpointClients(std::uint16_t port, unsigned long connections,
                                 const std::string& computer, const std::string& system)
    : source_(systemParameter("InstanceName", computer, system)) {
    const std::string own = classParameter("ClassName", "KORVA_OperatingSystem");
    const std::string source = systemParameter("ObjectName", computer, system);
    const std::string other = systemParameter("InstanceName", computer, "Other &lt;system&gt;");
    const char* const result = "<IRETURNVALUE><";
    const struct {
        const char* operation;
        std::string parameters;
        const char* expected;
    } rows[] = {
        {"EnumerateInstances", own, result},
        {"EnumerateInstanceNames", own, result},
        {"GetInstance", source_, result},
        {"EnumerateInstances", classParameter("ClassName", "CIM_Dependency"), result},
        {"AssociatorNames", source, result},
        {"References", source, result},
        {"GetClass", classParameter("ClassName", "KORVA_InstalledOS"), result},
        {"GetInstance", other, "<ERROR CODE=\"6\""},
        {"EnumerateInstanceNames", classParameter("ClassName", "KORVA_No"), "<ERROR CODE=\"5\""},
    };
    KeptConnection alone(port);
    for (const auto& row : rows) {
        const std::string answer(alone.ask(intrinsicRequest("0", row.operation, row.parameters)));
        if (answer.find(row.expected) == std::string::npos)
            throw std::runtime_error(std::string(row.operation) + ": " + answer);
        kinds_.push_back({row.operation, row.parameters, answer});
    }
    for (unsigned number = 0; number < connections; ++number)
        clients_.push_back(std::make_unique<Client>(port, number, *this));
}

EndpointClients::~EndpointClients() = default;

void EndpointClients::run(unsigned long requests) {
    std::mutex mutex;
    std::string complaint;
    std::vector<std::thread> threads;
    for (const std::unique_ptr<Client>& client : clients_)
        threads.emplace_back([&] {
            try {
                client->run(requests / clients_.size());
            } catch (const std::exception& failure) {
                const std::lock_guard<std::mutex> lock(mutex);
                complaint = failure.what();
            }
        });
    for (std::thread& thread : threads) thread.join();
    if (!complaint.empty()) throw std::runtime_error(complaint);
}
