// A configuration file on a disk that fails.
#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>
#include <sys/syscall.h>

#include <array>
#include <cerrno>
#include <cstddef>

#include "framework/logging/ConfigurationFile.h"
#include "tests/logging/LoggingSupport.h"

namespace {

/// Lets every read at a place fail from now on, for good; false if that cannot be set up.
bool failReads() {
    std::array<sock_filter, 4> program{{
        BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
        BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, SYS_pread64, 0, 1),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | EIO),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW),
    }};
    const sock_fprog filter{static_cast<unsigned short>(program.size()), program.data()};
    return ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0 &&
           ::prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) == 0;
}

TEST(ReadError, OfAConfigurationFileIsTold) {
    const logging_test::TemporaryFolder folder;
    logging_test::writeFile(folder / "zblog.conf", "log.level = 1\n");
    const int status = logging_test::inChildProcess([&] {
        if (!failReads()) return 1;
        logging_test::FakeEnvironment environment;
        ZBLog::ConfigurationFile file({folder / "zblog.conf", false}, environment);
        const auto news = file.readIfChanged();
        if (!news || news->errors.size() != 1) return 2;
        return news->errors[0].message == "cannot be read: Input/output error" ? 0 : 3;
    });
    EXPECT_EQ(status, 0);
}

}  // namespace
