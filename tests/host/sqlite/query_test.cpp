#include "index_fixture.h"

#include "host/linux/system_calls.h"
#include <atomic>
#include <fcntl.h>
#include <mutex>
#include <thread>

namespace host {
namespace {

using Op = Predicate::Operator;

class QueryTest : public IndexFixture {};

class ListsCounted : public SystemCalls {
  public:
    ssize_t getdents(int directory, void* buffer, std::size_t size) override {
        ++lists;
        return SystemCalls::getdents(directory, buffer, size);
    }
    std::atomic<int> lists{0};
};

TEST_F(QueryTest, NameQueryFindsFilesDirectoriesAndLinks) {
    make("a/one.mp3");
    make("a/two.ogg");
    std::filesystem::create_directory(root_ + "/folder.mp3");
    std::filesystem::create_symlink("nowhere", root_ + "/link.mp3");
    EXPECT_EQ(find(compare("name", Op::ends_with, ".mp3")), (Leaves{"folder.mp3", "link.mp3", "one.mp3"}));
}

TEST_F(QueryTest, TaggedFileIsFoundAtOnce) {
    ASSERT_TRUE(indexes().create(device_, "Audio:Artist", kText).ok());
    make("a/one.mp3");
    tag("a/one.mp3", "Audio:Artist", "Some Singer");
    EXPECT_EQ(find(contains("Audio:Artist", "Sing")), Leaves{"one.mp3"});
    EXPECT_EQ(find(contains("Audio:Artist", "sing")), Leaves{});
    untag("a/one.mp3", "Audio:Artist");
    EXPECT_EQ(find(contains("Audio:Artist", "Sing")), Leaves{});
}

TEST_F(QueryTest, CreatingAnIndexTwiceAnswersThatItExists) {
    EXPECT_TRUE(indexes().create(device_, "Audio:Artist", kText).ok());
    EXPECT_EQ(indexes().create(device_, "Audio:Artist", kInteger).error(), EEXIST);
    EXPECT_EQ(indexes().create(device_, "name", kText).error(), EEXIST);
    const auto list = indexes().list(device_);
    ASSERT_TRUE(list.ok());
    ASSERT_EQ(list->size(), 4U);
    EXPECT_EQ((*list)[3].attribute, "Audio:Artist");
    EXPECT_EQ((*list)[3].type, kText);
    EXPECT_TRUE(indexes().remove(device_, "Audio:Artist").ok());
    EXPECT_EQ(indexes().remove(device_, "Audio:Artist").error(), ENOENT);
}

TEST_F(QueryTest, AttributeWithoutIndexIsFoundOnFilesThatHaveAnIndexedOne) {
    ASSERT_TRUE(indexes().create(device_, "Audio:Artist", kText).ok());
    make("one");
    make("two");
    tag("one", "Audio:Artist", "A");
    tag("one", "Audio:TrackNo", "7");
    tag("two", "Audio:TrackNo", "7");
    EXPECT_EQ(find(compare("Audio:TrackNo", Op::equal, std::string("7"))), Leaves{"one"});
}

TEST_F(QueryTest, FilesTaggedBeforeTheIndexWasMadeAreFound) {
    make("one");
    tag("one", "Audio:Artist", "A");
    ASSERT_TRUE(indexes().create(device_, "Audio:Artist", kText).ok());
    EXPECT_EQ(find(contains("Audio:Artist", "A")), Leaves{"one"});
}

TEST_F(QueryTest, EmptyTextFindsEveryFileWithTheAttribute) {
    ASSERT_TRUE(indexes().create(device_, "Audio:Artist", kText).ok());
    make("one");
    make("two");
    make("three");
    tag("one", "Audio:Artist", "");
    tag("two", "Audio:Artist", "x");
    EXPECT_EQ(find(contains("Audio:Artist", "")), (Leaves{"one", "two"}));
}

TEST_F(QueryTest, OperatorsCombine) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (const char* name : {"one", "two", "three", "four"})
        make(name);
    tag("one", "A", "apple");
    tag("two", "A", "banana");
    tag("three", "A", "apricot");
    EXPECT_EQ(find(join(Op::either, {contains("A", "nan"), contains("A", "ric")})), (Leaves{"three", "two"}));
    EXPECT_EQ(find(join(Op::both, {compare("A", Op::begins_with, "ap"), compare("name", Op::equal, "one")})),
              Leaves{"one"});
    EXPECT_EQ(find(join(Op::both, {compare("name", Op::contains, "e"),
                                   join(Op::negate, {compare("A", Op::begins_with, "appl")})})),
              Leaves{"three"});
    EXPECT_EQ(find(join(Op::negate, {contains("A", "")})), Leaves{"four"});
    EXPECT_EQ(find(compare("A", Op::not_equal, "apple")), (Leaves{"three", "two"}));
    EXPECT_EQ(find(compare("A", Op::matches, "*p[a-r]*[!x]")), (Leaves{"one", "three"}));
    EXPECT_EQ(find(compare("A", Op::contains, "APR", Predicate::Case::insensitive)), Leaves{"three"});
}

TEST_F(QueryTest, NumbersCompareAsNumbers) {
    ASSERT_TRUE(indexes().create(device_, "Year", kInteger).ok());
    for (const std::int32_t year : {-5, 9, 1999, 2010}) {
        const std::string name = "f" + std::to_string(year);
        make(name);
        const auto node = file_system().open(ref(name), {});
        ASSERT_TRUE(node.ok());
        ASSERT_TRUE((*node)->write_attribute("Year", kInteger, 0, &year, sizeof year).ok());
    }
    EXPECT_EQ(find(compare("Year", Op::greater, std::int64_t{9})), (Leaves{"f1999", "f2010"}));
    EXPECT_EQ(find(compare("Year", Op::less_or_equal, std::int64_t{9})), (Leaves{"f-5", "f9"}));
    EXPECT_EQ(find(compare("Year", Op::equal, std::string("1999"))), Leaves{"f1999"});
    EXPECT_EQ(find(compare("Year", Op::less, 9.5)), (Leaves{"f-5", "f9"}));
}

TEST_F(QueryTest, LongTextIsSearchedOnTheFile) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", std::string(600, 'x') + "needle");
    EXPECT_EQ(find(contains("A", "needle")), Leaves{"one"});
    EXPECT_EQ(find(contains("A", "absent")), Leaves{});
}

TEST_F(QueryTest, HitIsDroppedWhenAnotherProgramChangedTheFile) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    make("two");
    tag("one", "A", "old");
    tag("two", "A", "old");
    EXPECT_EQ(find(contains("A", "old")), (Leaves{"one", "two"}));
    tag_outside("one", "A", "new");
    std::filesystem::remove(root_ + "/two");
    EXPECT_EQ(find(contains("A", "old")), Leaves{});
    EXPECT_EQ(find(contains("A", "new")), Leaves{"one"});
}

TEST_F(QueryTest, HitsSurviveRenamingTheirDirectory) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("dir/sub/one");
    tag("dir/sub/one", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    std::filesystem::rename(root_ + "/dir", root_ + "/moved");
    const auto query = indexes().query(device_, contains("A", "x"), nullptr);
    ASSERT_TRUE(query.ok());
    RunningQuery::Hit hit;
    ASSERT_TRUE((*query)->next(hit).ok());
    EXPECT_EQ(*file_system().path_of(hit.ref), root_ + "/moved/sub/one");
}

TEST_F(QueryTest, TheIndexKnowsTheWayToFoldersThatWereNeverAskedFor) {
    make("a/b/c/one");
    make("a/b/d/two");
    tag_outside("a/b/c/one", "A", "x");
    tag_outside("a/b/d/two", "A", "x");
    DirectoryCache::instance().clear();
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    ASSERT_TRUE(indexes().rebuild(device_, nullptr).ok());
    indexes().shut_down();
    DirectoryCache::instance().clear();
    const auto query = indexes().query(device_, contains("A", "x"), nullptr);
    ASSERT_TRUE(query.ok());
    ListsCounted counting;
    const ScopedSystemCalls scope(counting);
    RunningQuery::Hit hit;
    EXPECT_TRUE((*query)->next(hit).ok());
    EXPECT_TRUE((*query)->next(hit).ok());
    EXPECT_EQ(counting.lists, 0) << "folders were searched through";
}

TEST_F(QueryTest, FortyFoldersThatAreGoneAreSearchedForOnce) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (int i = 0; i < 42; ++i) {
        const std::string file = std::to_string(i) + "/" + std::to_string(i) + ".mp3";
        make(file);
        tag(file, "A", "x");
    }
    indexes().shut_down();
    for (int i = 0; i < 40; ++i)
        std::filesystem::remove_all(root_ + "/" + std::to_string(i));
    DirectoryCache::instance().clear();
    ListsCounted counting;
    const ScopedSystemCalls scope(counting);
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"40.mp3", "41.mp3"}));
    // Three folders are left, each listed by two calls, for the query and for the index writer.
    EXPECT_LE(counting.lists, 40);
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"40.mp3", "41.mp3"}));
}

TEST_F(QueryTest, RenamingThroughTheLibraryMovesTheRow) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", "x");
    EntryRef to = ref("one");
    to.leaf = "two";
    ASSERT_TRUE(file_system().rename(ref("one"), to, FileSystem::Replace::no).ok());
    EXPECT_EQ(find(contains("A", "x")), Leaves{"two"});
}

TEST_F(QueryTest, AllNamesOfAHardLinkedFileAreFound) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", "x");
    std::filesystem::create_hard_link(root_ + "/one", root_ + "/two");
    indexes().entry_changed(ref("one"));
    indexes().entry_changed(ref("two"));
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"one", "two"}));
    tag("one", "A", "y");
    EXPECT_EQ(find(contains("A", "y")), (Leaves{"one", "two"}));
    EXPECT_EQ(find(contains("A", "x")), Leaves{});
}

TEST_F(QueryTest, ThoroughReconcileFindsWhatOthersChanged) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    make("d/two");
    tag("one", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    tag_outside("d/two", "A", "x");
    std::filesystem::rename(root_ + "/one", root_ + "/d/three");
    ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::thorough, nullptr).ok());
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"three", "two"}));
}

TEST_F(QueryTest, DirectoryReconcileFindsMovedFiles) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("a/one");
    make("b/other");
    tag("a/one", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    std::filesystem::rename(root_ + "/a/one", root_ + "/b/moved");
    std::filesystem::create_directory(root_ + "/new");
    std::ofstream(root_ + "/new/copy") << "c";
    tag_outside("new/copy", "A", "x");
    ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::directories, nullptr).ok());
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"copy", "moved"}));
}

TEST_F(QueryTest, RowsSurviveClosingAndOpening) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", "x");
    indexes().shut_down();
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
}

TEST_F(QueryTest, DeletedDatabaseIsRebuiltWhileOpen) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    for (const char* suffix : {"", "-wal", "-shm"})
        std::filesystem::remove(database() + suffix);
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    make("two");
    tag("two", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"one", "two"}));
}

TEST_F(QueryTest, DamagedDatabaseIsRebuilt) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    tag("one", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
    for (const auto size : {0, 1, 100, 4096, 9000}) {
        indexes().shut_down();
        std::ofstream(database(), std::ios::binary | std::ios::trunc)
            << std::string(static_cast<std::size_t>(size), 'z');
        EXPECT_EQ(find(contains("A", "x")), Leaves{"one"}) << size;
    }
}

TEST_F(QueryTest, RebuildCanBeCancelled) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (int i = 0; i < 2500; ++i)
        make("d/" + std::to_string(i));
    tag("d/7", "A", "x");
    EXPECT_EQ(indexes().rebuild(device_, [](std::uint64_t) { return false; }).error(), ECANCELED);
    EXPECT_EQ(find(contains("A", "x")), Leaves{"7"});
    std::uint64_t looked_at = 0;
    EXPECT_TRUE(indexes()
                    .rebuild(device_,
                             [&](std::uint64_t count) {
                                 looked_at = count;
                                 return true;
                             })
                    .ok());
    EXPECT_EQ(looked_at, 2501U);
    EXPECT_EQ(find(contains("A", "x")), Leaves{"7"});
}

TEST_F(QueryTest, LiveQueryTellsOfEntriesThatComeAndGo) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    make("two");
    tag("one", "A", "x");
    std::mutex mutex;
    Leaves told;
    auto query = indexes().query(device_, contains("A", "x"), [&](const QueryUpdate& update) {
        const std::lock_guard lock(mutex);
        told.push_back((update.change == QueryUpdate::Change::entered ? "+" : "-") + update.ref.leaf);
    });
    ASSERT_TRUE(query.ok());
    RunningQuery::Hit hit;
    while ((*query)->next(hit).ok()) {
    }
    tag("two", "A", "xx");
    ASSERT_TRUE(indexes().flush(device_).ok());
    untag("one", "A");
    ASSERT_TRUE(indexes().flush(device_).ok());
    tag("two", "A", "xxx");
    ASSERT_TRUE(indexes().flush(device_).ok());
    query = Result<std::unique_ptr<RunningQuery>>(Status(ENOENT));
    tag("one", "A", "x");
    ASSERT_TRUE(indexes().flush(device_).ok());
    const std::lock_guard lock(mutex);
    EXPECT_EQ(told, (Leaves{"+two", "-one"}));
}

TEST_F(QueryTest, WalkToleratesTaggingWhileWalking) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (int i = 0; i < 500; ++i)
        make("d" + std::to_string(i % 10) + "/" + std::to_string(i) + ".mp3");
    const auto query = indexes().query(device_, compare("name", Op::ends_with, ".mp3"), nullptr);
    ASSERT_TRUE(query.ok());
    RunningQuery::Hit hit;
    int count = 0;
    while ((*query)->next(hit).ok()) {
        const auto node = file_system().open(hit.ref, {});
        ASSERT_TRUE(node.ok());
        ASSERT_TRUE((*node)->write_attribute("A", kText, 0, "v", 2).ok());
        ++count;
    }
    EXPECT_EQ(count, 500);
    EXPECT_EQ(find(contains("A", "v")).size(), 500U);
}

TEST_F(QueryTest, ChangesByOthersAreFollowed) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    make("one");
    indexes().follow_changes();
    const auto eventually = [&](const Leaves& expected) {
        for (int i = 0; i < 500 && find(contains("A", "x")) != expected; ++i)
            usleep(10000);
        return find(contains("A", "x"));
    };
    tag_outside("one", "A", "x");
    EXPECT_EQ(eventually(Leaves{"one"}), Leaves{"one"});
    std::filesystem::create_directories(root_ + "/new/deep");
    std::ofstream(root_ + "/new/deep/two") << "t";
    tag_outside("new/deep/two", "A", "xx");
    EXPECT_EQ(eventually(Leaves{"one", "two"}), (Leaves{"one", "two"}));
    std::filesystem::rename(root_ + "/one", root_ + "/new/three");
    EXPECT_EQ(eventually(Leaves{"three", "two"}), (Leaves{"three", "two"}));
}

TEST_F(QueryTest, UnknownVolumeAnswersNoDevice) {
    EXPECT_EQ(indexes().query(12345, contains("A", "x"), nullptr).error(), ENODEV);
    EXPECT_EQ(indexes().create(12345, "A", kText).error(), ENODEV);
}

} // namespace
} // namespace host
