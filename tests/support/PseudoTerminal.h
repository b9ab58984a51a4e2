#ifndef TESTS_SUPPORT_PSEUDO_TERMINAL_H
#define TESTS_SUPPORT_PSEUDO_TERMINAL_H

#include <fcntl.h>
#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <string>

#include "base/FileDescriptor.h"

/// A terminal without a screen. What is written to it stays in the kernel until it is read, some
/// thousand characters at most.
class PseudoTerminal {
  public:
    PseudoTerminal() : screen_(posix_openpt(O_RDWR | O_NOCTTY)) {
        EXPECT_EQ(grantpt(screen_.number()), 0);
        EXPECT_EQ(unlockpt(screen_.number()), 0);
        char name[64] = "";
        EXPECT_EQ(ptsname_r(screen_.number(), name, sizeof name), 0);
        name_ = name;
        terminal_ = base::FileDescriptor::open(name, O_RDWR);
        EXPECT_TRUE(terminal_.isOpen());
    }

    /// The terminal, as a program has it.
    int number() const { return terminal_.number(); }
    const std::string& name() const { return name_; }

    void setColumns(unsigned short columns) const {
        winsize size{};
        size.ws_col = columns;
        EXPECT_EQ(ioctl(terminal_.number(), TIOCSWINSZ, &size), 0);
    }

    /// What was written since the last call; a line ends with \r\n. Something must have been.
    std::string read() const {
        std::string text(16384, '\0');
        const ssize_t count = ::read(screen_.number(), text.data(), text.size());
        EXPECT_GT(count, 0);
        text.resize(count > 0 ? static_cast<std::size_t>(count) : 0);
        return text;
    }

  private:
    base::FileDescriptor screen_;
    base::FileDescriptor terminal_;
    std::string name_;
};

#endif
