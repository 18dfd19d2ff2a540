// The database's writes fail, each in turn, with a full disk and with an I/O error; then its reads. Queries
// stay right, and the user sees no error.

#include "../host/sqlite/index_fixture.h"
#include <atomic>
#include <map>
#include <mutex>
#include <sqlite3.h>

namespace host {
namespace {

std::atomic<int> writes_until_failure{-1};
std::atomic<int> failure{SQLITE_FULL};
std::atomic<int> failed_writes{0};
std::mutex methods_mutex;
/// The system's methods (another set for each kind of file) to those that fail.
std::map<const sqlite3_io_methods*, sqlite3_io_methods> failing_methods;
std::atomic<int> reads_until_failure{-1};
std::atomic<int> failed_reads{0};
std::atomic<int (*)(sqlite3_file*, const void*, int, sqlite3_int64)> real_write{nullptr};
std::atomic<int (*)(sqlite3_file*, void*, int, sqlite3_int64)> real_read{nullptr};
sqlite3_vfs* real_vfs = nullptr;
sqlite3_vfs failing_vfs;

int failing_write(sqlite3_file* file, const void* data, int size, sqlite3_int64 position) {
    // Once a disk is full it stays full.
    if (writes_until_failure >= 0 && (writes_until_failure == 0 || --writes_until_failure == 0)) {
        ++failed_writes;
        return failure;
    }
    return real_write.load()(file, data, size, position);
}

int failing_read(sqlite3_file* file, void* data, int size, sqlite3_int64 position) {
    if (reads_until_failure >= 0 && (reads_until_failure == 0 || --reads_until_failure == 0)) {
        ++failed_reads;
        return SQLITE_IOERR_READ;
    }
    return real_read.load()(file, data, size, position);
}

// Pages that are mapped into memory would never be read.
int no_pages(sqlite3_file*, sqlite3_int64, int, void** page) {
    *page = nullptr;
    return SQLITE_OK;
}

int opening(sqlite3_vfs*, const char* name, sqlite3_file* file, int flags, int* out_flags) {
    const int result = real_vfs->xOpen(real_vfs, name, file, flags, out_flags);
    if (result == SQLITE_OK && file->pMethods != nullptr) {
        const std::lock_guard lock(methods_mutex);
        const auto [methods, is_new] = failing_methods.try_emplace(file->pMethods, *file->pMethods);
        if (is_new) {
            real_write = file->pMethods->xWrite;
            methods->second.xWrite = failing_write;
            real_read = file->pMethods->xRead;
            methods->second.xRead = failing_read;
            methods->second.xFetch = no_pages;
        }
        file->pMethods = &methods->second;
    }
    return result;
}

class IndexWriteFaultTest : public IndexFixture {
  protected:
    static void SetUpTestSuite() {
        real_vfs = sqlite3_vfs_find(nullptr);
        failing_vfs = *real_vfs;
        failing_vfs.zName = "failing";
        failing_vfs.xOpen = opening;
        sqlite3_vfs_register(&failing_vfs, 1);
    }
    void TearDown() override {
        writes_until_failure = -1;
        reads_until_failure = -1;
        IndexFixture::TearDown();
    }
    void fail_each_write(int code) {
        for (int i = 0; i < 20; ++i)
            make(std::to_string(i));
        ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
        EXPECT_EQ(find(contains("A", "x")), Leaves{});
        failure = code;
        failed_writes = 0;
        // Until the disk lasts for the whole round.
        int write = 0;
        for (int failed_before = -1; failed_writes != failed_before;) {
            failed_before = failed_writes;
            ASSERT_LT(++write, 1000);
            writes_until_failure = write;
            tag("3", "A", "x" + std::to_string(write));
            EXPECT_EQ(find(contains("A", "x" + std::to_string(write))), Leaves{"3"}) << write;
            untag("3", "A");
            EXPECT_EQ(find(contains("A", "x")), Leaves{}) << write;
            tag("4", "A", "y");
            EXPECT_EQ(find(contains("A", "y")), Leaves{"4"}) << write;
            writes_until_failure = -1;
            EXPECT_EQ(find(contains("A", "y")), Leaves{"4"}) << write;
            untag("4", "A");
            EXPECT_EQ(find(contains("A", "")), Leaves{}) << write;
        }
        std::printf("%d writes a round\n", write);
        EXPECT_GE(write, 12);
    }
};

TEST_F(IndexWriteFaultTest, FullDisk) {
    fail_each_write(SQLITE_FULL);
}

TEST_F(IndexWriteFaultTest, WriteError) {
    fail_each_write(SQLITE_IOERR_WRITE);
}

TEST_F(IndexWriteFaultTest, ReadError) {
    for (int i = 0; i < 300; ++i) {
        make(std::to_string(i));
        tag_outside(std::to_string(i), "A", "x" + std::string(200, 'y'));
    }
    ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
    EXPECT_EQ(find(contains("A", "x")).size(), 300U);
    int read = 0;
    failed_reads = 0;
    for (int failed_before = -1; failed_reads != failed_before;) {
        failed_before = failed_reads;
        ASSERT_LT(++read, 1000);
        indexes().shut_down();
        reads_until_failure = read;
        EXPECT_EQ(find(contains("A", "x")).size(), 300U) << read;
        tag("7", "A", "z" + std::to_string(read));
        EXPECT_EQ(find(contains("A", "z")), Leaves{"7"}) << read;
        reads_until_failure = -1;
        EXPECT_EQ(find(contains("A", "z")), Leaves{"7"}) << read;
        tag("7", "A", "x");
        EXPECT_EQ(find(contains("A", "x")).size(), 300U) << read;
    }
    std::printf("%d reads a round\n", read);
    EXPECT_GE(read, 12);
}

} // namespace
} // namespace host
