// Starting programs: what they inherit, how they end.
#include "host/api/processes.h"
#include "host/api/threads.h"
#include "support/temporary_environment.h"

#include <atomic>
#include <csignal>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <memory>
#include <unistd.h>

namespace {

constexpr std::int64_t second = 1'000'000'000;

// Starts it and waits for its end; -1 when that does not come.
int status_of(const host::ProcessStart& start) {
    const auto ended = std::make_shared<std::atomic<int>>(-1);
    const auto process = host::start_process(start, [ended](int status) { *ended = status; });
    EXPECT_TRUE(process.ok());
    for (const std::int64_t end = host::uptime_nanoseconds() + 20 * second;
         *ended < 0 && host::uptime_nanoseconds() < end;)
        host::sleep_until(host::uptime_nanoseconds() + second / 100);
    // Collected, so no zombie has its number any more.
    EXPECT_NE(kill(*process, 0), 0);
    return *ended;
}

class ProcessesTest : public testing::Test {
  protected:
    host::ProcessStart shell(const std::string& script) {
        host::ProcessStart start;
        start.executable = "/bin/sh";
        start.arguments = {"-c", script, "sh", environment_.root() + "/out"};
        return start;
    }
    std::string out() const { return test::read_file(environment_.root() + "/out"); }

    test::TemporaryEnvironment environment_;
};

} // namespace

TEST_F(ProcessesTest, TheEndIsReportedWithItsStatus) {
    EXPECT_EQ(status_of(shell("exit 7")), 7);
    EXPECT_EQ(status_of(shell("kill -9 $$")), 128 + 9);
    EXPECT_EQ(status_of(shell("true")), 0);
}

TEST_F(ProcessesTest, NoDescriptorIsInherited) {
    const int leaked = open("/dev/null", O_RDONLY);
    ASSERT_GE(leaked, 3);
    EXPECT_EQ(status_of(shell("test -e /proc/self/fd/" + std::to_string(leaked) + " || echo none > \"$1\"")),
              0);
    close(leaked);
    EXPECT_EQ(out(), "none\n");
}

TEST_F(ProcessesTest, ArgumentsArriveByteForByte) {
    host::ProcessStart start = shell("printf '%s|' \"$2\" \"$3\" > \"$1\"");
    start.arguments.insert(start.arguments.end(), {"-a 'b' \"c\"\n$(d)", "caf\xe9"});
    EXPECT_EQ(status_of(start), 0);
    EXPECT_EQ(out(), "-a 'b' \"c\"\n$(d)|caf\xe9|");
}

TEST_F(ProcessesTest, VariablesAreAddedAndThoseOfTheLaunchAreNotPassedOn) {
    environment_.set("BEKITS_LAUNCH", "1:2:3");
    environment_.set("XDG_ACTIVATION_TOKEN", "token");
    environment_.set("KEPT", "kept");
    host::ProcessStart start = shell("echo \"$BEKITS_LAUNCH,$XDG_ACTIVATION_TOKEN,$KEPT,$ADDED\" > \"$1\"");
    start.variables = {{"ADDED", "added"}};
    EXPECT_EQ(status_of(start), 0);
    EXPECT_EQ(out(), ",,kept,added\n");
}

TEST_F(ProcessesTest, SignalsAreAsAtTheStartOfAnyProgram) {
    sigset_t blocked;
    sigset_t before;
    sigemptyset(&blocked);
    sigaddset(&blocked, SIGTERM);
    pthread_sigmask(SIG_BLOCK, &blocked, &before);
    signal(SIGTERM, SIG_IGN);
    EXPECT_EQ(status_of(shell("kill -TERM $$; exit 3")), 128 + SIGTERM);
    signal(SIGTERM, SIG_DFL);
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

TEST_F(ProcessesTest, WhatCannotBeStartedSaysWhy) {
    host::ProcessStart start;
    start.executable = environment_.root() + "/nothing";
    EXPECT_EQ(host::start_process(start, {}).error(), ENOENT);
    test::write_file(environment_.root() + "/plain", "");
    start.executable = environment_.root() + "/plain";
    EXPECT_EQ(host::start_process(start, {}).error(), EACCES);
}
