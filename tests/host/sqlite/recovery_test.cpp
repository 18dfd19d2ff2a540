// Rebuilding, and what the index does after a crash or with a damaged database.

#include "index_fixture.h"
#include <csignal>
#include <fcntl.h>
#include <set>
#include <sqlite3.h>
#include <sys/stat.h>
#include <sys/wait.h>

namespace host {
namespace {

constexpr const char* kChildMark = "QUIRNEL_RECOVERY_CHILD";

class RecoveryTest : public IndexFixture {
  protected:
    void execute(const char* sql) {
        sqlite3* connection = nullptr;
        ASSERT_EQ(sqlite3_open(database().c_str(), &connection), SQLITE_OK);
        char* message = nullptr;
        EXPECT_EQ(sqlite3_exec(connection, sql, nullptr, nullptr, &message), SQLITE_OK) << message;
        sqlite3_free(message);
        sqlite3_close(connection);
    }
    std::int64_t count_rows() {
        sqlite3* connection = nullptr;
        sqlite3_open(database().c_str(), &connection);
        sqlite3_stmt* statement = nullptr;
        sqlite3_prepare_v2(connection, "SELECT count(*) FROM file", -1, &statement, nullptr);
        const bool row = sqlite3_step(statement) == SQLITE_ROW;
        const std::int64_t count = row ? sqlite3_column_int64(statement, 0) : -1;
        sqlite3_finalize(statement);
        sqlite3_close(connection);
        return count;
    }
    /// Overwrites every page but the first, so that what is cached in memory is all that still reads.
    void damage_pages() {
        const int file = open(database().c_str(), O_WRONLY | O_CLOEXEC);
        ASSERT_GE(file, 0);
        struct stat status = {};
        ASSERT_EQ(fstat(file, &status), 0);
        const std::string junk(4096, '\x55');
        for (off_t at = 4096; at + 4096 <= status.st_size; at += 4096)
            ASSERT_EQ(pwrite(file, junk.data(), junk.size(), at), 4096);
        close(file);
    }
};

TEST_F(RecoveryTest, CancelledRebuildLeavesTheOldRows) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (int i = 0; i < 5000; ++i)
        make("d/" + std::to_string(i));
    tag("d/7", "A", "x");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"7"});
    for (int i = 0; i < 5000; ++i)
        tag_outside("d/" + std::to_string(i), "A", "y");
    EXPECT_EQ(indexes().rebuild(device_, [](std::uint64_t count) { return count < 4000; }).error(),
              ECANCELED);
    ASSERT_TRUE(indexes().flush(device_).ok());
    EXPECT_EQ(count_rows(), 1);
    EXPECT_TRUE(indexes().rebuild(device_, nullptr).ok());
    EXPECT_EQ(count_rows(), 5000);
    EXPECT_EQ(find(contains("A", "y")).size(), 5000U);
    EXPECT_EQ(find(contains("A", "x")), Leaves{});
}

TEST_F(RecoveryTest, RebuildMendsRowsWhoseChangeTimesAreRight) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    for (const char* name : {"one", "two", "three"}) {
        make(name);
        tag(name, "A", "x");
    }
    usleep(20000);
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"one", "three", "two"}));
    indexes().shut_down();
    execute("UPDATE file SET attributes = x'', settled = 1 WHERE name = x'6f6e65'");
    execute("DELETE FROM file WHERE name = x'74776f'");
    execute("INSERT INTO file VALUES(99, 1, x'676f6e65', 1, 1, 1, 1, x'')");
    EXPECT_EQ(find(contains("A", "x")), Leaves{"three"});
    ASSERT_TRUE(indexes().rebuild(device_, nullptr).ok());
    EXPECT_EQ(find(contains("A", "x")), (Leaves{"one", "three", "two"}));
    EXPECT_EQ(count_rows(), 3);
}

/// The killed program; started by the test below. Tags and strips in place, so that no directory changes, and
/// is killed before its writer has looked at the notes.
TEST(RecoveryChild, ChangesAttributesAndDies) {
    if (std::getenv(kChildMark) == nullptr)
        GTEST_SKIP() << "runs as a child only";
    const DeviceId device = volumes().list().front();
    const std::string root = volumes().info(device)->root;
    for (int i = 0; i < 100; ++i) {
        const auto entry = file_system().entry_of(root + "/d/" + std::to_string(i), Follow::no);
        ASSERT_TRUE(entry.ok());
        const auto node = file_system().open(*entry, {});
        ASSERT_TRUE(node.ok());
        if (i % 2 == 0)
            (void)(*node)->remove_attribute("A");
        else
            (void)(*node)->write_attribute("A", kText, 0, "new", 4);
    }
    kill(getpid(), SIGKILL);
}

TEST_F(RecoveryTest, ReconcileOfDirectoriesIsThoroughAfterAProcessDied) {
    for (const bool open_meanwhile : {false, true}) {
        for (int i = 0; i < 100; ++i)
            make("d/" + std::to_string(i));
        (void)indexes().create(device_, "A", kText);
        for (int i = 0; i < 100; i += 4)
            tag("d/" + std::to_string(i), "A", "old");
        EXPECT_EQ(find(contains("A", "old")).size(), 25U);
        if (!open_meanwhile)
            indexes().shut_down();
        setenv(kChildMark, "1", 1);
        const pid_t child = fork();
        if (child == 0) {
            execl("/proc/self/exe", "test_host_sqlite", "--gtest_filter=RecoveryChild.*", nullptr);
            _exit(127);
        }
        unsetenv(kChildMark);
        ASSERT_GT(child, 0);
        int status = 0;
        waitpid(child, &status, 0);
        ASSERT_TRUE(WIFSIGNALED(status)) << status;
        ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::directories, nullptr).ok());
        EXPECT_EQ(find(contains("A", "new")).size(), 50U) << open_meanwhile;
        EXPECT_EQ(find(contains("A", "old")), Leaves{});
        for (int i = 1; i < 100; i += 2)
            untag("d/" + std::to_string(i), "A");
    }
}

TEST_F(RecoveryTest, DamageDuringAQueryDropsAndRepeatsNoHit) {
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    // So many rows that their pages do not fit the cache of what was read already.
    for (int i = 0; i < 3000; ++i) {
        make("d/" + std::to_string(i));
        tag("d/" + std::to_string(i), "A", "x" + std::string(200, 'y'));
    }
    EXPECT_EQ(find(contains("A", "x")).size(), 3000U);
    indexes().shut_down();
    execute("PRAGMA wal_checkpoint(TRUNCATE)");
    const auto query = indexes().query(device_, contains("A", "x"), nullptr);
    ASSERT_TRUE(query.ok());
    std::multiset<std::string> found;
    RunningQuery::Hit hit;
    for (int i = 0; i < 100; ++i) {
        ASSERT_TRUE((*query)->next(hit).ok());
        found.insert(hit.ref.leaf);
    }
    damage_pages();
    Status status;
    while ((status = (*query)->next(hit)).ok())
        found.insert(hit.ref.leaf);
    EXPECT_EQ(status.error(), ENOENT);
    EXPECT_EQ(found.size(), 3000U);
    EXPECT_EQ(std::set<std::string>(found.begin(), found.end()).size(), 3000U);
}

} // namespace
} // namespace host
