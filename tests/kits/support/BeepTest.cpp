#include <Beep.h>

#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

// Standard error leads to another file for as long as this lives.
class RedirectedStandardError {
  public:
    explicit RedirectedStandardError(int target) : mKept(dup(STDERR_FILENO)) {
        std::fflush(stderr);
        dup2(target, STDERR_FILENO);
    }
    ~RedirectedStandardError() {
        std::fflush(stderr);
        dup2(mKept, STDERR_FILENO);
        close(mKept);
    }

  private:
    const int mKept;
};

} // namespace

TEST(BeepTest, RingsTheTerminal) {
    const int controller = posix_openpt(O_RDWR | O_NOCTTY);
    ASSERT_GE(controller, 0);
    ASSERT_EQ(grantpt(controller), 0);
    ASSERT_EQ(unlockpt(controller), 0);
    const int terminal = open(ptsname(controller), O_RDWR | O_NOCTTY);
    ASSERT_GE(terminal, 0);
    {
        const RedirectedStandardError redirected(terminal);
        EXPECT_EQ(beep(), B_OK);
    }
    char byte = 0;
    EXPECT_EQ(read(controller, &byte, 1), 1);
    EXPECT_EQ(byte, '\a');
    close(terminal);
    close(controller);
}

TEST(BeepTest, SaysWhenThereIsNothingToRing) {
    const int nowhere = open("/dev/null", O_WRONLY);
    ASSERT_GE(nowhere, 0);
    {
        const RedirectedStandardError redirected(nowhere);
        EXPECT_EQ(beep(), B_ERROR);
    }
    close(nowhere);
}
