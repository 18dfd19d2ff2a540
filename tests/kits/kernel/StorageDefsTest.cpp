#include <StorageDefs.h>
#include <fs_attr.h>

#include <gtest/gtest.h>

TEST(StorageDefsTest, LimitsAndModesHaveThePlatformsValues) {
    EXPECT_EQ(B_FILE_NAME_LENGTH, 256U);
    EXPECT_EQ(B_ATTR_NAME_LENGTH, 255U);
    EXPECT_EQ(B_MIME_TYPE_LENGTH, 240U);
    EXPECT_EQ(B_READ_ONLY, 0U);
    EXPECT_EQ(B_WRITE_ONLY, 1U);
    EXPECT_EQ(B_READ_WRITE, 2U);
    EXPECT_EQ(B_FAIL_IF_EXISTS, 0x100U);
    EXPECT_EQ(B_CREATE_FILE, 0x200U);
    EXPECT_EQ(B_ERASE_FILE, 0x400U);
    EXPECT_EQ(B_OPEN_AT_END, 0x800U);
    EXPECT_EQ(B_ANY_NODE, B_FILE_NODE | B_SYMLINK_NODE | B_DIRECTORY_NODE);
}

TEST(StorageDefsTest, AttributeInfoBeginsEmpty) {
    const attr_info info;
    EXPECT_EQ(info.type, 0U);
    EXPECT_EQ(info.size, 0);
}
