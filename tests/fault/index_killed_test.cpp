// A program that tags and strips files is killed at random moments. Its index must open again, and agree with
// the files once it has been reconciled.

#include "../host/sqlite/index_fixture.h"
#include "tests/support/random_seed.h"
#include <csignal>
#include <random>
#include <sys/wait.h>

namespace host {
namespace {

constexpr int kFiles = 60;
constexpr const char* kChildMark = "QUIRNEL_INDEX_CHILD";

class IndexKilledTest : public IndexFixture {};

/// The killed program; started by the test below.
TEST(IndexKilledChild, TagsAndStripsUntilKilled) {
    if (std::getenv(kChildMark) == nullptr)
        GTEST_SKIP() << "runs as a child only";
    const DeviceId device = volumes().list().front();
    const std::string root = volumes().info(device)->root;
    std::mt19937_64 random(std::random_device{}());
    while (true) {
        const std::string path =
            root + "/d" + std::to_string(random() % 5) + "/" + std::to_string(random() % kFiles);
        const auto entry = file_system().entry_of(path, Follow::no);
        if (!entry)
            continue;
        const auto node = file_system().open(*entry, {});
        if (!node)
            continue;
        const std::string value = "v" + std::to_string(random() % 3);
        if (random() % 3 == 0)
            (void)(*node)->remove_attribute("A");
        else
            (void)(*node)->write_attribute("A", kText, 0, value.c_str(), value.size() + 1);
        if (random() % 200 == 0)
            (void)indexes().flush(device);
    }
}

TEST_F(IndexKilledTest, IndexAgreesWithTheFilesAfterReconciling) {
    std::mt19937_64 random(RandomSeed());
    for (int directory = 0; directory < 5; ++directory) {
        for (int i = 0; i < kFiles; ++i)
            make("d" + std::to_string(directory) + "/" + std::to_string(i));
    }
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    EXPECT_EQ(find(contains("A", "")), Leaves{});
    indexes().shut_down();
    setenv(kChildMark, "1", 1);
    for (int round = 0; round < QUIRNEL_KILLS; ++round) {
        const pid_t child = fork();
        if (child == 0) {
            execl("/proc/self/exe", "test_index_killed", "--gtest_filter=IndexKilledChild.*", nullptr);
            _exit(127);
        }
        ASSERT_GT(child, 0);
        usleep(static_cast<useconds_t>(50000 + random() % 300000));
        kill(child, SIGKILL);
        int status = 0;
        waitpid(child, &status, 0);
        ASSERT_TRUE(WIFSIGNALED(status)) << "the child ended by itself: " << status;
        ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::thorough, nullptr).ok());
        for (const char* value : {"v0", "v1", "v2", ""}) {
            const Leaves found = find(contains("A", value));
            Leaves truth;
            for (int directory = 0; directory < 5; ++directory) {
                for (int i = 0; i < kFiles; ++i) {
                    const std::string path =
                        root_ + "/d" + std::to_string(directory) + "/" + std::to_string(i);
                    char bytes[64] = {};
                    const ssize_t size = getxattr(path.c_str(), "user.be.A", bytes, sizeof bytes - 1);
                    if (size >= 4 && std::string(bytes + 4).find(value) != std::string::npos)
                        truth.push_back(std::to_string(i));
                }
            }
            std::sort(truth.begin(), truth.end());
            ASSERT_EQ(found, truth) << "round " << round << ", " << value;
        }
        indexes().shut_down();
    }
    unsetenv(kChildMark);
}

} // namespace
} // namespace host
