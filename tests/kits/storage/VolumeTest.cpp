#include <Bitmap.h>
#include <Directory.h>
#include <Entry.h>
#include <Path.h>
#include <Volume.h>
#include <fs_info.h>

#include "StorageTest.h"

namespace {

class VolumeOf : public test::StorageTest {
  protected:
    static BVolume Declared() { return BVolume(dev_for_path(Volume().c_str())); }
};

} // namespace

TEST_F(VolumeOf, AnUnsetVolumeAnswersNoInit) {
    BVolume volume;
    char name[B_FILE_NAME_LENGTH];
    BDirectory directory;
    EXPECT_EQ(volume.InitCheck(), B_NO_INIT);
    EXPECT_EQ(volume.Device(), static_cast<dev_t>(-1));
    EXPECT_EQ(volume.GetRootDirectory(&directory), B_NO_INIT);
    EXPECT_EQ(volume.GetName(name), B_NO_INIT);
    EXPECT_EQ(volume.SetName("x"), B_NO_INIT);
    EXPECT_EQ(volume.Capacity(), B_NO_INIT);
    EXPECT_EQ(volume.FreeBytes(), B_NO_INIT);
    EXPECT_EQ(volume.BlockSize(), B_NO_INIT);
    EXPECT_FALSE(volume.IsPersistent());
    EXPECT_FALSE(volume.IsReadOnly());
    EXPECT_FALSE(volume.IsRemovable());
    EXPECT_FALSE(volume.IsShared());
    EXPECT_FALSE(volume.KnowsAttr());
    EXPECT_FALSE(volume.KnowsQuery());
    EXPECT_FALSE(volume.KnowsMime());
}

TEST_F(VolumeOf, ANumberOfNoVolumeIsABadValue) {
    BVolume volume(static_cast<dev_t>(12345678));
    EXPECT_EQ(volume.InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(volume.Device(), static_cast<dev_t>(-1));
    EXPECT_FALSE(volume.KnowsQuery());
}

TEST_F(VolumeOf, TheDeclaredVolumeKnowsAttributesAndQueries) {
    BVolume volume = Declared();
    ASSERT_EQ(volume.InitCheck(), B_OK);
    char name[B_FILE_NAME_LENGTH];
    EXPECT_EQ(volume.GetName(name), B_OK);
    EXPECT_STREQ(name, "volume");
    EXPECT_TRUE(volume.KnowsAttr());
    EXPECT_TRUE(volume.KnowsQuery());
    EXPECT_TRUE(volume.KnowsMime());
    EXPECT_TRUE(volume.IsPersistent());
    EXPECT_FALSE(volume.IsReadOnly());
    EXPECT_FALSE(volume.IsShared());
    EXPECT_GT(volume.Capacity(), 0);
    EXPECT_GT(volume.FreeBytes(), 0);
    EXPECT_LE(volume.FreeBytes(), volume.Capacity());
    EXPECT_GT(volume.BlockSize(), 0);
}

TEST_F(VolumeOf, ItsNameCannotBeChanged) {
    BVolume volume = Declared();
    EXPECT_EQ(volume.SetName("other"), B_NOT_ALLOWED);
    EXPECT_EQ(volume.SetName(nullptr), B_BAD_VALUE);
    EXPECT_EQ(volume.GetName(nullptr), B_BAD_VALUE);
}

TEST_F(VolumeOf, GivesItsRootDirectory) {
    BVolume volume = Declared();
    BDirectory root;
    ASSERT_EQ(volume.GetRootDirectory(&root), B_OK);
    EXPECT_TRUE(root.IsRootDirectory());
    BEntry entry;
    ASSERT_EQ(root.GetEntry(&entry), B_OK);
    EXPECT_EQ(BPath(&entry).Path(), Volume());
    EXPECT_EQ(volume.GetRootDirectory(nullptr), B_BAD_VALUE);
}

TEST_F(VolumeOf, HasAnIcon) {
    BVolume volume = Declared();
    BBitmap icon(BRect(0, 0, 15, 15), B_CMAP8);
    EXPECT_EQ(volume.GetIcon(&icon, B_MINI_ICON), B_OK);
    EXPECT_EQ(volume.GetIcon(&icon, B_LARGE_ICON), B_BAD_VALUE);
    EXPECT_EQ(volume.GetIcon(nullptr, B_MINI_ICON), B_BAD_VALUE);
}

TEST_F(VolumeOf, ComparesNumbers) {
    BVolume volume = Declared();
    BVolume copy(volume);
    EXPECT_TRUE(volume == copy);
    EXPECT_TRUE(volume != BVolume());
    EXPECT_TRUE(BVolume() == BVolume());
    copy.Unset();
    EXPECT_EQ(copy.InitCheck(), B_NO_INIT);
}
