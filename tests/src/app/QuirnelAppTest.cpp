#include "app/QuirnelApp.h"

#include "TrackVolume.h"

#include "support/captured_output.h"

#include <Directory.h>
#include <Entry.h>
#include <Message.h>
#include <MimeType.h>
#include <OS.h>
#include <Path.h>
#include <Query.h>
#include <TypeConstants.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <fs_index.h>

#include <memory>
#include <string>
#include <vector>

namespace {

dev_t DeviceOf(const std::string& root) {
    BVolumeRoster roster;
    BVolume volume;
    while (roster.GetNextVolume(&volume) == B_OK) {
        BDirectory directory;
        BEntry entry;
        BPath path;
        if (volume.GetRootDirectory(&directory) == B_OK && directory.GetEntry(&entry) == B_OK &&
            entry.GetPath(&path) == B_OK && root == path.Path())
            return volume.Device();
    }
    ADD_FAILURE() << "no volume at " << root;
    return -1;
}

constexpr const char* kIndexNames[] = {"Audio:Songname", "Audio:Artist", "Audio:Album",
                                       "Audio:Channels", "Audio:Disc",   "Audio:Version"};

bool HasIndex(dev_t device, const char* name) {
    index_info info;
    return fs_stat_index(device, name, &info) == 0;
}

uint32 IndexType(dev_t device, const char* name) {
    index_info info;
    return fs_stat_index(device, name, &info) == 0 ? info.type : 0;
}

std::vector<std::string> Columns(const BMessage& attributeInfo) {
    std::vector<std::string> columns;
    const char* name = nullptr;
    for (int32 i = 0; attributeInfo.FindString("attr:name", i, &name) == B_OK; ++i) {
        const char* title = "";
        int32 type = 0;
        bool viewable = false;
        bool editable = false;
        int32 width = 0;
        int32 alignment = -1;
        attributeInfo.FindString("attr:public_name", i, &title);
        attributeInfo.FindInt32("attr:type", i, &type);
        attributeInfo.FindBool("attr:viewable", i, &viewable);
        attributeInfo.FindBool("attr:editable", i, &editable);
        attributeInfo.FindInt32("attr:width", i, &width);
        attributeInfo.FindInt32("attr:alignment", i, &alignment);
        columns.push_back(std::string(name) + "|" + title + "|" + (type == B_STRING_TYPE ? "CSTR" : "?") +
                          "|" + std::to_string(width) + "|" + std::to_string(alignment) +
                          (viewable ? "|viewable" : "") + (editable ? "|editable" : ""));
    }
    return columns;
}

const std::vector<std::string> kAllColumns = {
    "Audio:Songname|Songname|CSTR|150|0|viewable|editable",
    "Audio:Artist|Artist|CSTR|150|0|viewable|editable",
    "Audio:Album|Album|CSTR|150|0|viewable|editable",
    "Audio:TrackNo|TrackNo|CSTR|50|0|viewable|editable",
    "Audio:Disc|Disc|CSTR|50|0|viewable|editable",
    "Audio:Version|Version|CSTR|100|0|viewable|editable",
    "Audio:LengthUsec|Playtime|CSTR|50|0|viewable|editable",
    "Audio:Samplerate|Samplerate|CSTR|50|0|viewable|editable",
    "Audio:Bitrate|Bitrate|CSTR|50|0|viewable|editable",
    "Audio:Channels|Channels|CSTR|50|0|viewable|editable",
    "Media:Encoder|Encoder|CSTR|50|0|viewable|editable",
};

class QuirnelAppTest : public TrackTest {
  protected:
    // One application per process and at a time.
    static void SetUpTestSuite() {
        TestVolumes::Instance();
        sApp = new QuirnelApp;
        brindle_app = sApp;
    }
    static void TearDownTestSuite() {
        delete sApp;
        sApp = nullptr;
        brindle_app = nullptr;
    }

    QuirnelAppTest() {
        BMimeType("audio/x-mpeg").Delete();
        for (const std::string& root : {Volume(), TestVolumes::Instance().Second()}) {
            const dev_t device = DeviceOf(root);
            for (const char* name : kIndexNames)
                fs_remove_index(device, name);
        }
    }

    static BMessage StoredAttributeInfo() {
        BMessage info;
        EXPECT_EQ(BMimeType("audio/x-mpeg").GetAttrInfo(&info), B_OK);
        return info;
    }

    static QuirnelApp* sApp;
};

QuirnelApp* QuirnelAppTest::sApp = nullptr;

// First, as the roster of the one application is used up by the first walk.
TEST_F(QuirnelAppTest, OnlyTheFirstWalkOverTheVolumesMakesIndices) {
    const dev_t music = DeviceOf(Volume());
    const dev_t second = DeviceOf(TestVolumes::Instance().Second());
    const dev_t withoutAttributes = DeviceOf(TestVolumes::Instance().WithoutAttributes());

    CapturedOutput output;
    EXPECT_EQ(sApp->CheckCreateIndices(), 0);
    EXPECT_EQ(output.text(), "");

    for (const char* name : kIndexNames) {
        EXPECT_TRUE(HasIndex(music, name)) << name;
        EXPECT_TRUE(HasIndex(second, name)) << name;
        EXPECT_FALSE(HasIndex(withoutAttributes, name)) << name;
    }

    ASSERT_EQ(fs_remove_index(music, "Audio:Album"), 0);
    EXPECT_EQ(sApp->CheckCreateIndices(), 0);
    EXPECT_FALSE(HasIndex(music, "Audio:Album"));
}

TEST_F(QuirnelAppTest, MakesSixIndicesOfTheirTypes) {
    BVolume volume(DeviceOf(Volume()));

    EXPECT_EQ(sApp->CreateIndices(&volume), 0);

    EXPECT_EQ(IndexType(volume.Device(), "Audio:Songname"), 0x43535452u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Artist"), 0x43535452u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Album"), 0x43535452u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Channels"), 0x4C4F4E47u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Disc"), 0x43535452u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Version"), 0x43535452u);
    for (const char* name : {"Audio:TrackNo", "Audio:Length", "Audio:LengthUsec", "Media:Encoder"})
        EXPECT_FALSE(HasIndex(volume.Device(), name)) << name;
}

TEST_F(QuirnelAppTest, AnIndexThatExistsStaysAsItIs) {
    BVolume volume(DeviceOf(Volume()));
    ASSERT_EQ(fs_create_index(volume.Device(), "Audio:Artist", B_INT32_TYPE, 0), 0);

    EXPECT_EQ(sApp->CreateIndices(&volume), 0);

    EXPECT_EQ(IndexType(volume.Device(), "Audio:Artist"), 0x4C4F4E47u);
    EXPECT_EQ(IndexType(volume.Device(), "Audio:Album"), 0x43535452u);
}

TEST_F(QuirnelAppTest, AVolumeThatHasGoneGetsNoIndices) {
    BVolume none;
    EXPECT_EQ(sApp->CreateIndices(&none), 0);
}

TEST_F(QuirnelAppTest, AFirstStartAddsElevenColumnsAndSaysSo) {
    CapturedOutput output;
    EXPECT_EQ(sApp->CheckTrackerDisplayAttributes(), 0);

    EXPECT_EQ(output.text(), "Adding 'Audio:Songname' to Tracker attributes\n"
                             "Adding 'Audio:Artist' to Tracker attributes\n"
                             "Adding 'Audio:Album' to Tracker attributes\n"
                             "Adding 'Audio:TrackNo' to Tracker attributes\n"
                             "Adding 'Audio:Disc' to Tracker attributes\n"
                             "Adding 'Audio:Version' to Tracker attributes\n"
                             "Adding 'Audio:LengthUsec' to Tracker attributes\n"
                             "Adding 'Audio:Samplerate' to Tracker attributes\n"
                             "Adding 'Audio:Bitrate' to Tracker attributes\n"
                             "Adding 'Audio:Channels' to Tracker attributes\n"
                             "Adding 'Media:Encoder' to Tracker attributes\n");
    EXPECT_TRUE(BMimeType("audio/x-mpeg").IsInstalled());
    EXPECT_EQ(Columns(StoredAttributeInfo()), kAllColumns);
}

TEST_F(QuirnelAppTest, ASecondStartAddsNothing) {
    {
        CapturedOutput ignored;
        sApp->CheckTrackerDisplayAttributes();
    }

    CapturedOutput output;
    EXPECT_EQ(sApp->CheckTrackerDisplayAttributes(), 0);

    EXPECT_EQ(output.text(), "");
    EXPECT_EQ(Columns(StoredAttributeInfo()), kAllColumns);
}

TEST_F(QuirnelAppTest, ColumnsOfOthersStayInFrontAsTheyAre) {
    BMessage others;
    for (const char* name : {"Audio:Album", "Other:Thing", "Media:Encoder"}) {
        others.AddString("attr:name", name);
        others.AddString("attr:public_name", "Theirs");
        others.AddInt32("attr:type", B_STRING_TYPE);
        others.AddBool("attr:viewable", false);
        others.AddBool("attr:editable", false);
        others.AddInt32("attr:width", 33);
        others.AddInt32("attr:alignment", 2);
    }
    BMimeType type("audio/x-mpeg");
    ASSERT_EQ(type.Install(), B_OK);
    ASSERT_EQ(type.SetAttrInfo(&others), B_OK);

    CapturedOutput output;
    sApp->CheckTrackerDisplayAttributes();

    EXPECT_EQ(output.text(), "Adding 'Audio:Songname' to Tracker attributes\n"
                             "Adding 'Audio:Artist' to Tracker attributes\n"
                             "Adding 'Audio:TrackNo' to Tracker attributes\n"
                             "Adding 'Audio:Disc' to Tracker attributes\n"
                             "Adding 'Audio:Version' to Tracker attributes\n"
                             "Adding 'Audio:LengthUsec' to Tracker attributes\n"
                             "Adding 'Audio:Samplerate' to Tracker attributes\n"
                             "Adding 'Audio:Bitrate' to Tracker attributes\n"
                             "Adding 'Audio:Channels' to Tracker attributes\n");
    const auto columns = Columns(StoredAttributeInfo());
    ASSERT_EQ(columns.size(), 12u);
    EXPECT_EQ(columns[0], "Audio:Album|Theirs|CSTR|33|2");
    EXPECT_EQ(columns[1], "Other:Thing|Theirs|CSTR|33|2");
    EXPECT_EQ(columns[2], "Media:Encoder|Theirs|CSTR|33|2");
    EXPECT_EQ(columns[3], "Audio:Songname|Songname|CSTR|150|0|viewable|editable");
    EXPECT_EQ(columns[11], "Audio:Channels|Channels|CSTR|50|0|viewable|editable");
}

TEST_F(QuirnelAppTest, AColumnIsAppendedFieldByFieldInOrder) {
    BMessage info;

    CapturedOutput output;
    sApp->AddToMsg(&info, "Some:Thing", "Thing", B_INT32_TYPE, 77, 1);
    // Names are told apart by case.
    sApp->AddToMsg(&info, "some:thing", "Other", B_INT32_TYPE, 78, 1);
    sApp->AddToMsg(&info, "Some:Thing", "Again", B_INT32_TYPE, 79, 1);

    EXPECT_EQ(output.text(),
              "Adding 'Some:Thing' to Tracker attributes\nAdding 'some:thing' to Tracker attributes\n");
    const char* const expected[] = {"attr:name",     "attr:public_name", "attr:type",     "attr:viewable",
                                    "attr:editable", "attr:width",       "attr:alignment"};
    char* name = nullptr;
    type_code type = 0;
    int32 count = 0;
    for (int32 i = 0; i < 7; ++i) {
        ASSERT_EQ(info.GetInfo(B_ANY_TYPE, i, &name, &type, &count), B_OK);
        EXPECT_STREQ(name, expected[i]);
        EXPECT_EQ(count, 2);
    }
    EXPECT_NE(info.GetInfo(B_ANY_TYPE, 7, &name, &type, &count), B_OK);
    int32 width = 0;
    EXPECT_EQ(info.FindInt32("attr:width", &width), B_OK);
    EXPECT_EQ(width, 77);
}

TEST_F(QuirnelAppTest, TheApplicationsTypeIsInstalled) {
    EXPECT_TRUE(BMimeType("application/x-vnd.vorn-quirnel").IsInstalled());
    EXPECT_EQ(brindle_app, sApp);
}

// Half a minute at most.
bool BecomesFindable(const std::string& predicate) {
    for (int i = 0; i < 300; ++i) {
        const BVolume volume(DeviceOf(TestVolumes::Instance().Music()));
        BQuery query;
        query.SetVolume(&volume);
        query.SetPredicate(predicate.c_str());
        entry_ref ref;
        if (query.Fetch() == B_OK && query.GetNextRef(&ref) == B_OK)
            return true;
        snooze(100000);
    }
    return false;
}

TEST_F(QuirnelAppTest, TakesInWhatOtherProgramsDidBeforeItsStartAndDoAfterwards) {
    const std::string early = MakeFile("early.mp3");
    BVolume volume(DeviceOf(Volume()));
    sApp->CreateIndices(&volume);
    SetText(early, "Audio:Songname", "Tagged before the start");

    CapturedOutput output;
    sApp->ReadyToRun();

    EXPECT_TRUE(BecomesFindable("Audio:Songname==\"Tagged before the start\""));
    SetText(MakeFile("late.mp3"), "Audio:Songname", "Tagged while it runs");
    EXPECT_TRUE(BecomesFindable("Audio:Songname==\"Tagged while it runs\""));
}

} // namespace
