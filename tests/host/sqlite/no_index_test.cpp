// Volumes that know attributes, for a user whose data directory cannot hold an index.

#include "index_fixture.h"

namespace host {
namespace {

class NoIndexTest : public IndexFixture {
  protected:
    /// Attributes are written and read, queries answered by a walk, and no index is made.
    void expect_no_index() {
        const Result<VolumeInfo> info = volumes().info(device_);
        ASSERT_TRUE(info.ok());
        EXPECT_TRUE(info->knows_attributes);
        EXPECT_FALSE(info->knows_queries);
        EXPECT_EQ(indexes().create(device_, "A", kText).error(), ENOTSUP);
        EXPECT_EQ(indexes().list(device_).error(), ENOTSUP);
        make("d/one");
        tag("d/one", "A", "x");
        EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
        EXPECT_EQ(find(contains("name", "on")), Leaves{"one"});
    }
    std::string index_directory() const { return base_ + "/data/bekits/index"; }
};

TEST_F(NoIndexTest, DataDirectoryThatCannotBeMade) {
    std::filesystem::remove_all(base_ + "/data/bekits");
    std::ofstream(base_ + "/data/bekits") << "in the way";
    expect_no_index();
}

TEST_F(NoIndexTest, DataDirectoryElsewhereThanWhereFilesCanBe) {
    setenv("XDG_DATA_HOME", "/proc/nowhere", 1);
    expect_no_index();
}

TEST_F(NoIndexTest, SomethingElseInPlaceOfTheIndexDirectory) {
    std::filesystem::create_directories(base_ + "/data/bekits");
    std::ofstream(index_directory()) << "in the way";
    expect_no_index();
}

TEST_F(NoIndexTest, DirectoryInPlaceOfTheDatabase) {
    std::filesystem::create_directories(database());
    expect_no_index();
}

TEST_F(NoIndexTest, IndexDirectoryThatMayNotBeWritten) {
    std::filesystem::create_directories(index_directory());
    std::filesystem::permissions(index_directory(), std::filesystem::perms::owner_read);
    if (access(index_directory().c_str(), W_OK) == 0)
        GTEST_SKIP() << "this user may write everywhere";
    expect_no_index();
    std::filesystem::permissions(index_directory(), std::filesystem::perms::owner_all);
}

TEST_F(NoIndexTest, IsKeptAsSoonAsItCanBe) {
    std::filesystem::create_directories(database());
    expect_no_index();
    std::filesystem::remove(database());
    EXPECT_TRUE(volumes().info(device_)->knows_queries);
    EXPECT_TRUE(indexes().create(device_, "A", kText).ok());
    EXPECT_EQ(find(contains("A", "x")), Leaves{"one"});
}

} // namespace
} // namespace host
