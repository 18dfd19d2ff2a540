#include <Entry.h>
#include <fs_info.h>

#include "StorageTest.h"

namespace {

class FsInfo : public test::StorageTest {};

} // namespace

TEST_F(FsInfo, TheDeclaredVolumeIsTheOnlyOne) {
    int32 position = 0;
    dev_t device = next_dev(&position);
    ASSERT_NE(device, kNoDevice);
    EXPECT_EQ(device, dev_for_path(Volume().c_str()));
    EXPECT_EQ(device, dev_for_path(Directory().c_str()));
    EXPECT_EQ(next_dev(&position), kNoDevice);
    EXPECT_EQ(next_dev(&position), kNoDevice);
    EXPECT_EQ(next_dev(nullptr), kNoDevice);
    EXPECT_EQ(dev_for_path(nullptr), kNoDevice);
    EXPECT_EQ(dev_for_path(""), kNoDevice);
    EXPECT_EQ(dev_for_path("/"), kNoDevice);
}

TEST_F(FsInfo, TellsWhatTheVolumeCanDo) {
    dev_t device = dev_for_path(Volume().c_str());
    fs_info info;
    ASSERT_EQ(fs_stat_dev(device, &info), B_OK);
    EXPECT_EQ(info.dev, device);
    EXPECT_STREQ(info.volume_name, "volume");
    EXPECT_EQ(info.flags, B_FS_IS_PERSISTENT | B_FS_HAS_MIME | B_FS_HAS_ATTR | B_FS_HAS_QUERY);
    EXPECT_GT(info.block_size, 0);
    EXPECT_GT(info.total_blocks, 0);
    BEntry root(Volume().c_str());
    struct stat stat;
    ASSERT_EQ(root.GetStat(&stat), B_OK);
    EXPECT_EQ(info.root, stat.st_ino);
    EXPECT_EQ(fs_stat_dev(device, nullptr), B_BAD_VALUE);
    EXPECT_EQ(fs_stat_dev(kNoDevice, &info), B_BAD_VALUE);
}
