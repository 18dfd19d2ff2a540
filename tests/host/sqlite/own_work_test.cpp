// What a process that changes file after file is told of meanwhile, and what it finds afterwards.

#include "host/sqlite/own_work.h"
#include "index_fixture.h"
#include <functional>
#include <map>
#include <mutex>
#include <set>

namespace host {
namespace {

// However slow the machine is.
constexpr OwnWork::Limits kUntimed = {std::chrono::hours(1), std::chrono::hours(1), 65536,
                                      std::chrono::nanoseconds(0)};

class OwnWorkTest : public IndexFixture {
  protected:
    void SetUp() override {
        IndexFixture::SetUp();
        for (const char* directory : {"d", "e", "barrier"}) {
            for (const char* leaf : {"mine", "mine too", "theirs", "untouched"})
                make(std::string(directory) + "/" + leaf);
        }
        ChangeWatcher::Sink sink;
        sink.entry_changed = [this](std::uint64_t directory, const std::string& leaf) {
            const std::lock_guard lock(mutex_);
            told_[directory].insert(leaf);
        };
        sink.changes_missed = [] {};
        watcher_ = std::make_unique<ChangeWatcher>(device_, std::move(sink));
        ASSERT_TRUE(eventually([&] { return watcher_->is_complete(); }));
        work_ = std::make_unique<OwnWork>(device_, kUntimed);
        work_->follow(watcher_.get());
        for (const char* directory : {"d", "e"})
            directories_[directory] = ref(std::string(directory) + "/mine").directory;
    }
    void TearDown() override {
        work_->follow(nullptr);
        watcher_.reset();
        IndexFixture::TearDown();
    }

    static bool eventually(const std::function<bool()>& holds) {
        for (int i = 0; i < 3000 && !holds(); ++i)
            usleep(10000);
        return holds();
    }
    /// This process changes many files' attributes in one directory.
    void work_in(const std::string& directory) {
        for (int i = 0; i < 40; ++i)
            work_->changed_in(directories_[directory], ++reported_);
    }
    /// What the system has told of this directory so far: later changes elsewhere are told later.
    std::set<std::string> told_of(const std::string& directory) {
        const std::string leaf = "mark" + std::to_string(++marks_);
        make("barrier/" + leaf);
        const std::uint64_t barrier = ref("barrier/" + leaf).directory;
        EXPECT_TRUE(eventually([&] {
            const std::lock_guard lock(mutex_);
            return told_[barrier].contains(leaf);
        }));
        const std::lock_guard lock(mutex_);
        return told_[directories_[directory]];
    }
    ChangeNote note(const std::string& directory, const std::string& leaf) {
        return {directories_[directory], leaf, ChangeNote::Source::own};
    }
    /// The notes that looking over adds to a group of these, sorted.
    std::vector<std::string> look_over(std::vector<ChangeNote> group, std::uint64_t position) {
        const std::size_t own = group.size();
        EXPECT_TRUE(work_->look_over(group, position, reported_));
        std::vector<std::string> added;
        for (std::size_t i = own; i < group.size(); ++i) {
            EXPECT_EQ(group[i].source, ChangeNote::Source::observed);
            const char* const name = group[i].directory == directories_["d"] ? "d/" : "e/";
            added.push_back(name + group[i].leaf);
        }
        std::sort(added.begin(), added.end());
        return added;
    }
    /// Longer than the clock's tick: what was changed before has an older time.
    static void let_the_clock_move() { usleep(30000); }

    std::mutex mutex_;
    std::map<std::uint64_t, std::set<std::string>> told_;
    std::unique_ptr<ChangeWatcher> watcher_;
    std::unique_ptr<OwnWork> work_;
    std::map<std::string, std::uint64_t> directories_;
    std::uint64_t reported_ = 0;
    int marks_ = 0;
};

using Told = std::set<std::string>;

TEST_F(OwnWorkTest, AttributeChangesWhereThisProcessWorksAreNotTold) {
    work_in("d");
    tag_outside("d/mine", "A", "x");
    tag_outside("e/theirs", "A", "x");
    EXPECT_EQ(told_of("d"), Told{});
    EXPECT_EQ(told_of("e"), Told{"theirs"});
}

TEST_F(OwnWorkTest, WhatOthersChangedThereIsFoundAfterwards) {
    let_the_clock_move();
    work_in("d");
    tag_outside("d/mine", "A", "x");
    tag_outside("d/theirs", "A", "x");
    EXPECT_EQ(look_over({note("d", "mine")}, reported_), Leaves{"d/theirs"});
    EXPECT_EQ(look_over({}, reported_), Leaves{}) << "once";
}

TEST_F(OwnWorkTest, AFileOfOursThatIsNotInHandIsLookedAtToo) {
    let_the_clock_move();
    work_in("d");
    tag_outside("d/mine", "A", "x");
    tag_outside("d/mine too", "A", "x");
    EXPECT_EQ(look_over({note("d", "mine too")}, reported_), Leaves{"d/mine"});
}

TEST_F(OwnWorkTest, AnOlderChangeThatMayHaveBeenToldLateIsFound) {
    OwnWork::Limits limits = kUntimed;
    limits.telling_time = std::chrono::hours(1);
    work_ = std::make_unique<OwnWork>(device_, limits);
    work_->follow(watcher_.get());
    tag_outside("d/theirs", "A", "x");
    let_the_clock_move();
    work_in("d");
    EXPECT_EQ(look_over({note("d", "mine"), note("d", "mine too"), note("d", "untouched")}, reported_),
              Leaves{"d/theirs"});
}

TEST_F(OwnWorkTest, AFoldersAttributesAreFound) {
    std::filesystem::create_directories(root_ + "/d/folder");
    let_the_clock_move();
    work_in("d");
    tag_outside("d/folder", "A", "x");
    EXPECT_EQ(look_over({}, reported_), Leaves{"d/folder"});
}

TEST_F(OwnWorkTest, AfterwardsEverythingIsToldAgain) {
    work_in("d");
    (void)look_over({}, reported_);
    tag_outside("d/theirs", "A", "x");
    EXPECT_EQ(told_of("d"), Told{"theirs"});
}

TEST_F(OwnWorkTest, InTheDirectoryThatWasLeftEverythingIsToldAtOnce) {
    work_in("d");
    work_in("e");
    tag_outside("d/theirs", "A", "x");
    tag_outside("e/theirs", "A", "x");
    EXPECT_EQ(told_of("d"), Told{"theirs"});
    EXPECT_EQ(told_of("e"), Told{});
}

TEST_F(OwnWorkTest, FilesThatComeGoAndAreWrittenAreToldAllTheTime) {
    work_in("d");
    make("d/new");
    std::filesystem::rename(root_ + "/d/mine", root_ + "/d/renamed");
    std::filesystem::remove(root_ + "/d/mine too");
    make("d/theirs");
    EXPECT_EQ(told_of("d"), (Told{"new", "mine", "renamed", "mine too", "theirs"}));
}

TEST_F(OwnWorkTest, SeldomChangesLeaveTheWatchAsItIs) {
    for (int i = 0; i < 10; ++i)
        work_->changed_in(directories_["d"], ++reported_);
    tag_outside("d/theirs", "A", "x");
    EXPECT_EQ(told_of("d"), Told{"theirs"});
    EXPECT_EQ(look_over({}, reported_), Leaves{});
}

TEST_F(OwnWorkTest, ADirectoryIsLookedOverWhenTheWriterComesToItsLastNote) {
    let_the_clock_move();
    work_in("d");
    tag_outside("d/theirs", "A", "x");
    work_->changed_in(directories_["e"], reported_);
    const std::uint64_t left = reported_;
    tag_outside("e/theirs", "A", "x");
    work_in("e");
    EXPECT_EQ(look_over({}, left - 1), Leaves{});
    EXPECT_EQ(look_over({}, left), Leaves{"d/theirs"});
    EXPECT_EQ(look_over({}, reported_), Leaves{"e/theirs"});
}

TEST_F(OwnWorkTest, ALongVisitIsLookedOverOnTheWay) {
    OwnWork::Limits limits = kUntimed;
    limits.longest_visit = std::chrono::milliseconds(0);
    work_ = std::make_unique<OwnWork>(device_, limits);
    work_->follow(watcher_.get());
    let_the_clock_move();
    work_in("d");
    tag_outside("d/theirs", "A", "x");
    EXPECT_EQ(look_over({}, reported_ - 1), Leaves{"d/theirs"});
}

TEST_F(OwnWorkTest, ALargeDirectoryIsWatchedAsEver) {
    OwnWork::Limits limits = kUntimed;
    limits.largest_directory = 0;
    work_ = std::make_unique<OwnWork>(device_, limits);
    work_->follow(watcher_.get());
    work_in("d");
    tag_outside("d/theirs", "A", "x");
    EXPECT_EQ(told_of("d"), Told{"theirs"});
    EXPECT_EQ(look_over({}, reported_), Leaves{});
}

TEST_F(OwnWorkTest, ADirectoryThatMovedMeanwhileIsFoundAndToldOfAgain) {
    let_the_clock_move();
    work_in("d");
    tag_outside("d/theirs", "A", "x");
    std::filesystem::rename(root_ + "/d", root_ + "/e/elsewhere");
    EXPECT_EQ(look_over({}, reported_), Leaves{"d/theirs"});
    tag_outside("e/elsewhere/untouched", "A", "x");
    EXPECT_TRUE(told_of("d").contains("untouched"));
}

TEST_F(OwnWorkTest, ADirectoryThatWentMeanwhileIsNoLoss) {
    work_in("d");
    std::filesystem::remove_all(root_ + "/d");
    EXPECT_EQ(look_over({note("d", "mine")}, reported_), Leaves{});
}

TEST_F(OwnWorkTest, ADirectoryThatMayNotBeReadAnyMoreCountsAsMissed) {
    if (geteuid() == 0)
        GTEST_SKIP() << "root may read everything";
    work_in("d");
    std::filesystem::permissions(root_ + "/d", std::filesystem::perms::none);
    std::vector<ChangeNote> group;
    EXPECT_FALSE(work_->look_over(group, reported_, reported_));
    std::filesystem::permissions(root_ + "/d", std::filesystem::perms::owner_all);
}

} // namespace
} // namespace host
