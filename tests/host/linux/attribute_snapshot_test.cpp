#include "host/linux/attribute_snapshot.h"

#include "host/api/volumes.h"
#include "host/linux/linux_file_system.h"
#include "host/linux/seen_entry.h"
#include "host/linux/system_calls.h"
#include "support/temporary_environment.h"
#include <array>
#include <chrono>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <map>
#include <sys/xattr.h>
#include <thread>

namespace host {
namespace {

constexpr std::uint32_t kText = 0x43535452; // 'CSTR'

class CountingSystemCalls : public SystemCalls {
  public:
    int openat(int directory, const char* path, int flags, mode_t mode) override {
        ++counts["openat"];
        return SystemCalls::openat(directory, path, flags, mode);
    }
    int fstatat(int directory, const char* path, struct stat* result, int flags) override {
        ++counts["fstatat"];
        return SystemCalls::fstatat(directory, path, result, flags);
    }
    ssize_t fgetxattr(int descriptor, const char* name, void* buffer, std::size_t size) override {
        ++counts["fgetxattr"];
        return SystemCalls::fgetxattr(descriptor, name, buffer, size);
    }
    ssize_t flistxattr(int descriptor, char* buffer, std::size_t size) override {
        ++counts["flistxattr"];
        return SystemCalls::flistxattr(descriptor, buffer, size);
    }
    std::map<std::string, int> counts;
};

class AttributeSnapshotTest : public testing::Test {
  protected:
    AttributeSnapshotTest() {
        std::ofstream(path_) << "content";
        ref_ = *file_system().entry_of(path_, Follow::no);
    }
    void set(const char* name, const std::string& value) const {
        ASSERT_EQ(::setxattr(path_.c_str(), name, value.data(), value.size(), 0), 0);
    }
    std::unique_ptr<Node> open() const {
        OpenOptions options;
        options.access = Access::none;
        return *file_system().open(ref_, options);
    }
    static std::string read(Node& node, const char* name) {
        std::array<char, 2000> buffer{};
        const Result<std::size_t> size = node.read_attribute(name, 0, buffer.data(), buffer.size());
        return size.ok() ? std::string(buffer.data(), *size) : "error " + std::to_string(size.error());
    }
    static void outlive_snapshot() { std::this_thread::sleep_for(std::chrono::milliseconds(1)); }

    test::TemporaryEnvironment environment_;
    const std::string path_ = environment_.volume() + "/file";
    EntryRef ref_;
    const std::string kMissing_ = "error " + std::to_string(ENOENT);
};

TEST_F(AttributeSnapshotTest, WhatIsListedAndLookedAtIsReadFromTheSystemOnce) {
    set("user.be.a", "CSTRone");
    set("user.be.b", "CSTRtwo");
    const auto node = open();
    // A thread that is put aside for longer than a snapshot lasts asks again: one quiet try is enough.
    bool quiet = false;
    for (int attempt = 0; attempt < 200 && !quiet; ++attempt) {
        outlive_snapshot();
        CountingSystemCalls counting;
        const ScopedSystemCalls scope(counting);
        EXPECT_EQ(node->attribute_names()->size(), 2u);
        EXPECT_EQ(node->attribute_info("a")->size, 3);
        EXPECT_EQ(read(*node, "a"), "one");
        EXPECT_EQ(read(*node, "b"), "two");
        EXPECT_EQ(read(*node, "b"), "two");
        EXPECT_EQ(read(*node, "c"), kMissing_);
        quiet = counting.counts["flistxattr"] == 1 && counting.counts["fgetxattr"] == 2;
    }
    EXPECT_TRUE(quiet);
}

TEST_F(AttributeSnapshotTest, ASecondQuestionInVainListsAndFurtherOnesAskNothing) {
    const auto node = open();
    bool quiet = false;
    for (int attempt = 0; attempt < 200 && !quiet; ++attempt) {
        outlive_snapshot();
        CountingSystemCalls counting;
        const ScopedSystemCalls scope(counting);
        for (const char* name : {"a", "b", "c", "d", "e"})
            EXPECT_EQ(read(*node, name), kMissing_);
        quiet = counting.counts["flistxattr"] == 1 && counting.counts["fgetxattr"] <= 1;
    }
    EXPECT_TRUE(quiet);
}

TEST_F(AttributeSnapshotTest, AChangeThroughAnotherNodeIsSeenAtOnce) {
    set("user.be.a", "CSTRold");
    const auto reader = open();
    const auto writer = open();
    for (int i = 0; i < 1000; ++i) {
        const std::string value = "value " + std::to_string(i);
        EXPECT_EQ(reader->attribute_names()->size(), 1u);
        (void)read(*reader, "a");
        ASSERT_TRUE(writer->write_attribute("a", kText, 0, value.data(), value.size()).ok());
        ASSERT_EQ(read(*reader, "a"), value);
        ASSERT_TRUE(writer->write_attribute("b", kText, 0, "x", 1).ok());
        ASSERT_EQ(read(*reader, "b"), "x");
        ASSERT_TRUE(writer->remove_attribute("b").ok());
        ASSERT_EQ(read(*reader, "b"), kMissing_);
    }
}

TEST_F(AttributeSnapshotTest, ARenamedAttributeIsFoundUnderItsNewNameAtOnce) {
    set("user.be.old", "CSTRx");
    const auto reader = open();
    const auto writer = open();
    EXPECT_EQ(reader->attribute_names()->size(), 1u);
    EXPECT_EQ(read(*reader, "old"), "x");
    ASSERT_TRUE(writer->rename_attribute("old", "new").ok());
    EXPECT_EQ(read(*reader, "old"), kMissing_);
    EXPECT_EQ(read(*reader, "new"), "x");
}

TEST_F(AttributeSnapshotTest, AnotherProgramsChangeIsSeenWhenItsTimeIsOver) {
    set("user.be.a", "CSTRold");
    const auto node = open();
    EXPECT_EQ(node->attribute_names()->size(), 1u);
    EXPECT_EQ(read(*node, "a"), "old");
    EXPECT_EQ(read(*node, "b"), kMissing_);
    set("user.be.a", "CSTRnew");
    set("user.be.b", "CSTRborn");
    outlive_snapshot();
    EXPECT_EQ(read(*node, "a"), "new");
    EXPECT_EQ(read(*node, "b"), "born");
}

TEST_F(AttributeSnapshotTest, ListsThatAreTooLongToBeKeptAreReadAllTheSame) {
    for (int i = 0; i < 40; ++i)
        set(("user.be.attribute " + std::to_string(i)).c_str(), "CSTR" + std::to_string(i));
    const auto node = open();
    EXPECT_EQ(node->attribute_names()->size(), 40u);
    EXPECT_EQ(read(*node, "attribute 39"), "39");
    EXPECT_EQ(read(*node, "none"), kMissing_);
    EXPECT_EQ(read(*node, "none"), kMissing_);
    EXPECT_EQ(read(*node, "attribute 0"), "0");
}

TEST_F(AttributeSnapshotTest, ValuesForWhichThereIsNoRoomAreReadAllTheSame) {
    const std::string first(900, 'a');
    const std::string second(900, 'b');
    set("user.be.first", "CSTR" + first);
    set("user.be.second", "CSTR" + second);
    const auto node = open();
    EXPECT_EQ(node->attribute_names()->size(), 2u);
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ(read(*node, "first"), first);
        EXPECT_EQ(read(*node, "second"), second);
    }
}

TEST_F(AttributeSnapshotTest, NamesThatBeginAlikeAreToldApart) {
    set("user.be.name", "CSTRshort");
    set("user.be.name2", "CSTRlong");
    const auto node = open();
    EXPECT_EQ(node->attribute_names()->size(), 2u);
    EXPECT_EQ(read(*node, "name2"), "long");
    EXPECT_EQ(read(*node, "name"), "short");
    EXPECT_EQ(read(*node, "nam"), kMissing_);
}

TEST_F(AttributeSnapshotTest, AFileThatAWalkHasJustShownIsOpenedWithoutALook) {
    CountingSystemCalls counting;
    const ScopedSystemCalls scope(counting);
    set_seen_file(ref_);
    const auto node = open();
    EXPECT_EQ(*node->kind(), NodeKind::file);
    EXPECT_EQ(counting.counts["fstatat"], 0);
    EXPECT_EQ(counting.counts["openat"], 1);
}

TEST_F(AttributeSnapshotTest, OtherNamesAndOtherThreadsAreLookedAt) {
    set_seen_file(ref_);
    EntryRef other = ref_;
    other.leaf = "fil";
    EXPECT_FALSE(was_seen_as_file(other));
    other.leaf = "file2";
    EXPECT_FALSE(was_seen_as_file(other));
    other = ref_;
    ++other.directory;
    EXPECT_FALSE(was_seen_as_file(other));
    EXPECT_TRUE(was_seen_as_file(ref_));
    std::thread([&] { EXPECT_FALSE(was_seen_as_file(ref_)); }).join();
}

TEST_F(AttributeSnapshotTest, ALinkThatHasTakenASeenFilesPlaceIsNotFollowed) {
    set_seen_file(ref_);
    std::filesystem::remove(path_);
    std::filesystem::create_symlink("nowhere", path_);
    const auto node = open();
    EXPECT_EQ(*node->kind(), NodeKind::symbolic_link);
    EXPECT_EQ(read(*node, "a"), kMissing_);
}

TEST_F(AttributeSnapshotTest, ADirectoryThatHasTakenASeenFilesPlaceIsOpened) {
    set_seen_file(ref_);
    std::filesystem::remove(path_);
    std::filesystem::create_directory(path_);
    const auto node = open();
    // Known as what the walk saw for as long as the walk's word counts; asked, the system says otherwise.
    EXPECT_EQ(node->stat()->kind, NodeKind::directory);
}

} // namespace
} // namespace host
