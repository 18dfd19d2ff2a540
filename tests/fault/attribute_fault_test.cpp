#include "fault/failing_system_calls.h"
#include "support/attribute_file.h"
#include "support/loop_volume.h"
#include <filesystem>
#include <gtest/gtest.h>

namespace {

using test::FailingSystemCalls;
using test::noise;
using test::OpenFile;

struct Fault {
    int error;
    FailingSystemCalls::Lasting lasting;
};

class AttributeFault : public testing::TestWithParam<Fault> {
  protected:
    /// Files in a directory and below whose names are no blob's.
    static int stray_files(const std::string& directory) {
        int count = 0;
        std::error_code error;
        for (const auto& entry : std::filesystem::recursive_directory_iterator(directory, error)) {
            const std::string leaf = entry.path().filename().string();
            count += leaf.starts_with(".new-") ? 1 : 0;
        }
        return count;
    }

    test::TemporaryEnvironment environment_;
};

struct Change {
    const char* description;
    std::string before; ///< "" for an attribute that is not there
    std::string after;
};

std::vector<Change> changes() {
    return {{"plain to plain", "old", "new value"},
            {"nothing to spilled", "", noise(70'000, 1)},
            {"plain to spilled", "old", noise(70'000, 2)},
            {"spilled to spilled", noise(70'000, 3), noise(90'000, 4)},
            {"spilled to plain", noise(70'000, 5), "new value"}};
}

TEST_P(AttributeFault, LeavesTheOldValueOrTheNewOneWhicheverCallFails) {
    for (const Change& change : changes()) {
        bool reached = true;
        for (int nth = 0; reached; ++nth) {
            SCOPED_TRACE(std::string(change.description) + ", call " + std::to_string(nth));
            test::remove_tree(environment_.volume() + "/.be-attributes");
            std::filesystem::remove(environment_.volume() + "/file");
            const OpenFile file(environment_.volume() + "/file");
            if (!change.before.empty()) {
                ASSERT_TRUE(file.write("value", change.before).ok());
            }

            FailingSystemCalls failing(nth, GetParam().error, GetParam().lasting);
            host::Status status;
            {
                const host::ScopedSystemCalls scope(failing);
                status = file.write("value", change.after);
            }
            reached = !failing.failed_call().empty();
            const std::string missing = "<errno 2>";
            const std::string expected =
                status.ok() ? change.after : (change.before.empty() ? missing : change.before);
            EXPECT_EQ(file.read("value"), expected) << failing.failed_call();
            EXPECT_TRUE(status.ok() || status.error() == GetParam().error) << status.error();
            EXPECT_EQ(stray_files(environment_.root()), 0) << failing.failed_call();
            EXPECT_TRUE(file.write("value", change.after).ok()) << "once the fault is over";
            EXPECT_EQ(file.read("value"), change.after);
        }
    }
}

TEST_P(AttributeFault, ReportsTheFailureOfEachCallThatMatters) {
    // Only setting the blob directory's mode may fail unnoticed.
    std::vector<std::string> unnoticed;
    std::vector<std::string> noticed;
    for (int nth = 0;; ++nth) {
        test::remove_tree(environment_.volume() + "/.be-attributes");
        const OpenFile file(environment_.volume() + "/file" + std::to_string(nth));
        FailingSystemCalls failing(nth, GetParam().error, FailingSystemCalls::Lasting::once);
        const host::ScopedSystemCalls scope(failing);
        const bool ok = file.write("value", noise(70'000, 1)).ok();
        if (failing.failed_call().empty())
            break;
        (ok ? unnoticed : noticed).push_back(failing.failed_call());
    }
    // The first marker that finds no room is answered by a look for another value to spill; there is none.
    EXPECT_EQ(unnoticed, (std::vector<std::string>{"fchmod"}));
    EXPECT_EQ(noticed, (std::vector<std::string>{"mkdirat", "openat", "write", "fchmod", "fsync", "renameat2",
                                                 "fsync", "fsetxattr"}));
}

TEST_P(AttributeFault, RenamingLeavesTheAttributeUnderOneNameAtLeast) {
    for (int nth = 0; nth < 2; ++nth) {
        const OpenFile file(environment_.volume() + "/file" + std::to_string(nth));
        ASSERT_TRUE(file.write("from", "value").ok());
        FailingSystemCalls failing(nth, GetParam().error, GetParam().lasting);
        {
            const host::ScopedSystemCalls scope(failing);
            const host::Status status = host::rename_attribute(file.file(), "from", "to");
            // No room is tried again once; a fault that lasts is reported.
            EXPECT_TRUE(!status.ok() || GetParam().lasting == FailingSystemCalls::Lasting::once);
        }
        EXPECT_TRUE(file.read("from") == "value" || file.read("to") == "value");
    }
}

INSTANTIATE_TEST_SUITE_P(Errors, AttributeFault,
                         testing::Values(Fault{ENOSPC, FailingSystemCalls::Lasting::once},
                                         Fault{ENOSPC, FailingSystemCalls::Lasting::for_good},
                                         Fault{EIO, FailingSystemCalls::Lasting::once},
                                         Fault{EIO, FailingSystemCalls::Lasting::for_good}));

TEST(ShortWrite, IsContinued) {
    class Short : public host::SystemCalls {
        ssize_t write(int descriptor, const void* data, std::size_t size) override {
            if (++calls % 2 == 0) {
                errno = EINTR;
                return -1;
            }
            return SystemCalls::write(descriptor, data, std::min<std::size_t>(size, 1000));
        }
        ssize_t pread(int descriptor, void* buffer, std::size_t size, off_t position) override {
            return SystemCalls::pread(descriptor, buffer, std::min<std::size_t>(size, 999), position);
        }
        int calls = 0;
    };
    const test::TemporaryEnvironment environment;
    const OpenFile file(environment.volume() + "/file");
    Short calls;
    const host::ScopedSystemCalls scope(calls);
    ASSERT_TRUE(file.write("value", noise(70'000, 1)).ok());
    EXPECT_EQ(file.read("value"), noise(70'000, 1));
}

class AttributesOnAMountedVolume : public testing::TestWithParam<const char*> {
  protected:
    AttributesOnAMountedVolume()
        : loop_(GetParam(), std::string(GetParam()) == "btrfs" ? 128 : 24,
                std::string(GetParam()) == "ext4" ? "-b 4096" : "") {}
    void SetUp() override {
        if (!loop_.mounted())
            GTEST_SKIP() << loop_.reason();
    }

    test::TemporaryEnvironment environment_{test::TemporaryEnvironment::DeclaredVolume::none};
    test::LoopVolume loop_;
};

TEST_P(AttributesOnAMountedVolume, HoldValuesOfEverySize) {
    const OpenFile file(loop_.path() + "/file");
    for (const std::size_t size : {0, 1, 3900, 3950, 4000, 4020, 4040, 4070, 4096, 4100, 8600, 16'000, 16'300,
                                   16'384, 65'532, 65'533, 1 << 20}) {
        const std::string value = noise(size, static_cast<unsigned>(size));
        ASSERT_TRUE(file.write("value", value).ok()) << size;
        EXPECT_EQ(file.read("value"), value) << size;
    }
}

TEST_P(AttributesOnAMountedVolume, MakeRoomForEachOtherWhenTheFilesOwnSpaceIsFull) {
    const OpenFile large(loop_.path() + "/large");
    ASSERT_TRUE(large.write("first", noise(1500, 1)).ok());
    ASSERT_TRUE(large.write("second", noise(1500, 2)).ok());
    ASSERT_TRUE(large.write("third", noise(1500, 3)).ok());
    for (int i = 0; i < 20; ++i)
        ASSERT_TRUE(large.write("small" + std::to_string(i), noise(60, static_cast<unsigned>(i))).ok()) << i;

    EXPECT_EQ(large.read("first"), noise(1500, 1));
    EXPECT_EQ(large.read("second"), noise(1500, 2));
    EXPECT_EQ(large.read("third"), noise(1500, 3));
    for (int i = 0; i < 20; ++i)
        EXPECT_EQ(large.read("small" + std::to_string(i)), noise(60, static_cast<unsigned>(i)));
}

TEST_P(AttributesOnAMountedVolume, SayThatThereIsNoRoomForEverMoreSmallOnesAndKeepTheRest) {
    const OpenFile file(loop_.path() + "/file");
    for (int i = 0; i < 1000; ++i) {
        const std::string name = "attribute" + std::to_string(i);
        const host::Status status = file.write(name, noise(50, static_cast<unsigned>(i)));
        EXPECT_TRUE(status.ok() || status.error() == ENOSPC) << status.error();
        EXPECT_TRUE(status.ok() || i > 30) << i;
        EXPECT_EQ(file.read(name), status.ok() ? noise(50, static_cast<unsigned>(i)) : "<errno 2>");
    }
    EXPECT_EQ(file.read("attribute0"), noise(50, 0));
}

TEST_P(AttributesOnAMountedVolume, SayThatTheDiskIsFullAndKeepTheOldValue) {
    const OpenFile file(loop_.path() + "/file");
    ASSERT_TRUE(file.write("value", "old").ok());
    loop_.fill();

    EXPECT_EQ(file.write("value", noise(200'000, 1)).error(), ENOSPC);
    EXPECT_EQ(file.read("value"), "old");
    for (const auto& entry : std::filesystem::recursive_directory_iterator(loop_.path()))
        EXPECT_FALSE(entry.path().filename().string().starts_with(".new-")) << entry.path();
    std::filesystem::remove(loop_.path() + "/filler");
    ::sync();
    EXPECT_TRUE(file.write("value", noise(200'000, 1)).ok());
    EXPECT_EQ(file.read("value"), noise(200'000, 1));
}

TEST_P(AttributesOnAMountedVolume, CannotBeChangedWhenMountedReadOnlyButCanBeRead) {
    {
        const OpenFile file(loop_.path() + "/file");
        ASSERT_TRUE(file.write("value", "old").ok());
        ASSERT_TRUE(file.write("large", noise(200'000, 1)).ok());
    }
    ASSERT_TRUE(loop_.remount_read_only()) << loop_.reason();
    const OpenFile file(loop_.path() + "/file");

    EXPECT_EQ(file.write("value", "new").error(), EROFS);
    EXPECT_EQ(file.write("value", noise(200'000, 2)).error(), EROFS);
    EXPECT_EQ(host::remove_attribute(file.file(), "value").error(), EROFS);
    EXPECT_EQ(file.read("value"), "old");
    EXPECT_EQ(file.read("large"), noise(200'000, 1));
}

INSTANTIATE_TEST_SUITE_P(FileSystems, AttributesOnAMountedVolume, testing::Values("ext4", "btrfs"),
                         [](const auto& parameter) { return std::string(parameter.param); });

} // namespace
