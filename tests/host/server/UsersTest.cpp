#include "host/server/Users.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <stdexcept>

#include "base/FileDescriptor.h"
#include "support/TemporaryDirectory.h"

namespace {

using namespace cmpihost::server;
using testing::HasSubstr;

constexpr const char* joe =
    "joe:$5$rounds=1000$saltsalt$eKLZU9t9OoPWrqOQsoTIKG0aYkZ5rGOoOQhiIvoSWX2\n";
constexpr const char* ann =
    "ann:$6$rounds=1000$saltsalt$kF2jhmjjaYMFwyvHjGPaaYIXzg6he1ejETHRovgPV.NWWVvadW85."
    "fyrVpYCuxrzvLPelwDHs8BD4NdLZSR1E0\n";

class UsersFile : public testing::Test {
  protected:
    UsersFile() { write(std::string("# who may ask\n\n") + joe + ann); }

    void write(const std::string& text, mode_t mode = 0640) {
        directory_.write("users", text);
        chmod(file_.c_str(), mode);
    }
    Users users() {
        return {file_, log_, {std::chrono::milliseconds(1), std::chrono::milliseconds(4)}};
    }
    std::string complaint() {
        try {
            users();
            return "none";
        } catch (const std::runtime_error& error) {
            std::string text = error.what();
            return text.replace(text.find(file_), file_.size(), "FILE");
        }
    }
    /// What was logged so far.
    std::string logged() {
        std::string text(4096, '\0');
        const ssize_t count = pread(logFile_.number(), text.data(), text.size(), 0);
        return text.substr(0, static_cast<std::size_t>(count));
    }

    const TemporaryDirectory directory_;
    const std::string file_ = directory_.path("users");
    const base::FileDescriptor logFile_ =
        base::FileDescriptor::open(directory_.path("log").c_str(), O_CREAT | O_RDWR, 0600);
    Log log_{logFile_.number(), LogLevel::None, false};
};

HttpRequest request(const std::vector<std::string>& authorizations) {
    HttpRequest result;
    result.peer = "192.0.2.7";
    for (const std::string& value : authorizations)
        result.headers.emplace_back("authorization", value);
    return result;
}

TEST_F(UsersFile, LetsInWhoKnowsThePassword) {
    Users access = users();
    for (int time = 0; time < 2; ++time) {
        const auto verdict = access.judge(request({"Basic am9lOnNlY3JldA=="}));
        EXPECT_TRUE(verdict.allowed);
        EXPECT_EQ(verdict.user, "joe");
    }
    // The password holds a colon, the word Basic has another case, and there is a blank too many.
    EXPECT_EQ(access.judge(request({"bASIC  YW5uOnBhc3M6d29yZA=="})).user, "ann");
    EXPECT_EQ(logged(), "");
}

TEST_F(UsersFile, RefusesEverythingElse) {
    Users access = users();
    const std::vector<std::string> rows[] = {
        {""},
        {"Basic"},
        {"Basic "},
        {"am9lOnNlY3JldA=="},
        {"Digest am9lOnNlY3JldA=="},
        {"Basic am9lOnNlY3JldA=="  // the same twice
         ,
         "Basic am9lOnNlY3JldA=="},
        {"Basic am9lOnNlY3JldA==", ""},
        {"Basic am9lOnNlY3JldA"},     // no padding
        {"Basic am9lOnNlY3JldB=="},   // bits that stand for nothing
        {"Basic am9lOnNlY3JldA== "},  // something behind it
        {"Basic am9l=nNlY3JldA=="},   // padding inside
        {"Basic ===="},
        {"Basic am9l"},              // joe
        {"Basic OnNlY3JldA=="},      // :secret
        {"Basic am9lOg=="},          // joe:
        {"Basic am9lOndyb25n"},      // joe:wrong
        {"Basic am9lOnNlY3JldCE="},  // joe:secret!
        {"Basic Ym9iOnNlY3JldA=="},  // bob:secret
        {"Basic am9lOnNlYwpyZXQ="},  // joe:sec\nret
        {"Basic " + std::string(508, 'A')},
    };
    for (const std::vector<std::string>& values : rows) {
        const auto verdict = access.judge(request(values));
        EXPECT_FALSE(verdict.allowed) << values.front();
        EXPECT_FALSE(verdict.user) << values.front();
    }
    EXPECT_FALSE(access.judge(request({})).allowed);
}

TEST_F(UsersFile, LogsAFailureWithTheAddressAndNoPassword) {
    Users access = users();
    access.judge(request({}));
    EXPECT_EQ(logged(), "") << "a client that waits to be asked is no failure";
    access.judge(request({"Basic am9lOndyb25n"}));
    access.judge(request({"Basic eAk6Cg=="}));
    EXPECT_EQ(logged(),
              "cmpihost-serve: 192.0.2.7: refused: wrong name or password of 'joe'\n"
              "cmpihost-serve: 192.0.2.7: refused: credentials that are none\n");
}

TEST_F(UsersFile, HasWhoFailsWaitTheLongerTheMoreOftenButNotForEver) {
    Users access(file_, log_, {std::chrono::milliseconds(20), std::chrono::milliseconds(40)});
    const auto waits = [&](const char* peer) {
        HttpRequest wrong = request({"Basic !"});
        wrong.peer = peer;
        return access.judge(wrong).delay.count();
    };
    EXPECT_EQ(waits("192.0.2.7"), 20);
    for (int time = 0; time < 3; ++time) EXPECT_EQ(waits("192.0.2.7"), 40);
    EXPECT_EQ(waits("192.0.2.8"), 20) << "another address begins anew";
    EXPECT_EQ(access.judge(request({})).delay.count(), 0);
    EXPECT_EQ(access.judge(request({"Basic am9lOnNlY3JldA=="})).delay.count(), 0);
}

TEST_F(UsersFile, IsReadAgainAndForgetsWhoIsGone) {
    Users access = users();
    const HttpRequest asking = request({"Basic am9lOnNlY3JldA=="});
    EXPECT_TRUE(access.judge(asking).allowed);
    write(ann);
    EXPECT_TRUE(access.judge(asking).allowed);
    access.reload();
    EXPECT_FALSE(access.judge(asking).allowed) << "remembered, but gone";
    write("nonsense\n");
    EXPECT_THROW(access.reload(), std::runtime_error);
    EXPECT_TRUE(access.judge(request({"Basic YW5uOnBhc3M6d29yZA=="})).allowed) << "kept";
}

TEST_F(UsersFile, IsRefusedWhereItIsWrong) {
    const char* const noHash =
        "FILE:1: no hash stands behind the colon, as 'openssl passwd -6' prints it, without blanks";
    const struct {
        std::string text;
        const char* complaint;
    } rows[] = {
        {"", "FILE: holds no users"},
        {"# nobody\n", "FILE: holds no users"},
        {"joe\n", "FILE:1: expected name:hash"},
        {"\n:$6$x$y\n", "FILE:2: expected name:hash"},
        {"joe:secret\n", noHash},
        {"joe:\n", noHash},
        {"joe:*\n", noHash},
        {"joe:$6$salt$with blank\n", noHash},
        {"joe:$6$salt$hash\r\n", noHash},
        {"joe:$nonsense$salt$hash\n",
         "FILE:1: the hash is of a kind that this system does not know, or is cut off"},
        {"joe:$5$rounds=1000$saltsalt$eKLZ\n",
         "FILE:1: the hash is of a kind that this system does not know, or is cut off"},
        {std::string(joe) + joe, "FILE:2: the name stands in an earlier line, too"},
        {std::string(1024 * 1024 + 1, '#'), "FILE: larger than 1 MiB"},
    };
    for (const auto& row : rows) {
        write(row.text);
        EXPECT_EQ(complaint(), row.complaint);
    }
    write(joe, 0644);
    EXPECT_EQ(complaint(), "FILE: everybody may use this file; chmod o= takes that away");
    unlink(file_.c_str());
    EXPECT_EQ(complaint(), "FILE: No such file or directory");
    mkdir(file_.c_str(), 0700);
    EXPECT_EQ(complaint(), "FILE: is no regular file");
}

TEST_F(UsersFile, CostsAStrangerTheTimeOfAWrongPassword) {
    write("joe:$6$rounds=40000$saltsalt$" + std::string(86, 'x') + "\n");
    Users access = users();
    const auto time = [&](const char* credentials) {
        const auto begin = Users::Clock::now();
        access.judge(request({credentials}));
        return Users::Clock::now() - begin;
    };
    const auto wrong = time("Basic am9lOndyb25n");
    const auto stranger = time("Basic Ym9iOnNlY3JldA==");
    // Some 20 ms each; without the hash it would be none.
    EXPECT_GT(stranger * 4, wrong);
    EXPECT_GT(wrong * 4, stranger);
}

}  // namespace
