#ifndef TESTS_FAULTS_FAULT_FIXTURE_H
#define TESTS_FAULTS_FAULT_FIXTURE_H

#include <string>
#include <utility>
#include <vector>

#include "faults/CountUp.h"
#include "library/LibraryFixture.h"
#include "support/Requests.h"

/// The requests of a handler of the provider that serves, or of the facade, on the fixture's host;
/// and the handlers.
std::vector<NamedRequest> requestsOf(const std::string& handler);
std::vector<std::string> servingHandlers();
std::vector<std::string> facadeHandlers();

/// A broker that keeps no shells of ended objects, which are blocks of memory too.
inline const cmpihost::BrokerOptions withoutQuarantine = {cmpihost::BrokerOptions::Shape::Complete,
                                                          0};

/// What a request left behind.
struct Answer {
    cmpihost::Outcome outcome;
    std::vector<recording::Record> records;
    std::vector<std::string> elements;  ///< paths and instances in full, in order
    std::vector<std::string> messages;  ///< texts of the message records in the log
};

/// How a request ended: with an answer, or with an exception that left the handler. Then the
/// records are all that there is of the answer.
struct Attempt {
    enum End { Answered, Standard, Foreign } end = Answered;
    Answer answer;
};

/// The built provider on a host of two nodes, one with every property and one with a name, under a
/// broker with two computer systems.
class FaultFixture : public LibraryFixture {
  protected:
    explicit FaultFixture(cmpihost::BrokerOptions options = {});

    ~FaultFixture() override;

    /// Lets a foreign type leave a request that writes records without end. On from the start; a
    /// test that sets a hook of its own for the records turns it on again.
    void limitRecords();

    /// Forgets the records so far and runs the request; exceptions of the library pass through.
    Answer answerTo(const NamedRequest& asked);

    /// The same, with the exceptions of the library caught. Forgets what the broker caught.
    Attempt attempt(const NamedRequest& asked);

    /// Checks what holds for each request that was served, whatever failed on the way: every record
    /// stands in both channels, the handler's markers are around all others, and either there is
    /// one message and no returnDone, or no message and one returnDone.
    static void expectSound(const NamedRequest& asked, const Answer& answer);

    /// Checks that the answer is the reference: status, elements, and every record.
    static void expectSame(const Answer& reference, const Answer& answer);

    /// The library that answers: the provider, unless a test names another.
    const cmpihost::ProviderLibrary* answering = &library;

  private:
    std::size_t recordsLeft = 0;
};

/// Runs a test once for each request of the handler that is its parameter.
class FaultsOfHandler : public FaultFixture, public testing::WithParamInterface<std::string> {
  protected:
    using FaultFixture::FaultFixture;

    /// Calls `body` for each of the requests, with its reference at hand;
    /// at the end the request is to be answered again as if nothing had happened.
    template <class Body>
    void forEachRequest(Body body) {
        for (const NamedRequest& each : requestsOf(GetParam())) {
            SCOPED_TRACE(each.name);
            asked = each;
            reference = answerTo(asked);
            referenceViolations = broker.takeViolations();
            body();
            expectSame(reference, answerTo(asked));
            EXPECT_EQ(broker.takeViolations(), referenceViolations);
            if (HasFatalFailure()) return;
        }
    }

    NamedRequest asked;
    Answer reference;
    std::vector<std::string> referenceViolations;
};

/// The handler's name as it stands in the name of a test.
std::string nameOf(const testing::TestParamInfo<std::string>& info);

/// The rendered records, one string.
std::string recordsOf(const Answer& answer);

/// True when `part` is `whole` with some of its elements left out.
bool isSubsequence(const std::vector<std::string>& part, const std::vector<std::string>& whole);
bool isPrefix(const std::vector<std::string>& part, const std::vector<std::string>& whole);

#endif
