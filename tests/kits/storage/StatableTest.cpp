#include <Entry.h>
#include <Node.h>
#include <Volume.h>

#include "StorageTest.h"

#include <sys/stat.h>
#include <unistd.h>

namespace {

class Statable : public test::StorageTest {};

} // namespace

TEST_F(Statable, EntryAndNodeSayTheSame) {
    std::string path = MakeFile("file", "12345");
    BEntry entry(path.c_str());
    BNode node(path.c_str());
    struct stat expected;
    ASSERT_EQ(::stat(path.c_str(), &expected), 0);
    const BStatable* both[] = {&entry, &node};
    for (const BStatable* statable : both) {
        struct stat found;
        ASSERT_EQ(statable->GetStat(&found), B_OK);
        EXPECT_EQ(found.st_ino, expected.st_ino);
        EXPECT_EQ(found.st_mode, expected.st_mode);
        EXPECT_EQ(found.st_size, 5);
        EXPECT_EQ(found.st_uid, expected.st_uid);
        EXPECT_EQ(found.st_nlink, 1u);
        EXPECT_EQ(found.st_mtim.tv_sec, expected.st_mtim.tv_sec);
        EXPECT_EQ(found.st_mtim.tv_nsec, expected.st_mtim.tv_nsec);
        EXPECT_EQ(found.st_ctim.tv_nsec, expected.st_ctim.tv_nsec);
        off_t size = 0;
        EXPECT_EQ(statable->GetSize(&size), B_OK);
        EXPECT_EQ(size, 5);
        node_ref ref;
        EXPECT_EQ(statable->GetNodeRef(&ref), B_OK);
        EXPECT_EQ(ref.node, expected.st_ino);
        EXPECT_EQ(ref.device, found.st_dev);
        BVolume volume;
        EXPECT_EQ(statable->GetVolume(&volume), B_OK);
        EXPECT_EQ(volume.Device(), ref.device);
    }
}

TEST_F(Statable, TellsKindsApartWithoutFollowingLinks) {
    BEntry file(MakeFile("file").c_str());
    BEntry directory(MakeDirectory("directory").c_str());
    BEntry link(MakeLink("link", "directory").c_str());
    EXPECT_TRUE(file.IsFile() && !file.IsDirectory() && !file.IsSymLink());
    EXPECT_TRUE(!directory.IsFile() && directory.IsDirectory() && !directory.IsSymLink());
    EXPECT_TRUE(!link.IsFile() && !link.IsDirectory() && link.IsSymLink());
    BEntry nothing(At("nothing").c_str());
    EXPECT_TRUE(!nothing.IsFile() && !nothing.IsDirectory() && !nothing.IsSymLink());
}

TEST_F(Statable, ChangesPermissionsAndTimes) {
    std::string path = MakeFile("file");
    BEntry entry(path.c_str());
    EXPECT_EQ(entry.SetPermissions(0640), B_OK);
    mode_t mode = 0;
    EXPECT_EQ(entry.GetPermissions(&mode), B_OK);
    EXPECT_EQ(mode, 0640u);

    BNode node(path.c_str());
    EXPECT_EQ(node.SetModificationTime(1'000'000'000), B_OK);
    EXPECT_EQ(node.SetAccessTime(1'100'000'000), B_OK);
    time_t time = 0;
    EXPECT_EQ(entry.GetModificationTime(&time), B_OK);
    EXPECT_EQ(time, 1'000'000'000);
    EXPECT_EQ(entry.GetAccessTime(&time), B_OK);
    EXPECT_EQ(time, 1'100'000'000);
}

TEST_F(Statable, OwnerAndGroupCanBeSetToWhatTheyAre) {
    BEntry entry(MakeFile("file").c_str());
    uid_t owner = 0;
    gid_t group = 0;
    ASSERT_EQ(entry.GetOwner(&owner), B_OK);
    ASSERT_EQ(entry.GetGroup(&group), B_OK);
    EXPECT_EQ(owner, geteuid());
    EXPECT_EQ(entry.SetOwner(owner), B_OK);
    EXPECT_EQ(entry.SetGroup(group), B_OK);
}

TEST_F(Statable, TheCreationTimeCannotBeSet) {
    BEntry entry(MakeFile("file").c_str());
    EXPECT_EQ(entry.SetCreationTime(0), B_UNSUPPORTED);
    time_t created = 0;
    status_t status = entry.GetCreationTime(&created);
    EXPECT_TRUE(status == B_OK || status == B_UNSUPPORTED);
    EXPECT_EQ(status == B_OK, created > 0);
}

TEST_F(Statable, NullArgumentsAreBadValues) {
    BEntry entry(MakeFile("file").c_str());
    EXPECT_EQ(entry.GetStat(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetNodeRef(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetOwner(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetGroup(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetPermissions(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetSize(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetModificationTime(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetCreationTime(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetAccessTime(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetVolume(nullptr), B_BAD_VALUE);
}
