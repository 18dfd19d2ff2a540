#include "index_fixture.h"
#include <csignal>
#include <fcntl.h>
#include <sys/wait.h>

namespace host {
namespace {

constexpr const char* kChildMark = "QUIRNEL_PROCESSES_CHILD";

class ProcessesTest : public IndexFixture {};

/// The other process; started by the tests below. Tags "one", says so through a file, and waits to be killed,
/// so that only its queue can tell of the change.
TEST(ProcessesChild, TagsAndWaits) {
    if (std::getenv(kChildMark) == nullptr)
        GTEST_SKIP() << "runs as a child only";
    const DeviceId device = volumes().list().front();
    const std::string root = volumes().info(device)->root;
    for (int i = 0; i < 1000; ++i) {
        const auto entry = file_system().entry_of(root + "/" + std::to_string(i), Follow::no);
        ASSERT_TRUE(entry.ok());
        const auto node = file_system().open(*entry, {});
        ASSERT_TRUE(node.ok());
        ASSERT_TRUE((*node)->write_attribute("A", kText, 0, "x", 2).ok());
    }
    close(open((root + "/../tagged").c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0600));
    pause();
}

TEST_F(ProcessesTest, QuerySeesWhatAnotherProcessChangedBefore) {
    for (int i = 0; i < 1000; ++i)
        make(std::to_string(i));
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    EXPECT_EQ(find(contains("A", "x")), Leaves{});
    setenv(kChildMark, "1", 1);
    const pid_t child = fork();
    if (child == 0) {
        execl("/proc/self/exe", "test_host_sqlite", "--gtest_filter=ProcessesChild.*", nullptr);
        _exit(127);
    }
    unsetenv(kChildMark);
    ASSERT_GT(child, 0);
    for (int i = 0; i < 30000 && !std::filesystem::exists(base_ + "/tagged"); ++i)
        usleep(1000);
    ASSERT_TRUE(std::filesystem::exists(base_ + "/tagged"));
    EXPECT_EQ(find(contains("A", "x")).size(), 1000U);
    EXPECT_EQ(find(contains("A", "x")).size(), 1000U);
    kill(child, SIGKILL);
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_EQ(find(contains("A", "x")).size(), 1000U);
}

TEST_F(ProcessesTest, DatabaseIsReadableByItsUserAlone) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    using std::filesystem::perms;
    EXPECT_EQ(std::filesystem::status(database()).permissions(), perms::owner_read | perms::owner_write);
    EXPECT_EQ(std::filesystem::status(std::filesystem::path(database()).parent_path()).permissions(),
              perms::owner_all);
}

} // namespace
} // namespace host
