// What all faults have in common: the host that they meet, the count that goes up, and what holds
// for a request whatever failed on its way.
#include "faults/FaultFixture.h"

#include <algorithm>
#include <map>

using namespace cmpihost;
using recording::Record;

namespace {

// Properties have no order: brokers keep them as they come.
std::string fullText(const InstanceValue& instance) {
    std::vector<std::string> properties;
    for (const auto& property : instance.properties)
        properties.push_back(property.name + "=" + property.value.toText() + ";");
    std::sort(properties.begin(), properties.end());
    std::string text = toString(instance.path);
    for (const std::string& property : properties) text += property;
    return text;
}

bool startsWith(const std::string& text, const std::string& start) {
    return text.compare(0, start.size(), start) == 0;
}

const std::string banner(78, '=');

constexpr std::size_t mostRecords = 10000;  ///< no request writes so many

struct EndlessRequest {};

void expectRecord(const Record& record, const std::string& marker, const std::string& text) {
    EXPECT_EQ(record.function, marker);
    EXPECT_TRUE(startsWith(record.text, text)) << record.text;
}

// Each method that says that it begins says that it ends, but for those of the capabilities'
// association, which leave on their early ways without a word.
void expectBalanced(const std::vector<Record>& records) {
    std::map<std::string, int> open;
    for (const Record& record : records) {
        if (record.file == "CMPIElementCapabilities.cpp" || record.file == "include/Trace.h")
            continue;
        const std::string place = record.file + ' ' + record.function;
        if (startsWith(record.text, "ENTERING: ")) ++open[place];
        if (startsWith(record.text, "EXITING: ")) --open[place];
    }
    for (const auto& [place, count] : open) EXPECT_EQ(count, 0) << place;
}

const HostNames names = {"host1", "Linux", "other"};

}  // namespace

std::vector<NamedRequest> requestsOf(const std::string& handler) {
    std::vector<NamedRequest> found;
    for (const auto& rows : {servedRequests(names), facadeRequests(names)})
        for (const NamedRequest& row : rows)
            if (row.handler == handler) found.push_back(row);
    return found;
}

std::vector<std::string> servingHandlers() {
    return handlersOf(servedRequests(names));
}

std::vector<std::string> facadeHandlers() {
    return handlersOf(facadeRequests(names));
}

FaultFixture::FaultFixture(BrokerOptions options) : LibraryFixture(options) {
    VA::SimulatedHost::Node bare;
    bare.properties[VA::NodeLexicon::Name] = std::string("other");
    host->addNode(bare);
    computers.setNames({"host1", "host2"});
    limitRecords();
}

FaultFixture::~FaultFixture() {
    recording::setHook({});
}

void FaultFixture::limitRecords() {
    recording::setHook([this](const Record&) {
        if (recordsLeft == 0) throw EndlessRequest();
        --recordsLeft;
    });
}

Answer FaultFixture::answerTo(const NamedRequest& asked) {
    recording::clear();
    recordsLeft = mostRecords;
    Answer answer;
    answer.outcome = cmpihost::invoke(*answering, broker, asked.request);
    answer.records = recording::take();
    for (const ObjectPathValue& path : answer.outcome.paths)
        answer.elements.push_back(toString(path));
    for (const InstanceValue& instance : answer.outcome.instances)
        answer.elements.push_back(fullText(instance));
    for (const Record& record : answer.records)
        if (record.channel == "log" && startsWith(record.text, "MESSAGE "))
            answer.messages.push_back(record.text.substr(record.text.find("]: ") + 3));
    return answer;
}

Attempt FaultFixture::attempt(const NamedRequest& asked) {
    Attempt attempt;
    try {
        attempt.answer = answerTo(asked);
    } catch (const std::exception&) {
        attempt.end = Attempt::Standard;
    } catch (...) {
        attempt.end = Attempt::Foreign;
    }
    if (attempt.end != Attempt::Answered) attempt.answer.records = recording::take();
    broker.takeViolations();
    return attempt;
}

void FaultFixture::expectSound(const NamedRequest& asked, const Answer& answer) {
    const std::vector<Record>& records = answer.records;
    ASSERT_GE(records.size(), 10U);
    ASSERT_EQ(records.size() % 2, 0U);
    for (std::size_t index = 0; index < records.size(); index += 2) {
        EXPECT_EQ(records[index].channel, "log");
        EXPECT_EQ(records[index + 1].channel, "trace");
        EXPECT_TRUE(sameArguments(records[index], records[index + 1])) << records[index].text;
    }
    expectRecord(records[0], "markProviderEntry", banner);
    expectRecord(records[2], "markProviderEntry", "ENTERING: " + asked.handler + "() in ");
    expectRecord(records[records.size() - 4], "markProviderExit",
                 "EXITING: " + asked.handler + "() in ");
    expectRecord(records[records.size() - 2], "markProviderExit", banner);

    EXPECT_FALSE(answer.outcome.message.has_value());
    if (answer.outcome.rc == CMPI_RC_ERR_INVALID_CLASS) {
        EXPECT_TRUE(answer.messages.empty());
        EXPECT_TRUE(answer.elements.empty());
        EXPECT_EQ(answer.outcome.doneCount, 0U);
        return;
    }
    EXPECT_EQ(answer.outcome.rc, CMPI_RC_OK);
    EXPECT_LE(answer.messages.size(), 1U);
    if (answer.messages.empty()) expectBalanced(records);
}

void FaultFixture::expectSame(const Answer& reference, const Answer& answer) {
    EXPECT_EQ(answer.outcome.rc, reference.outcome.rc);
    EXPECT_EQ(answer.outcome.doneCount, reference.outcome.doneCount);
    EXPECT_EQ(answer.elements, reference.elements);
    EXPECT_EQ(recordsOf(answer), recordsOf(reference));
}

std::string nameOf(const testing::TestParamInfo<std::string>& info) {
    return info.param.substr(info.param.find('_') + 1);
}

std::string recordsOf(const Answer& answer) {
    return recording::rendered(answer.records);
}

bool isSubsequence(const std::vector<std::string>& part, const std::vector<std::string>& whole) {
    auto from = whole.begin();
    for (const std::string& element : part) {
        from = std::find(from, whole.end(), element);
        if (from == whole.end()) return false;
        ++from;
    }
    return true;
}

bool isPrefix(const std::vector<std::string>& part, const std::vector<std::string>& whole) {
    return part.size() <= whole.size() && std::equal(part.begin(), part.end(), whole.begin());
}
