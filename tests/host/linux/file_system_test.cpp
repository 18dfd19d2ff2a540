#include "host/api/file_system.h"

#include "host/api/volumes.h"
#include "host/linux/directory_cache.h"
#include "support/temporary_environment.h"
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <set>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace host {
namespace {

namespace fs = std::filesystem;

constexpr std::uint32_t kText = 0x43535452;

class FileSystemTest : public testing::Test {
  protected:
    FileSystemTest() : device_(volumes().list().at(0)) {}

    std::string path(const std::string& relative) const { return environment_.volume() + "/" + relative; }
    EntryRef entry(const std::string& relative, Follow follow = Follow::no) {
        const Result<EntryRef> ref = file_system().entry_of(path(relative), follow);
        EXPECT_TRUE(ref.ok()) << relative;
        return ref.ok() ? *ref : EntryRef();
    }
    std::unique_ptr<Node> open(const EntryRef& ref, OpenOptions options = {}) {
        Result<std::unique_ptr<Node>> node = file_system().open(ref, options);
        EXPECT_TRUE(node.ok()) << node.error();
        return node.ok() ? *std::move(node) : nullptr;
    }
    int open_error(const EntryRef& ref, OpenOptions options = {}) {
        return file_system().open(ref, options).error();
    }

    test::TemporaryEnvironment environment_;
    const DeviceId device_;
};

TEST_F(FileSystemTest, KnowsAFileByVolumeDirectoryAndName) {
    fs::create_directory(path("a"));
    struct stat status = {};
    ::stat(path("a").c_str(), &status);

    const EntryRef ref = entry("a/not yet there");
    EXPECT_EQ(ref, (EntryRef{device_, status.st_ino, "not yet there"}));
    EXPECT_EQ(*file_system().path_of(ref), path("a/not yet there"));
    EXPECT_EQ(entry("a/../a/./x"), (EntryRef{device_, status.st_ino, "x"}));
    EXPECT_EQ(entry("a/x///").leaf, "x");
    EXPECT_EQ(file_system().entry_of(path("none/x"), Follow::no).error(), ENOENT);
    EXPECT_EQ(file_system().entry_of("relative", Follow::no).error(), EINVAL);
    EXPECT_EQ(file_system().entry_of(path(std::string(256, 'n')), Follow::no).error(), ENAMETOOLONG);
}

TEST_F(FileSystemTest, KnowsTheRootAndDotsByTheirOwnEntries) {
    EXPECT_EQ(file_system().entry_of("/", Follow::no)->leaf, ".");
    EXPECT_EQ(*file_system().path_of(*file_system().entry_of("/", Follow::no)), "/");
    fs::create_directories(path("a/b"));

    EXPECT_EQ(*file_system().path_of(entry("a/b/.")), path("a/b"));
    EXPECT_EQ(*file_system().path_of(entry("a/b/..")), path("a"));
}

TEST_F(FileSystemTest, ResolvesLinksAtTheEndWhenAsked) {
    test::write_file(path("file"), "x");
    fs::create_symlink("file", path("one"));
    fs::create_symlink(path("one"), path("two"));
    fs::create_symlink("loop", path("loop"));
    fs::create_symlink("nowhere", path("dangling"));

    EXPECT_EQ(entry("two").leaf, "two");
    EXPECT_EQ(entry("two", Follow::yes).leaf, "file");
    EXPECT_EQ(entry("dangling", Follow::yes).leaf, "nowhere");
    EXPECT_EQ(file_system().entry_of(path("loop"), Follow::yes).error(), ELOOP);
}

TEST_F(FileSystemTest, ReferencesSurviveRenamedAndMovedParents) {
    fs::create_directories(path("a/b"));
    fs::create_directories(path("other"));
    test::write_file(path("a/b/file"), "content");
    const EntryRef ref = entry("a/b/file");
    fs::rename(path("a"), path("other/renamed"));

    EXPECT_EQ(*file_system().path_of(ref), path("other/renamed/b/file"));
    DirectoryCache::instance().clear();
    EXPECT_EQ(*file_system().path_of(ref), path("other/renamed/b/file"));
    EXPECT_EQ(file_system().stat(ref)->size, 7);
    fs::remove_all(path("other"));
    EXPECT_EQ(file_system().path_of(ref).error(), ENOENT);
    DirectoryCache::instance().clear();
    EXPECT_EQ(file_system().stat(ref).error(), ENOENT);
}

TEST_F(FileSystemTest, RefusesNamesThatAreNone) {
    const EntryRef base = entry("x");
    for (const char* leaf : {"", "..", "a/b"})
        EXPECT_EQ(open_error({base.device, base.directory, leaf}), EINVAL) << leaf;
    EXPECT_EQ(open_error({base.device, base.directory, std::string(256, 'x')}), ENAMETOOLONG);
}

TEST_F(FileSystemTest, OpensAndMakesFilesAsAsked) {
    const EntryRef ref = entry("file");
    EXPECT_EQ(open_error(ref), ENOENT);
    EXPECT_EQ(open_error(ref, {.access = Access::write}), ENOENT);

    const auto node =
        open(ref, {.access = Access::read_write, .missing = Missing::create, .creation_mode = 0600});
    EXPECT_EQ(*node->write_at(0, "hello", 5), 5u);
    EXPECT_EQ(node->stat()->mode & 07777u, 0600u);
    EXPECT_EQ(open_error(ref, {.access = Access::write, .missing = Missing::create_only}), EEXIST);
    EXPECT_EQ(open(ref, {.access = Access::write, .missing = Missing::create})->stat()->size, 5);
    EXPECT_EQ(open(ref, {.access = Access::write, .truncate = Truncate::yes})->stat()->size, 0);
}

TEST_F(FileSystemTest, ReadsAndChangesANode) {
    const auto node = open(entry("file"), {.access = Access::read_write, .missing = Missing::create});
    ASSERT_TRUE(node->set_size(10).ok());
    ASSERT_TRUE(node->set_mode(0640).ok());
    ASSERT_TRUE(node->set_times(-1, 1'000'000'000'500'000'000).ok());
    ASSERT_TRUE(node->sync().ok());
    char buffer[20] = {};

    EXPECT_EQ(*node->read_at(4, buffer, 20), 6u);
    EXPECT_EQ(*node->read_at(10, buffer, 20), 0u);
    const Result<NodeStat> status = node->stat();
    EXPECT_EQ(status->kind, NodeKind::file);
    EXPECT_EQ(status->size, 10);
    EXPECT_EQ(status->mode & 07777u, 0640u);
    EXPECT_EQ(status->modification_time, 1'000'000'000'500'000'000);
    EXPECT_GT(status->access_time, 1'000'000'000'500'000'000);
    EXPECT_EQ(status->id.device, device_);
}

TEST_F(FileSystemTest, LocksAgainstOtherOpeners) {
    const auto first = open(entry("file"), {.access = Access::read_write, .missing = Missing::create});
    const auto second = open(entry("file"));
    ASSERT_TRUE(first->lock().ok());
    EXPECT_EQ(second->lock().error(), EWOULDBLOCK);
    ASSERT_TRUE(first->unlock().ok());
    EXPECT_TRUE(second->lock().ok());
}

TEST_F(FileSystemTest, ReadsAndWritesAttributesThroughANodeOpenForReading) {
    test::write_file(path("file"), "content");
    const auto node = open(entry("file"));
    ASSERT_TRUE(node->write_attribute("Artist", kText, 0, "Ella", 4).ok());
    char buffer[8] = {};

    EXPECT_EQ(*node->attribute_names(), (std::vector<std::string>{"Artist"}));
    EXPECT_EQ(node->attribute_info("Artist")->type, kText);
    EXPECT_EQ(*node->read_attribute("Artist", 0, buffer, 8), 4u);
    ASSERT_TRUE(node->rename_attribute("Artist", "Singer").ok());
    ASSERT_TRUE(node->remove_attribute("Singer").ok());
    EXPECT_TRUE(node->attribute_names()->empty());
}

TEST_F(FileSystemTest, DirectoriesHaveAttributesToo) {
    fs::create_directory(path("a"));
    const auto node = open(entry("a"));
    ASSERT_TRUE(node->write_attribute("Artist", kText, 0, "Ella", 4).ok());
    EXPECT_EQ(node->attribute_info("Artist")->size, 4);
}

TEST_F(FileSystemTest, SymbolicLinksHaveNoAttributesAndTakeNone) {
    test::write_file(path("file"), "content");
    fs::create_symlink("file", path("link"));
    const auto link = open(entry("link"));
    char buffer = 0;

    EXPECT_EQ(link->stat()->kind, NodeKind::symbolic_link);
    EXPECT_EQ(link->write_attribute("a", kText, 0, "x", 1).error(), ENOTSUP);
    EXPECT_EQ(link->attribute_info("a").error(), ENOENT);
    EXPECT_EQ(link->read_attribute("a", 0, &buffer, 1).error(), ENOENT);
    EXPECT_EQ(link->remove_attribute("a").error(), ENOENT);
    EXPECT_TRUE(link->attribute_names()->empty());
    EXPECT_EQ(*file_system().read_symbolic_link(entry("link")), "file");
    ASSERT_TRUE(open(entry("link"), {.follow = Follow::yes})->write_attribute("a", kText, 0, "x", 1).ok());
    EXPECT_EQ(::getxattr(path("file").c_str(), "user.be.a", nullptr, 0), 5);
}

TEST_F(FileSystemTest, OpeningAPipeNeverWaits) {
    ASSERT_EQ(::mkfifo(path("pipe").c_str(), 0600), 0);
    EXPECT_EQ(open(entry("pipe"))->stat()->kind, NodeKind::other);
}

TEST_F(FileSystemTest, LookingLeavesTheAccessTimeAlone) {
    test::write_file(path("file"), "content");
    const struct timespec old[2] = {{1, 0}, {2, 0}};
    ::utimensat(AT_FDCWD, path("file").c_str(), old, 0);
    char buffer[4] = {};
    const auto node = open(entry("file"));
    EXPECT_EQ(*node->read_at(0, buffer, 4), 4u);

    EXPECT_EQ(node->stat()->access_time, 1'000'000'000);
}

TEST_F(FileSystemTest, NamesThatAreNoTextAreOpenedCorrectly) {
    const std::string name = "caf\xe9\n\x01";
    test::write_file(path(name), "content");
    EXPECT_EQ(open(entry(name))->stat()->size, 7);
}

TEST_F(FileSystemTest, ReadsADirectoryOfManyEntriesTwice) {
    fs::create_directory(path("many"));
    for (int i = 0; i < 3000; ++i)
        test::write_file(path("many/file with a longer name " + std::to_string(i)), "");
    fs::create_directory(path("many/directory"));
    fs::create_symlink("x", path("many/link"));
    auto reader = file_system().read_directory(open(entry("many"))->stat()->id);
    ASSERT_TRUE(reader.ok());

    for (int round = 0; round < 2; ++round) {
        std::set<std::string> names;
        DirectoryReader::Entry found;
        Status status;
        while ((status = (*reader)->next(found)).ok()) {
            names.insert(found.leaf);
            const NodeKind expected = found.leaf == "directory" ? NodeKind::directory
                                      : found.leaf == "link"    ? NodeKind::symbolic_link
                                                                : NodeKind::file;
            EXPECT_EQ(found.kind, expected);
        }
        EXPECT_EQ(status.error(), ENOENT);
        EXPECT_EQ(names.size(), 3002u);
        ASSERT_TRUE((*reader)->rewind().ok());
    }
}

TEST_F(FileSystemTest, MakesRenamesAndRemovesEntries) {
    ASSERT_TRUE(file_system().make_directory(entry("a"), 0755).ok());
    EXPECT_EQ(file_system().make_directory(entry("a"), 0755).error(), EEXIST);
    ASSERT_TRUE(file_system().make_symbolic_link(entry("a/link"), "target").ok());
    test::write_file(path("one"), "1");
    test::write_file(path("two"), "2");

    EXPECT_EQ(file_system().rename(entry("one"), entry("two"), FileSystem::Replace::no).error(), EEXIST);
    ASSERT_TRUE(file_system().rename(entry("one"), entry("two"), FileSystem::Replace::yes).ok());
    EXPECT_EQ(test::read_file(path("two")), "1");
    EXPECT_EQ(file_system().rename(entry("a"), entry("a/b"), FileSystem::Replace::no).error(), EINVAL);
    EXPECT_EQ(file_system().remove(entry("a")).error(), ENOTEMPTY);
    ASSERT_TRUE(file_system().remove(entry("a/link")).ok());
    ASSERT_TRUE(file_system().remove(entry("a")).ok());
    EXPECT_EQ(file_system().remove(entry("a")).error(), ENOENT);
}

TEST_F(FileSystemTest, DeclaredVolumesAreBorders) {
    fs::create_directories(path("inner/sub"));
    test::write_file(path("file"), "x");
    environment_.declare_volumes(environment_.volume() + ":" + path("inner"));
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 2u);

    EXPECT_EQ(entry("inner").device, ids[0]);
    EXPECT_EQ(entry("inner/x").device, ids[1]);
    EXPECT_EQ(file_system().stat(entry("inner"))->id.device, ids[1]);
    EXPECT_EQ(file_system().stat(entry("inner/sub"))->id.device, ids[1]);
    EXPECT_EQ(open(entry("inner"))->stat()->id, *file_system().root_of(ids[1]));
    EXPECT_EQ(*file_system().entry_of_directory(*file_system().root_of(ids[1])), entry("inner"));
    EXPECT_EQ(file_system().rename(entry("file"), entry("inner/file"), FileSystem::Replace::no).error(),
              EXDEV);
    EXPECT_EQ(file_system().rename(entry("inner"), entry("other"), FileSystem::Replace::no).error(), EBUSY);
    EXPECT_EQ(file_system().remove(entry("inner")).error(), EBUSY);
}

TEST_F(FileSystemTest, FindsFilesOutsideOfEveryVolume) {
    test::write_file(environment_.home() + "/file", "x");
    const Result<EntryRef> ref = file_system().entry_of(environment_.home() + "/file", Follow::no);
    ASSERT_TRUE(ref.ok());
    EXPECT_EQ(file_system().stat(*ref)->size, 1);
    EXPECT_EQ(*file_system().path_of(*ref), environment_.home() + "/file");
}

TEST_F(FileSystemTest, PassesThroughDirectoriesThatMayNotBeRead) {
    if (::geteuid() == 0)
        GTEST_SKIP() << "root may read every directory";
    fs::create_directories(path("closed/open"));
    test::write_file(path("closed/file"), "x");
    ::chmod(path("closed").c_str(), 0311);
    EXPECT_EQ(file_system().stat(entry("closed/file"))->size, 1);
    ::chmod(path("closed").c_str(), 0755);
}

} // namespace
} // namespace host
