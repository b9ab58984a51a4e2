// Sends many requests to a running endpoint over several kept connections at once. Each answer must
// be the one that its request had before anything else ran, but for the identifier of the message;
// what the endpoint holds must not grow. Exits with 0 when all of that holds, 1 when something does
// not, 2 for wrong usage and failures.
#include <chrono>
#include <iostream>
#include <map>
#include <memory>
#include <mutex>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "support/EndpointProcess.h"
#include "support/KeptConnection.h"

namespace {

struct Options {
    std::string program;
    unsigned long requests = 200000;  ///< between two readings
    unsigned long settle = 20000;     ///< before the first reading
    unsigned long connections = 1;
    bool memory = true;  ///< whether resident memory is compared
};

Options parse(const std::vector<std::string>& arguments) {
    const std::string usage =
        "usage: endpoint_load PROGRAM [--requests N] [--settle N] [--connections N] [--no-memory]";
    if (arguments.empty()) throw std::invalid_argument(usage);
    Options options;
    options.program = arguments[0];
    const std::map<std::string, unsigned long*> numbers = {{"--requests", &options.requests},
                                                           {"--settle", &options.settle},
                                                           {"--connections", &options.connections}};
    for (auto word = arguments.begin() + 1; word != arguments.end(); ++word) {
        if (*word == "--no-memory") {
            options.memory = false;
            continue;
        }
        const auto number = numbers.find(*word);
        if (number == numbers.end() || ++word == arguments.end())
            throw std::invalid_argument(usage);
        *number->second = std::stoul(*word);
    }
    return options;
}

/// A request in whose text the identifier stands, and its answer with the identifier "0".
struct Kind {
    std::string operation;
    std::string parameters;
    std::string answer{};
};

std::string key(const std::string& name, const std::string& value) {
    return "<KEYBINDING NAME=\"" + name + "\"><KEYVALUE VALUETYPE=\"string\">" + value +
           "</KEYVALUE></KEYBINDING>";
}

std::string systemParameter(const std::string& name, const std::string& systemName) {
    return "<IPARAMVALUE NAME=\"" + name + "\"><INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">" +
           key("CSCreationClassName", "KORVA_ComputerSystem") + key("CSName", "fixture.example") +
           key("CreationClassName", "KORVA_OperatingSystem") + key("Name", systemName) +
           "</INSTANCENAME></IPARAMVALUE>";
}

std::vector<Kind> kinds() {
    const std::string system = "Fixture Linux";
    return {
        {"EnumerateInstances", classParameter("ClassName", "KORVA_OperatingSystem")},
        {"EnumerateInstanceNames", classParameter("ClassName", "KORVA_OperatingSystem")},
        {"GetInstance", systemParameter("InstanceName", system)},
        {"EnumerateInstances", classParameter("ClassName", "CIM_Dependency")},
        {"AssociatorNames", systemParameter("ObjectName", system)},
        {"References", systemParameter("ObjectName", system)},
        {"GetClass", classParameter("ClassName", "KORVA_InstalledOS")},
        {"GetInstance", systemParameter("InstanceName", "Other &lt;system&gt;")},
        {"EnumerateInstanceNames", classParameter("ClassName", "KORVA_Nothing")},
    };
}

// The text between two others, empty when they are not there.
std::string between(std::string_view text, std::string_view before, std::string_view after) {
    const std::size_t at = text.find(before);
    if (at == std::string_view::npos) return {};
    const std::size_t begin = at + before.size();
    return std::string(text.substr(begin, text.find(after, begin) - begin));
}

/// What one connection asks, in turn; its identifiers are like no others'.
class Client {
  public:
    Client(std::uint16_t port, unsigned number, const std::vector<Kind>& kinds)
        : connection_(port, 1 + number % 8), name_(std::to_string(number) + '-'), kinds_(kinds) {}

    /// Asks that many times. Throws std::runtime_error for an answer that is not as it must be.
    void run(unsigned long requests) {
        for (unsigned long count = 0; count < requests; ++count) {
            const std::size_t turn = next_++ % (kinds_.size() + 1);
            if (turn == kinds_.size())
                pull();
            else
                ask(kinds_[turn]);
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

    // Three associations, one by one.
    void pull() {
        std::string context = opened();
        for (const char* last : {"FALSE", "TRUE"}) {
            const std::string_view answer =
                connection_.ask(intrinsicRequest(name_, "PullInstancePaths",
                                                 valueParameter("EnumerationContext", context) +
                                                     valueParameter("MaxObjectCount", "1")));
            check(answer, last);
            context = contextOf(answer);
        }
    }

    std::string opened() {
        const std::string_view answer =
            connection_.ask(intrinsicRequest(name_, "OpenReferenceInstancePaths",
                                             systemParameter("InstanceName", "Fixture Linux") +
                                                 valueParameter("MaxObjectCount", "1")));
        check(answer, "FALSE");
        return contextOf(answer);
    }

    static std::string contextOf(std::string_view answer) {
        return between(between(answer, "\"EnumerationContext\"", "</PARAMVALUE>"), "<VALUE>",
                       "</VALUE>");
    }

    void check(std::string_view answer, std::string_view last) const {
        const std::string end =
            between(between(answer, "\"EndOfSequence\"", "</PARAMVALUE>"), "<VALUE>", "</VALUE>");
        if (between(answer, " ID=\"", "\"") != name_ || end != last ||
            answer.find("<INSTANCEPATH>") == std::string_view::npos)
            throw std::runtime_error(name_ + " pulls: " + std::string(answer));
    }

    KeptConnection connection_;
    const std::string name_;
    const std::vector<Kind>& kinds_;
    std::size_t next_ = 0;
};

/// All clients at once.
class Load {
  public:
    Load(const EndpointProcess& endpoint, unsigned long connections) {
        KeptConnection alone(endpoint.port());
        for (Kind& kind : kinds_)
            kind.answer = alone.ask(intrinsicRequest("0", kind.operation, kind.parameters));
        for (unsigned number = 0; number < connections; ++number)
            clients_.push_back(std::make_unique<Client>(endpoint.port(), number, kinds_));
    }

    void run(unsigned long requests) {
        std::vector<std::thread> threads;
        for (const std::unique_ptr<Client>& client : clients_)
            threads.emplace_back([&] { runOne(*client, requests / clients_.size()); });
        for (std::thread& thread : threads) thread.join();
        if (!complaint_.empty()) throw std::runtime_error(complaint_);
    }

  private:
    void runOne(Client& client, unsigned long requests) {
        try {
            client.run(requests);
        } catch (const std::exception& failure) {
            const std::lock_guard<std::mutex> lock(mutex_);
            if (complaint_.empty()) complaint_ = failure.what();
        }
    }

    std::vector<Kind> kinds_ = kinds();
    std::vector<std::unique_ptr<Client>> clients_;
    std::mutex mutex_;
    std::string complaint_;
};

void print(const char* when, const EndpointProcess::State& state) {
    std::cout << when << ": " << state.residentKilobytes << " KiB resident, " << state.descriptors
              << " open files, " << state.threads << " threads\n";
}

// Threads that meet in a new place may take some pages that stay. A leak takes more with every
// turn: memory is steady once a turn leaves it as it was, give or take what the allocator keeps.
bool staysSteady(const EndpointProcess& endpoint, Load& load, const Options& options) {
    constexpr int turns = 4;
    constexpr long grain = 256;
    load.run(options.settle);
    EndpointProcess::State before = endpoint.state();
    print("settled", before);
    for (int turn = 1; turn <= turns; ++turn) {
        load.run(options.requests);
        const EndpointProcess::State after = endpoint.state();
        print(("after " + std::to_string(options.requests * turn) + " requests more").c_str(),
              after);
        if (after.descriptors != before.descriptors || after.threads != before.threads)
            return false;
        if (!options.memory || after.residentKilobytes <= before.residentKilobytes + grain)
            return true;
        before = after;
    }
    return false;
}

}  // namespace

int main(int count, char** arguments) try {
    const Options options = parse({arguments + 1, arguments + count});
    EndpointProcess endpoint(options.program);
    const EndpointProcess::State idle = endpoint.state();
    print("started", idle);
    const auto started = std::chrono::steady_clock::now();
    bool steady = false;
    {
        Load load(endpoint, options.connections);
        steady = staysSteady(endpoint, load, options);
    }
    const std::chrono::duration<double> time = std::chrono::steady_clock::now() - started;
    std::cout << options.connections << " connections, " << time.count() << " s\n";
    const EndpointProcess::End end = endpoint.stop();
    if (end.status != 0 || !end.err.empty())
        throw std::runtime_error("the endpoint ended with " + std::to_string(end.status) + ": " +
                                 end.err);
    return steady ? 0 : 1;
} catch (const std::exception& failure) {
    std::cerr << failure.what() << "\n";
    return 2;
}
