// Our own changes come back from the watcher: what they cost then.

#include "host/sqlite/volume_indexes.h"
#include "index_fixture.h"
#include <fcntl.h>
#include <functional>

namespace host {
namespace {

constexpr int kFiles = 10;

class EchoTest : public IndexFixture {
  protected:
    void SetUp() override {
        IndexFixture::SetUp();
        for (int i = 0; i < kFiles; ++i)
            make("d/" + std::to_string(i));
        make("d/sentinel");
        ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
        tag("d/sentinel", "A", "x");
        indexes().follow_changes();
        // Where the sentinel's changes are heard the directory is watched.
        const std::uint64_t before = statistics().observed_read;
        ASSERT_TRUE(eventually([&] {
            usleep(20000);
            tag_outside("d/sentinel", "A", "y");
            return statistics().observed_read > before;
        }));
        // From here on no row's change time is in doubt.
        usleep(20000);
        ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::thorough, nullptr).ok());
        wait_until_quiet();
        start_ = statistics();
    }
    static bool eventually(const std::function<bool()>& holds) {
        for (int i = 0; i < 3000 && !holds(); ++i)
            usleep(10000);
        return holds();
    }
    WriterStatistics statistics() {
        return dynamic_cast<VolumeIndexes&>(indexes()).of(device_)->statistics();
    }
    /// Until the walk in the background, too, has nothing more to say.
    void wait_until_quiet() {
        WriterStatistics before;
        WriterStatistics now = statistics();
        do {
            before = now;
            usleep(500000);
            now = statistics();
        } while (now.observed != before.observed || now.reported != before.reported);
    }

    WriterStatistics start_;
};

TEST_F(EchoTest, OwnChangesAreReadOnceAndNotAgainWhenTheyComeBack) {
    for (int i = 0; i < kFiles; ++i) {
        tag("d/" + std::to_string(i), "A", "own");
        // Not flushed: that would have the row written within the clock's tick of the change.
        const std::uint64_t expected = start_.reported + static_cast<std::uint64_t>(i) + 1;
        ASSERT_TRUE(eventually([&] { return statistics().reported == expected; })) << i;
    }
    ASSERT_TRUE(eventually([&] { return statistics().observed >= start_.observed + kFiles; }));
    wait_until_quiet();
    const WriterStatistics end = statistics();
    EXPECT_EQ(end.reported_read - start_.reported_read, 10U);
    EXPECT_EQ(end.observed_read - start_.observed_read, 0U);
    EXPECT_EQ(end.rows_changed - start_.rows_changed, 10U);
}

TEST_F(EchoTest, AnEventWithoutAChangeReadsNoAttributes) {
    const int file = open((root_ + "/d/sentinel").c_str(), O_WRONLY | O_CLOEXEC);
    ASSERT_GE(file, 0);
    close(file);
    ASSERT_TRUE(eventually([&] { return statistics().observed > start_.observed; }));
    wait_until_quiet();
    EXPECT_EQ(statistics().observed_read - start_.observed_read, 0U);
    EXPECT_EQ(statistics().rows_changed - start_.rows_changed, 0U);
}

TEST_F(EchoTest, AnotherProgramsChangeIsReadAndWritten) {
    tag_outside("d/sentinel", "A", "theirs");
    ASSERT_TRUE(eventually([&] { return statistics().rows_changed > start_.rows_changed; }));
    EXPECT_EQ(statistics().reported_read - start_.reported_read, 0U);
    EXPECT_GE(statistics().observed_read - start_.observed_read, 1U);
    EXPECT_EQ(find(contains("A", "theirs")), Leaves{"sentinel"});
}

} // namespace
} // namespace host
