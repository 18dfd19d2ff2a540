#include <Looper.h>
#include <Messenger.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <fs_info.h>

#include "StorageTest.h"

#include <stdlib.h>

namespace {

class VolumeRosterOf : public test::StorageTest {
  protected:
    void TearDown() override {
        setenv("BEKITS_VOLUMES", Volume().c_str(), 1);
        StorageTest::TearDown();
    }

    static std::string NameOf(const BVolume& volume) {
        char name[B_FILE_NAME_LENGTH];
        return volume.GetName(name) == B_OK ? name : "";
    }
};

} // namespace

TEST_F(VolumeRosterOf, GivesTheVolumesInTheirOrderAndThenNoMore) {
    setenv("BEKITS_VOLUMES", (MakeDirectory("zebra") + ":" + MakeDirectory("apple")).c_str(), 1);
    BVolumeRoster roster;
    BVolume volume;
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(NameOf(volume), "zebra");
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(NameOf(volume), "apple");
    EXPECT_EQ(roster.GetNextVolume(&volume), B_BAD_VALUE);
    EXPECT_EQ(volume.InitCheck(), B_NO_INIT);
    EXPECT_EQ(roster.GetNextVolume(&volume), B_BAD_VALUE);
    roster.Rewind();
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(NameOf(volume), "zebra");
    EXPECT_EQ(roster.GetNextVolume(nullptr), B_BAD_VALUE);
}

TEST_F(VolumeRosterOf, AtItsEndItStaysThereWhateverIsMounted) {
    std::string first = MakeDirectory("first");
    std::string second = MakeDirectory("second");
    setenv("BEKITS_VOLUMES", first.c_str(), 1);
    BVolumeRoster roster;
    BVolume volume;
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(roster.GetNextVolume(&volume), B_BAD_VALUE);
    setenv("BEKITS_VOLUMES", (first + ":" + second).c_str(), 1);
    EXPECT_EQ(roster.GetNextVolume(&volume), B_BAD_VALUE);
    roster.Rewind();
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    EXPECT_EQ(NameOf(volume), "second");
}

TEST_F(VolumeRosterOf, LeavesOutVolumesThatWent) {
    std::string first = MakeDirectory("first");
    std::string second = MakeDirectory("second");
    setenv("BEKITS_VOLUMES", (first + ":" + second).c_str(), 1);
    BVolumeRoster roster;
    BVolume volume;
    EXPECT_EQ(roster.GetNextVolume(&volume), B_OK);
    setenv("BEKITS_VOLUMES", first.c_str(), 1);
    EXPECT_EQ(roster.GetNextVolume(&volume), B_BAD_VALUE);
}

TEST_F(VolumeRosterOf, WatchingNeedsATarget) {
    BVolumeRoster roster;
    EXPECT_EQ(roster.StartWatching(BMessenger()), B_BAD_VALUE);
    EXPECT_FALSE(roster.Messenger().IsValid());
    auto* looper = new BLooper("target");
    looper->Run();
    EXPECT_EQ(roster.StartWatching(BMessenger(looper)), B_OK);
    EXPECT_TRUE(roster.Messenger() == BMessenger(looper));
    roster.StopWatching();
    EXPECT_FALSE(roster.Messenger().IsValid());
    looper->Lock();
    looper->Quit();
    BVolume volume;
    EXPECT_EQ(roster.GetBootVolume(nullptr), B_BAD_VALUE);
}
