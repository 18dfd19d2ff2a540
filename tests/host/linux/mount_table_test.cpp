#include "host/linux/mount_table.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

namespace host {
namespace {

constexpr const char* kLaptop = R"(21 1 254:0 / / rw,relatime shared:1 - ext4 /dev/vda rw
22 21 0:20 / /proc rw shared:12 - proc proc rw
23 21 0:6 / /dev rw - devtmpfs udev rw,size=1k
24 21 0:24 / /run rw - tmpfs tmpfs rw
25 21 8:17 / /media/me/My\040Stick\134x ro,nosuid shared:5 master:2 - vfat /dev/sdb1 rw,uid=1000
26 21 254:0 /srv/music /home/me/Bound rw - ext4 /dev/vda rw
27 21 7:1 / /snap/core/1 ro - squashfs /dev/loop1 ro
28 21 0:50 / /var/lib/docker/overlay2/x rw - overlay overlay rw
29 21 0:51 / /home/me/.gvfs rw - fuse.gvfsd-fuse gvfsd-fuse rw
30 21 0:52 / /mnt/nas rw - nfs4 nas:/export rw
31 21 0:40 /@ /mnt/at rw - btrfs /dev/sdc1 rw,subvol=/@
32 21 0:40 /@home /mnt/home rw - btrfs /dev/sdc1 rw,subvol=/@home
33 21 0:40 /@home /mnt/again rw - btrfs /dev/sdc1 rw,subvol=/@home
)";

dev_t example_device(const MountEntry& entry) {
    // Subvolumes have numbers of their own.
    if (entry.file_system == "btrfs")
        return makedev(0, entry.root == "/@" ? 41 : 42);
    return entry.device;
}

std::vector<std::string> mount_points(const std::vector<MountEntry>& entries) {
    std::vector<std::string> points;
    for (const MountEntry& entry : entries)
        points.push_back(entry.mount_point);
    return points;
}

TEST(MountTable, ReadsEveryFieldAndUndoesEscapes) {
    const auto entries = parse_mount_table(kLaptop);
    ASSERT_EQ(entries.size(), 13u);

    const MountEntry& stick = entries[4];
    EXPECT_EQ(stick.device, makedev(8, 17));
    EXPECT_EQ(stick.root, "/");
    EXPECT_EQ(stick.mount_point, "/media/me/My Stick\\x");
    EXPECT_EQ(stick.file_system, "vfat");
    EXPECT_EQ(stick.source, "/dev/sdb1");
    EXPECT_TRUE(stick.read_only);
    EXPECT_FALSE(entries[0].read_only);
}

TEST(MountTable, SelectsEachStorageFileSystemOnce) {
    const auto selected = select_storage_mounts(parse_mount_table(kLaptop), example_device);

    EXPECT_EQ(mount_points(selected),
              (std::vector<std::string>{"/", "/media/me/My Stick\\x", "/mnt/nas", "/mnt/at", "/mnt/home"}));
}

TEST(MountTable, PrefersTheWholeFileSystemToAPartOfIt) {
    const auto entries = parse_mount_table("1 0 8:1 /part /a rw - ext4 /dev/sda1 rw\n"
                                           "2 0 8:1 / /b rw - ext4 /dev/sda1 rw\n");

    EXPECT_EQ(mount_points(select_storage_mounts(entries, example_device)), (std::vector<std::string>{"/b"}));
}

TEST(MountTable, KeepsTheRootEvenWhenItIsAnOverlay) {
    const auto entries = parse_mount_table("1 0 0:50 / / rw - overlay overlay rw\n"
                                           "2 1 8:1 /etc/hosts /etc/hosts rw - ext4 /dev/sda1 rw\n");
    const auto no_directory = [](const MountEntry& entry) {
        return entry.mount_point == "/etc/hosts" ? dev_t{0} : entry.device;
    };

    EXPECT_EQ(mount_points(select_storage_mounts(entries, no_directory)), (std::vector<std::string>{"/"}));
}

TEST(MountTable, HasARootThoughTheSystemTellsOfNone) {
    struct stat status = {};
    ASSERT_EQ(::stat("/", &status), 0);

    const auto none = mounts_with_root("");
    ASSERT_EQ(none.size(), 1u);
    EXPECT_EQ(none[0].mount_point, "/");
    EXPECT_EQ(none[0].device, status.st_dev);
    EXPECT_FALSE(none[0].file_system.empty());

    const auto elsewhere = mounts_with_root("2 1 0:50 / /data rw - overlay overlay rw\n");
    EXPECT_EQ(mount_points(elsewhere), (std::vector<std::string>{"/", "/data"}));
    EXPECT_EQ(mounts_with_root(kLaptop).size(), 13u);
}

TEST(MountTable, LeavesOutWhatAnotherMountHides) {
    const auto entries = parse_mount_table("1 0 8:1 / /a rw - ext4 /dev/sda1 rw\n"
                                           "2 0 8:2 / /a rw - ext4 /dev/sda2 rw\n");
    const auto upper = [](const MountEntry&) { return makedev(8, 2); };

    const auto selected = select_storage_mounts(entries, upper);
    ASSERT_EQ(selected.size(), 1u);
    EXPECT_EQ(selected[0].source, "/dev/sda2");
}

TEST(MountTable, PassesOverLinesItDoesNotUnderstand) {
    EXPECT_TRUE(parse_mount_table("").empty());
    EXPECT_TRUE(parse_mount_table("\n\n-\n1 2\n").empty());
    EXPECT_TRUE(parse_mount_table("1 0 x:y / / rw - ext4 /dev/sda1 rw").empty());
    EXPECT_TRUE(parse_mount_table("1 0 8:1 / / rw ext4 /dev/sda1 rw").empty());
    EXPECT_TRUE(parse_mount_table("1 0 8:1 / / rw -").empty());
}

} // namespace
} // namespace host
