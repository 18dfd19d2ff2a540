// Other programs change files while this process changes the same ones, or others beside them, in one go.

#include "host/sqlite/volume_indexes.h"
#include "index_fixture.h"
#include <csignal>
#include <functional>
#include <sys/wait.h>

namespace host {
namespace {

constexpr int kDirectories = 12;
constexpr int kFiles = 10;

class FollowingTest : public IndexFixture {
  protected:
    void SetUp() override {
        IndexFixture::SetUp();
        for (int directory = 0; directory < kDirectories; ++directory) {
            for (int file = 0; file < kFiles; ++file)
                make(path_of(directory, file));
            make(std::to_string(directory) + "/beside");
        }
        make("0/sentinel");
        ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
        ASSERT_TRUE(indexes().create(device_, "B", kText).ok());
        indexes().follow_changes();
        // Where the last directory's changes are heard, and nothing is walked any more, all are heard.
        ASSERT_TRUE(eventually([&] {
            tag_outside("0/sentinel", "A", "heard");
            return find(contains("A", "heard")).size() == 1;
        }));
        wait_until_quiet();
    }
    static bool eventually(const std::function<bool()>& holds) {
        for (int i = 0; i < 3000 && !holds(); ++i)
            usleep(10000);
        return holds();
    }
    void wait_until_quiet() {
        std::uint64_t before = 0;
        std::uint64_t now = observed();
        do {
            before = now;
            usleep(500000);
            now = observed();
        } while (now != before);
    }
    std::uint64_t observed() {
        return dynamic_cast<VolumeIndexes&>(indexes()).of(device_)->statistics().observed;
    }
    static std::string path_of(int directory, int file) {
        return std::to_string(directory) + "/" + std::to_string(directory) + "-" + std::to_string(file);
    }
    /// Seven values on each file, as a job writes them; `between` is called before each, with the number of
    /// the value, and with 7 at the end.
    void work(const std::function<void(int directory, int file, int value)>& between) {
        for (int directory = 0; directory < kDirectories; ++directory) {
            for (int file = 0; file < kFiles; ++file) {
                const auto node = file_system().open(ref(path_of(directory, file)), {});
                ASSERT_TRUE(node.ok());
                for (int value = 0; value < 7; ++value) {
                    between(directory, file, value);
                    const std::string name = value == 0 ? "A" : "A" + std::to_string(value);
                    ASSERT_TRUE((*node)->write_attribute(name.c_str(), kText, 0, "ours", 5).ok());
                }
                between(directory, file, 7);
            }
        }
    }
    void expect_found(const char* attribute, const std::string& value, std::size_t files) {
        EXPECT_TRUE(eventually([&] { return find(contains(attribute, value)).size() == files; }))
            << attribute << " " << value << ": " << find(contains(attribute, value)).size() << " instead of "
            << files;
    }
};

constexpr std::size_t kAll = kDirectories * kFiles;

TEST_F(FollowingTest, AnothersChangeOfTheSameFileIsFoundWheneverItComes) {
    for (const int when : {0, 1, 4, 7}) {
        const std::string value = "theirs" + std::to_string(when);
        work([&](int directory, int file, int written) {
            if (written == when)
                tag_outside(path_of(directory, file), "B", value);
        });
        expect_found("A", "ours", kAll);
        expect_found("B", value, kAll);
    }
}

TEST_F(FollowingTest, AnothersChangeOfAFileThatWasDoneBeforeIsFound) {
    work([&](int directory, int file, int written) {
        if (written == 3 && file > 0)
            tag_outside(path_of(directory, file - 1), "B", "theirs");
    });
    expect_found("B", "theirs", kAll - kDirectories);
}

TEST_F(FollowingTest, AnothersChangeOfAFileThatIsStillToBeDoneIsFound) {
    work([&](int directory, int file, int written) {
        if (written == 3 && file + 1 < kFiles)
            tag_outside(path_of(directory, file + 1), "B", "theirs");
    });
    expect_found("B", "theirs", kAll - kDirectories);
}

TEST_F(FollowingTest, AnothersChangeBesideAndBehindIsFound) {
    work([&](int directory, int file, int written) {
        if (file == 5 && written == 2)
            tag_outside(std::to_string(directory) + "/beside", "B", "beside");
        if (file == 0 && written == 2 && directory > 0)
            tag_outside(path_of(directory - 1, 9), "B", "behind");
    });
    expect_found("B", "beside", kDirectories);
    expect_found("B", "behind", kDirectories - 1);
}

TEST_F(FollowingTest, AnothersRemovalRenamingAndDeletionAreFound) {
    work([](int, int, int) {});
    expect_found("A", "ours", kAll);
    work([&](int directory, int file, int written) {
        const std::string before = root_ + "/" + path_of(directory, file == 0 ? 0 : file - 1);
        if (written != 3)
            return;
        if (file == 3) {
            ASSERT_EQ(removexattr(before.c_str(), "user.be.A"), 0);
        }
        if (file == 5)
            std::filesystem::rename(before, before + "renamed");
        if (file == 7)
            std::filesystem::remove(before);
    });
    expect_found("A", "ours", kAll - 2 * kDirectories);
    const Leaves found = find(contains("A", "ours"));
    EXPECT_EQ(std::count_if(found.begin(), found.end(),
                            [](const std::string& leaf) { return leaf.ends_with("-4renamed"); }),
              kDirectories);
}

TEST_F(FollowingTest, AnotherProcessGoesThroughTheSameFilesMeanwhile) {
    std::vector<std::string> paths;
    for (int directory = 0; directory < kDirectories; ++directory) {
        for (int file = 0; file < kFiles; ++file)
            paths.push_back(root_ + "/" + path_of(directory, file));
    }
    int round = 0;
    for (const bool backwards : {false, true, false, true}) {
        const char digit = static_cast<char>('0' + round++);
        const pid_t child = fork();
        if (child == 0) {
            // Nothing but system calls: this process had threads.
            const char value[] = {'C', 'S', 'T', 'R', 'r', 'o', 'u', 'n', 'd', digit, 0};
            int failed = 0;
            for (std::size_t i = 0; i < paths.size(); ++i) {
                const std::string& path = paths[backwards ? paths.size() - 1 - i : i];
                failed |= setxattr(path.c_str(), "user.be.B", value, sizeof value, 0);
                usleep(100);
            }
            _exit(failed == 0 ? 0 : 1);
        }
        ASSERT_GT(child, 0);
        int status = -1;
        do {
            work([](int, int, int) {});
        } while (waitpid(child, &status, WNOHANG) == 0);
        EXPECT_EQ(status, 0);
        expect_found("B", std::string("round") + digit, kAll);
    }
}

} // namespace
} // namespace host
