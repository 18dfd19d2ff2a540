#include "host/linux/directory_path.h"

#include "host/api/file_system.h"
#include "host/api/volumes.h"
#include "host/linux/descriptor.h"
#include "host/linux/directory_cache.h"
#include "support/loop_volume.h"
#include "support/temporary_environment.h"
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace host {
namespace {

namespace fs = std::filesystem;

class DirectoryPathTest : public testing::Test {
  protected:
    static Descriptor open_directory(const std::string& path) {
        return Descriptor(::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    }
    static std::uint64_t inode_of(const Descriptor& directory) {
        struct stat status = {};
        EXPECT_EQ(::fstat(directory.get(), &status), 0);
        return status.st_ino;
    }
    /// Makes directories with names of 200 bytes in each other, which are known as a walk makes them; the
    /// last one's path.
    std::string make_deep(int levels) {
        std::string path = environment_.volume();
        const DeviceId device = volumes().list().at(0);
        Descriptor directory = open_directory(path);
        const std::string leaf(200, 'd');
        for (int i = 0; i < levels; ++i) {
            const std::uint64_t parent = inode_of(directory);
            EXPECT_EQ(::mkdirat(directory.get(), leaf.c_str(), 0755), 0);
            directory =
                Descriptor(::openat(directory.get(), leaf.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
            DirectoryCache::instance().remember(device, inode_of(directory), parent, leaf);
            path += "/" + leaf;
        }
        deepest_ = std::move(directory);
        return path;
    }

    test::TemporaryEnvironment environment_;
    Descriptor deepest_;
};

TEST_F(DirectoryPathTest, IsTheOneThatTheSystemTells) {
    const std::string path = environment_.volume() + "/a/b c/\xff";
    fs::create_directories(path);
    EXPECT_EQ(*path_by_climbing(open_directory(path).get()), path);
    EXPECT_EQ(*path_by_climbing(open_directory("/").get()), "/");
    EXPECT_EQ(*path_by_climbing(open_directory("/proc/self/").get()), "/proc/" + std::to_string(::getpid()));
}

TEST_F(DirectoryPathTest, OfARemovedDirectoryIsNotThere) {
    const std::string path = environment_.volume() + "/gone";
    fs::create_directory(path);
    const Descriptor directory = open_directory(path);
    fs::remove(path);
    EXPECT_EQ(path_by_climbing(directory.get()).error(), ENOENT);
}

TEST_F(DirectoryPathTest, LeadsAcrossMountPoints) {
    test::LoopVolume loop("ext4", 16);
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();
    fs::create_directory(loop.path() + "/inside");
    EXPECT_EQ(*path_by_climbing(open_directory(loop.path() + "/inside").get()), loop.path() + "/inside");

    const Descriptor inside = open_directory(loop.path() + "/inside");
    ASSERT_EQ(std::system(("umount -l " + loop.path()).c_str()), 0);
    EXPECT_EQ(path_by_climbing(inside.get()).error(), ENOENT);
}

TEST_F(DirectoryPathTest, MayBeLongerThanWhatTheSystemTells) {
    const std::string path = make_deep(30);
    ASSERT_GT(path.size(), 6000U);
    EXPECT_EQ(*path_by_climbing(deepest_.get()), path);

    const NodeId node{volumes().list().at(0), inode_of(deepest_)};
    const Result<std::string> song = file_system().path_of({node.device, node.inode, "Song.mp3"});
    ASSERT_TRUE(song.ok()) << song.error();
    EXPECT_EQ(*song, path + "/Song.mp3");
    const Result<EntryRef> entry = file_system().entry_of_directory(node);
    ASSERT_TRUE(entry.ok()) << entry.error();
    EXPECT_EQ(entry->leaf, std::string(200, 'd'));
}

/// What a process sees whose root is changed to the environment's.
class ChangedRoot : public testing::Test {
  protected:
    enum class Proc { none, mounted };

    /// Runs `check` in a child; the number that it answers.
    int in_changed_root(Proc proc, const std::function<int()>& check) {
        const pid_t child = ::fork();
        if (child == 0)
            ::_exit(enter(proc) ? check() : kNotEntered);
        int status = 0;
        ::waitpid(child, &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    static constexpr int kNotEntered = 99;
    test::TemporaryEnvironment environment_{test::TemporaryEnvironment::DeclaredVolume::none};

  private:
    bool enter(Proc proc) {
        const std::string root = environment_.root();
        if (proc == Proc::mounted) {
            ::mkdir((root + "/proc").c_str(), 0755);
            if (::unshare(CLONE_NEWNS) != 0 ||
                ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
                ::mount("/proc", (root + "/proc").c_str(), nullptr, MS_BIND | MS_REC, nullptr) != 0)
                return false;
        }
        return ::chroot(root.c_str()) == 0 && ::chdir("/") == 0 && ::setenv("HOME", "/home", 1) == 0 &&
               ::setenv("XDG_CONFIG_HOME", "/home/.config", 1) == 0 &&
               ::setenv("XDG_DATA_HOME", "/home/.local/share", 1) == 0;
    }
};

// Answers 0, or the number of the first thing that is not as it should be.
int look_around() {
    ::mkdir("/music", 0755);
    const auto list = volumes().list();
    if (list.size() != 1)
        return 1;
    const DeviceId root = list[0];
    if (volumes().info(root)->root != "/" || volumes().boot_volume() != root)
        return 2;
    if (!volumes().info(root)->knows_queries)
        return 3;
    const auto node = file_system().root_of(root);
    if (!node.ok())
        return 4;
    const auto entry = file_system().entry_of_directory(*node);
    if (!entry.ok() || entry->leaf != "." || *file_system().path_of(*entry) != "/")
        return 5;
    const auto music = file_system().entry_of("/music/Song.mp3", Follow::no);
    if (!music.ok() || music->device != root || *file_system().path_of(*music) != "/music/Song.mp3")
        return 6;
    ::setenv("BEKITS_VOLUMES", "/music", 1);
    const auto declared = volumes().list();
    if (declared.size() != 1 || volumes().info(declared[0])->file_system.empty())
        return 7;
    ::mkdir("/music/album", 0755);
    if (*volumes().volume_of("/music/album") != declared[0])
        return 8;
    return 0;
}

TEST_F(ChangedRoot, IsAVolumeThoughNothingIsMountedThere) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "changing the root needs root";
    const int answer = in_changed_root(Proc::mounted, look_around);
    if (answer == kNotEntered)
        GTEST_SKIP() << "this process may not mount";
    EXPECT_EQ(answer, 0);
}

TEST_F(ChangedRoot, IsAVolumeWithItsPathsWithoutProc) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "changing the root needs root";
    const int answer = in_changed_root(Proc::none, look_around);
    if (answer == kNotEntered)
        GTEST_SKIP() << "this process may not change its root";
    EXPECT_EQ(answer, 0);
}

} // namespace
} // namespace host
