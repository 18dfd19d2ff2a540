#include "host/sqlite/reader_pool.h"
#include "support/temporary_environment.h"
#include <filesystem>
#include <gtest/gtest.h>

namespace host {
namespace {

class ReaderPoolTest : public ::testing::Test {
  protected:
    void make_database(std::int64_t mark) {
        for (const char* suffix : {"", "-wal", "-shm"})
            std::filesystem::remove(path_ + suffix);
        IndexStore store;
        ASSERT_EQ(store.open(path_, Connection::Mode::create), DatabaseResult::done);
        ASSERT_EQ(store.set_meta("mark", mark), DatabaseResult::done);
    }

    test::TemporaryEnvironment environment_;
    const std::string path_ = environment_.root() + "/index.db";
};

TEST_F(ReaderPoolTest, LendsAConnectionAgainThatWasGivenBack) {
    make_database(1);
    ReaderPool pool(path_);
    auto reader = pool.borrow();
    ASSERT_NE(reader, nullptr);
    const IndexStore* const first = reader.get();
    pool.give_back(std::move(reader));
    EXPECT_EQ(pool.borrow().get(), first);
}

TEST_F(ReaderPoolTest, LendsNoConnectionToAFileThatHasBeenReplaced) {
    make_database(1);
    ReaderPool pool(path_);
    auto idle = pool.borrow();
    auto lent = pool.borrow();
    ASSERT_NE(lent, nullptr);
    pool.give_back(std::move(idle));

    make_database(2);
    pool.clear();
    pool.give_back(std::move(lent));

    for (int i = 0; i < 3; ++i) {
        auto reader = pool.borrow();
        ASSERT_NE(reader, nullptr);
        EXPECT_EQ(reader->meta("mark", 0), 2);
    }
}

TEST_F(ReaderPoolTest, LendsNothingWhereThereIsNoDatabase) {
    ReaderPool pool(path_);
    EXPECT_EQ(pool.borrow(), nullptr);
    EXPECT_FALSE(std::filesystem::exists(path_));
}

} // namespace
} // namespace host
