// One run is one process: everything is loaded for a single request and unloaded before the exit,
// so that what the broker catches while the provider cleans up is reported too.
#include "host/cli/Run.h"

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <optional>
#include <ostream>
#include <type_traits>
#include <utility>

#include "base/Utf8.h"
#include "host/InstallPaths.h"
#include "host/cli/BareValues.h"
#include "host/cli/Describe.h"
#include "host/cli/DescribeJson.h"
#include "host/cli/Diagnostics.h"
#include "host/cli/Explanation.h"
#include "host/cli/MethodAnswer.h"
#include "host/cli/NameNotes.h"
#include "host/cli/Namespaces.h"
#include "host/cli/PathCompletion.h"
#include "host/cli/PathParser.h"
#include "host/cli/ProviderHost.h"
#include "host/cli/ProviderRecords.h"
#include "host/cli/RequestBuilder.h"
#include "host/cli/Results.h"
#include "host/cli/Serve.h"
#include "host/cli/Sources.h"
#include "host/cli/Stopwatch.h"
#include "host/cli/Tree.h"
#include "host/mof/Schema.h"

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

bool isNotFound(const OperationResult& result) {
    return result.rc == CMPI_RC_ERR_NOT_FOUND;
}

/// The work and what its parts have in common.
class Run {
  public:
    Run(const CommandLine& commandLine, const fs::path& programFolder, std::ostream& out,
        std::ostream& err)
        : commandLine_(commandLine),
          programFolder_(programFolder),
          out_(out),
          err_(err),
          messages_(commandLine.log, err) {}

    /// Does it all, and turns what is thrown on the way into a complaint and its exit status.
    ExitStatus exitStatus() {
        const ExitStatus status = executed();
        const bool stays = status == exitUsage || status == exitNotLoaded;
        if (stays || (!notLoaded_ && !caught_)) return status;
        return notLoaded_ ? exitNotLoaded : exitCaught;
    }

  private:
    ExitStatus executed() {
        try {
            const ExitStatus status = execute();
            if (commandLine_.time) err_ << messageLines(stopwatch_.text());
            return status;
        } catch (const ProviderNotFound& error) {
            return failed(error.what(), exitNotLoaded);
        } catch (const LoadError& error) {
            return failed(base::escapeForTerminal(error.what()), exitNotLoaded);
        } catch (const NoSuchInstance& error) {
            return failed(error.what(), exitNothingFound);
        } catch (const UsageError& error) {
            return failed(error.what(), exitUsage);
        }
    }

    ExitStatus execute() {
        // The schema goes first: a wrong path is reported without loading any library.
        const Schema schema = loadSchema(commandLine_.schemas, programFolder_);
        const SchemaCatalogue catalogue(schema);
        stopwatch_.lap(&Stopwatch::load);
        switch (commandLine_.command) {
            case Command::Operation:
                return runOperation(schema, catalogue);
            case Command::Tree:
                return drawHost(schema, catalogue);
            case Command::Classes:
                return told(classSummaries(schema));
            case Command::Describe:
                return told(describe(schema, commandLine_.subject));
            case Command::Namespaces:
                return told(namespaceSummaries(readRegistrations(commandLine_, programFolder_)));
            case Command::Serve:
                break;
        }
        return failed("no such command", exitUsage);
    }

    /// Prints what is known without asking a provider.
    template <class Knowledge>
    ExitStatus told(const Knowledge& knowledge) {
        if (commandLine_.format == Format::Json) {
            writeJson(knowledge, out_);
        } else {
            print(knowledge, terminalOf(STDOUT_FILENO), out_);
        }
        return written();
    }

    ExitStatus runOperation(const Schema& schema, const SchemaCatalogue& catalogue) {
        OperationRequest request = buildRequest(commandLine_, schema, catalogue);
        if (commandLine_.value) checkValueName(*commandLine_.value, request, schema);
        std::string notes;
        OperationResult result = withHost(catalogue, [&](ProviderHost& host) {
            OperationResult answer = commandLine_.bare || !lacksKeys(request, catalogue)
                                         ? host.ask(request)
                                         : completed(host, request);
            stopwatch_.lap(&Stopwatch::request);
            // Before the questions that explain the answer make records of their own.
            const std::string records = recordNotes(request, answer);
            notes = notesOn(request, answer, schema, host) + records;
            return answer;
        });
        // The libraries are gone by now, with whatever they may have left to write themselves.
        const bool done = result.rc == CMPI_RC_OK;
        if (done) {
            if (request.operation == Operation::InvokeMethod) {
                result.instances = {answerInstance(request, result)};
                printAnswer(request, result, schema);
            } else {
                printResult(request, result, schema, *printer(schema));
            }
            notes += noteOnBareValues(result);
        } else {
            failed(failureText(request, result), exitCimStatus);
        }
        err_ << notes;
        if (written() != exitDone) return exitCimStatus;
        const bool nothingFound = request.operation == Operation::GetInstance &&
                                  (done ? result.instances.empty() : isNotFound(result));
        if (nothingFound) return exitNothingFound;
        return done ? exitDone : exitCimStatus;
    }

    void printAnswer(const OperationRequest& request, const OperationResult& result,
                     const Schema& schema) {
        if (commandLine_.format == Format::Json && !commandLine_.value) {
            writeAnswerJson(request, result, schema, out_);
        } else {
            const Schema answers = answerSchema(request, schema);
            printer(answers)->print(result.instances);
        }
    }

    std::string noteOnBareValues(const OperationResult& result) const {
        if (!commandLine_.value) return {};
        const std::string note = noteOnValues(*commandLine_.value, result);
        return note.empty() ? note : noteLine(note);
    }

    /// What helps to understand an answer: names that may be misspelt, and why there is nothing.
    std::string notesOn(const OperationRequest& request, const OperationResult& answer,
                        const Schema& schema, ProviderHost& host) const {
        const std::string names = notesOnNames(request, answer, schema);
        if (!names.empty() || !isEmptyAnswer(request, answer)) return names;
        return reasonForNothing(request, schema, [&](const OperationRequest& question) {
            return host.askAside(question);
        });
    }

    std::unique_ptr<Printer> printer(const Schema& schema) const {
        if (commandLine_.value) return makeValuePrinter(out_, *commandLine_.value);
        return makePrinter(commandLine_.format, out_, schema, terminalOf(STDOUT_FILENO));
    }

    /// Has the request answered once its path has all keys. The path is printed: a script can give
    /// it in full the next time, and a person sees what was asked.
    OperationResult completed(ProviderHost& host, OperationRequest& request) {
        OperationResult names = host.askAnyone(namesRequest(request.path));
        if (names.rc != CMPI_RC_OK) return names;
        request.path = completedPath(request.path, names.paths);
        err_ << messageLines("completed the path: " +
                             base::escapeForTerminal(toString(request.path)));
        return host.ask(request);
    }

    ExitStatus drawHost(const Schema& schema, const SchemaCatalogue& catalogue) {
        const std::string nameSpace = parseNamespace(commandLine_.nameSpace);
        std::vector<TreeNode> roots;
        const std::string failure = withHost(catalogue, [&](ProviderHost& host) -> std::string {
            const Ask ask = [&host](const OperationRequest& each) { return host.askAnyone(each); };
            try {
                roots = hostTree(ask, nameSpace, schema);
            } catch (const TreeFailure& error) {
                return error.what();
            }
            stopwatch_.lap(&Stopwatch::request);
            return {};
        });
        if (!failure.empty()) return failed(failure, exitCimStatus);
        if (commandLine_.format == Format::Json) {
            writeTreeJson(roots, out_, schema);
        } else {
            for (const TreeNode& root : roots) drawTree(root, out_, terminalOf(STDOUT_FILENO));
        }
        return written();
    }

    /// The failures that the provider recorded, where the answer is one or holds nothing; not what
    /// its message says already.
    std::string recordNotes(const OperationRequest& request, const OperationResult& answer) const {
        std::string notes;
        if (answer.rc == CMPI_RC_OK && !isEmptyAnswer(request, answer)) return notes;
        std::vector<std::string> records = failures_->texts();
        for (const std::string& message : messages_.failures()) records.push_back(message);
        // What is shown anyway need not be told again.
        if (commandLine_.log) records.clear();
        for (const std::string& record : records) {
            if (record != answer.message)
                notes += noteLine("the provider recorded: " + base::escapeForTerminal(record));
        }
        return notes;
    }

    ExitStatus failed(const std::string& complaint, ExitStatus status) {
        err_ << messageLines(complaint);
        return status;
    }

    ExitStatus written() {
        const bool done = static_cast<bool>(out_.flush());
        stopwatch_.lap(&Stopwatch::output);
        return done ? exitDone : failed("the results cannot be written", exitCimStatus);
    }

    /// Has the host do its work, and prints what it caught the provider at.
    template <class Work>
    std::invoke_result_t<Work, ProviderHost&> withHost(const SchemaCatalogue& catalogue,
                                                       Work work) {
        failures_.emplace();
        // The logging library reads its configuration when it is loaded, and again while it runs.
        std::optional<ScopedLogConfiguration> log;
        const std::string configuration = logConfiguration();
        if (!configuration.empty()) log.emplace(configuration);
        HostSetup setup;
        setup.registrations = readRegistrations(commandLine_, programFolder_);
        setup.libraryFolders = libraryFolders(programFolder_);
        setup.library = soleLibrary(commandLine_, setup.libraryFolders);
        setup.miName = commandLine_.bare ? "OperatingSystemProvider" : commandLine_.miName;
        setup.messageSink = [this](const ProviderMessage& message) { messages_.take(message); };
        ProviderHost host(std::move(setup), catalogue);
        stopwatch_.lap(&Stopwatch::load);
        auto result = work(host);
        stopwatch_.move(host.loadTime(), &Stopwatch::request, &Stopwatch::load);
        for (const std::string& error : host.takeLoadErrors()) {
            failed(base::escapeForTerminal(error), exitNotLoaded);
            notLoaded_ = true;
        }
        for (const std::string& violation : host.unload()) {
            err_ << "caught: " << base::escapeForTerminal(violation) << '\n';
            caught_ = true;
        }
        // Before the results: a reader that closes their pipe ends the program where it stands.
        failures_.reset();
        return result;
    }

    /// A configuration that the user names goes before the host's own.
    std::string logConfiguration() const {
        if (commandLine_.log) return stderrConfiguration(*commandLine_.log);
        return std::getenv("ZBLOG_CONF") == nullptr ? failures_->configuration() : std::string();
    }

    const CommandLine& commandLine_;
    const fs::path& programFolder_;
    std::ostream& out_;
    std::ostream& err_;
    Stopwatch stopwatch_;
    /// While the libraries are loaded.
    std::optional<FailureRecords> failures_;
    BrokerMessages messages_;
    /// Whether a library that a provider needed did not load, and whether anything was caught.
    bool notLoaded_ = false;
    bool caught_ = false;
};

}  // namespace

ExitStatus run(const CommandLine& commandLine, const fs::path& programFolder, std::ostream& out,
               std::ostream& err) {
    if (commandLine.command == Command::Serve)
        return becomeServer(commandLine.serverArguments, programFolder, err);
    return Run(commandLine, programFolder, out, err).exitStatus();
}

}  // namespace cmpihost
