#include <Bitmap.h>
#include <Entry.h>
#include <Message.h>
#include <MimeDatabase.h>
#include <MimeType.h>
#include <String.h>
#include <TypeConstants.h>

#include "StorageTest.h"

#include "host/api/directories.h"

#include <set>
#include <string.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

class MimeType : public test::StorageTest {
  protected:
    void SetUp() override {
        StorageTest::SetUp();
        fs::remove_all(Database());
    }

    static std::string Database() { return host::config_directory() + "/mime"; }

    static std::multiset<std::string> Strings(const BMessage& message, const char* field) {
        std::multiset<std::string> strings;
        const char* text = nullptr;
        for (int32 i = 0; message.FindString(field, i, &text) == B_OK; i++)
            strings.insert(text);
        return strings;
    }
    static BMessage Message(const char* field, std::initializer_list<const char*> strings) {
        BMessage message;
        for (const char* text : strings)
            message.AddString(field, text);
        return message;
    }
};

using Texts = std::multiset<std::string>;

} // namespace

TEST_F(MimeType, TellsTypesFromOtherTexts) {
    for (const char* type : {"audio", "audio/x-mpeg", "application/x-vnd.Be-TRAK", "a/b", "x+y/z.1_2~3"})
        EXPECT_TRUE(BMimeType::IsValid(type)) << type;
    const std::string tooLong = "a/" + std::string(B_MIME_TYPE_LENGTH - 2, 'b');
    for (const char* type : {"", "/", "audio/", "/x", "a/b/c", "a b", "a/b;c", "a,b", "a\nb", "\xC3\xA9/x",
                             tooLong.c_str(), static_cast<const char*>(nullptr)})
        EXPECT_FALSE(BMimeType::IsValid(type)) << (type != nullptr ? type : "null");
    EXPECT_TRUE(BMimeType::IsValid(tooLong.substr(0, tooLong.size() - 1).c_str()));
}

TEST_F(MimeType, KeepsItsTextAndComparesWithoutCase) {
    BMimeType type("Audio/X-Mpeg");
    EXPECT_EQ(type.InitCheck(), B_OK);
    EXPECT_STREQ(type.Type(), "Audio/X-Mpeg");
    EXPECT_TRUE(type == "audio/x-mpeg");
    EXPECT_FALSE(type == "audio");
    EXPECT_FALSE(type.IsSupertypeOnly());
    BMimeType super;
    EXPECT_EQ(type.GetSupertype(&super), B_OK);
    EXPECT_STREQ(super.Type(), "Audio");
    EXPECT_TRUE(super.IsSupertypeOnly());
    EXPECT_TRUE(super.Contains(&type));
    EXPECT_FALSE(type.Contains(&super));
    EXPECT_TRUE(type.Contains(&type));
    EXPECT_EQ(super.GetSupertype(&type), B_BAD_VALUE);

    BMimeType bad("not a type");
    EXPECT_EQ(bad.InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(bad.Type(), nullptr);
    EXPECT_EQ(bad.Install(), B_NO_INIT);
}

TEST_F(MimeType, IsInstalledAndDeleted) {
    BMimeType type("audio/x-mpeg");
    EXPECT_FALSE(type.IsInstalled());
    EXPECT_EQ(type.Delete(), B_OK);
    EXPECT_EQ(type.Install(), B_OK);
    EXPECT_TRUE(type.IsInstalled());
    EXPECT_TRUE(BMimeType("AUDIO/X-MPEG").IsInstalled());
    EXPECT_TRUE(fs::exists(Database() + "/audio,x-mpeg.mime"));
    EXPECT_EQ(type.Install(), B_OK);
    EXPECT_EQ(type.Delete(), B_OK);
    EXPECT_FALSE(type.IsInstalled());
    EXPECT_FALSE(BMimeType().IsInstalled());
}

TEST_F(MimeType, NothingIsThereBeforeItIsSet) {
    BMimeType type("audio/x-mpeg");
    BMessage message;
    char text[B_MIME_TYPE_LENGTH];
    BString rule;
    entry_ref ref;
    BBitmap icon(BRect(0, 0, 15, 15), B_CMAP8);
    for (bool installed : {false, true}) {
        if (installed) {
            ASSERT_EQ(type.Install(), B_OK);
        }
        EXPECT_EQ(type.GetAttrInfo(&message), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetFileExtensions(&message), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetShortDescription(text), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetLongDescription(text), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetPreferredApp(text), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetSnifferRule(&rule), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetAppHint(&ref), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetIcon(&icon, B_MINI_ICON), B_ENTRY_NOT_FOUND);
        EXPECT_EQ(type.GetSupportedTypes(&message), B_ENTRY_NOT_FOUND);
    }
    BMimeType unset;
    EXPECT_EQ(unset.GetAttrInfo(&message), B_NO_INIT);
    EXPECT_EQ(unset.SetAttrInfo(&message), B_NO_INIT);
    EXPECT_EQ(unset.GetIcon(&icon, B_MINI_ICON), B_NO_INIT);
    EXPECT_EQ(type.GetAttrInfo(nullptr), B_BAD_VALUE);
    EXPECT_EQ(type.GetShortDescription(nullptr), B_BAD_VALUE);
    EXPECT_EQ(type.GetIcon(nullptr, B_MINI_ICON), B_BAD_VALUE);
}

TEST_F(MimeType, AttributeInfoComesBackAsItWasSet) {
    BMessage info;
    for (const char* name : {"Audio:Songname", "Audio:Artist"}) {
        info.AddString("attr:name", name);
        info.AddString("attr:public_name", name + 6);
        info.AddInt32("attr:type", B_STRING_TYPE);
        info.AddBool("attr:viewable", true);
        info.AddBool("attr:editable", true);
        info.AddInt32("attr:width", 150);
        info.AddInt32("attr:alignment", 0);
    }
    ASSERT_EQ(BMimeType("audio/x-mpeg").SetAttrInfo(&info), B_OK);

    BMessage found;
    ASSERT_EQ(BMimeType("audio/x-mpeg").GetAttrInfo(&found), B_OK);
    EXPECT_TRUE(BMimeType("audio/x-mpeg").IsInstalled());
    const char* name = nullptr;
    ASSERT_EQ(found.FindString("attr:name", 1, &name), B_OK);
    EXPECT_STREQ(name, "Audio:Artist");
    EXPECT_FALSE(found.HasString("attr:name", 2));
    int32 width = 0;
    EXPECT_EQ(found.FindInt32("attr:width", 1, &width), B_OK);
    EXPECT_EQ(width, 150);
    bool viewable = false;
    EXPECT_EQ(found.FindBool("attr:viewable", &viewable), B_OK);
    EXPECT_TRUE(viewable);
    EXPECT_FALSE(found.HasString("type"));

    EXPECT_EQ(BMimeType("audio/x-mpeg").SetAttrInfo(nullptr), B_OK);
    EXPECT_EQ(BMimeType("audio/x-mpeg").GetAttrInfo(&found), B_ENTRY_NOT_FOUND);
}

TEST_F(MimeType, TextsComeBackAsTheyWereSet) {
    BMimeType type("application/x-vnd.test");
    const std::string tooLong(B_MIME_TYPE_LENGTH, 'd');
    char text[B_MIME_TYPE_LENGTH];
    EXPECT_EQ(type.SetShortDescription("A test"), B_OK);
    EXPECT_EQ(type.SetLongDescription("A longer test"), B_OK);
    EXPECT_EQ(type.SetPreferredApp("application/x-vnd.other"), B_OK);
    EXPECT_EQ(type.SetPreferredApp("not a signature"), B_BAD_VALUE);
    EXPECT_EQ(type.SetShortDescription(tooLong.c_str()), B_BAD_VALUE);
    EXPECT_EQ(type.SetSnifferRule("1.0 ('ID3')"), B_OK);
    EXPECT_EQ(type.GetShortDescription(text), B_OK);
    EXPECT_STREQ(text, "A test");
    EXPECT_EQ(type.GetLongDescription(text), B_OK);
    EXPECT_STREQ(text, "A longer test");
    EXPECT_EQ(type.GetPreferredApp(text), B_OK);
    EXPECT_STREQ(text, "application/x-vnd.other");
    BString rule;
    EXPECT_EQ(type.GetSnifferRule(&rule), B_OK);
    EXPECT_STREQ(rule.String(), "1.0 ('ID3')");
    EXPECT_EQ(type.SetShortDescription(nullptr), B_OK);
    EXPECT_EQ(type.GetShortDescription(text), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(type.GetLongDescription(text), B_OK);
}

TEST_F(MimeType, TheAppHintIsTheProgramsPlace) {
    BMimeType type("application/x-vnd.test");
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(MakeFile("program").c_str(), &ref), B_OK);
    EXPECT_EQ(type.SetAppHint(&ref), B_OK);
    entry_ref found;
    EXPECT_EQ(type.GetAppHint(&found), B_OK);
    EXPECT_EQ(found, ref);
}

TEST_F(MimeType, IconsComeBackInBothSizesAndForOtherTypes) {
    BMimeType type("application/x-vnd.test");
    BBitmap mini(BRect(0, 0, 15, 15), B_CMAP8);
    BBitmap large(BRect(0, 0, 31, 31), B_CMAP8);
    memset(mini.Bits(), 7, 256);
    memset(large.Bits(), 9, 1024);
    EXPECT_EQ(type.SetIcon(&mini, B_MINI_ICON), B_OK);
    EXPECT_EQ(type.SetIcon(&large, B_LARGE_ICON), B_OK);
    EXPECT_EQ(type.SetIconForType("audio/x-mpeg", &large, B_LARGE_ICON), B_OK);

    BBitmap foundMini(BRect(0, 0, 15, 15), B_CMAP8);
    BBitmap foundLarge(BRect(0, 0, 31, 31), B_CMAP8);
    EXPECT_EQ(type.GetIcon(&foundMini, B_MINI_ICON), B_OK);
    EXPECT_EQ(memcmp(foundMini.Bits(), mini.Bits(), 256), 0);
    EXPECT_EQ(type.GetIcon(&foundLarge, B_LARGE_ICON), B_OK);
    EXPECT_EQ(memcmp(foundLarge.Bits(), large.Bits(), 1024), 0);
    EXPECT_EQ(type.GetIconForType("AUDIO/X-MPEG", &foundLarge, B_LARGE_ICON), B_OK);
    EXPECT_EQ(type.GetIconForType("audio/x-mpeg", &foundMini, B_MINI_ICON), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(type.GetIcon(&foundMini, B_LARGE_ICON), B_BAD_VALUE);
    EXPECT_EQ(type.SetIcon(nullptr, B_MINI_ICON), B_OK);
    EXPECT_EQ(type.GetIcon(&foundMini, B_MINI_ICON), B_ENTRY_NOT_FOUND);
}

TEST_F(MimeType, ListsInstalledTypesAndSupertypes) {
    for (const char* type : {"audio/x-mpeg", "audio/ogg", "image/png", "audio"})
        ASSERT_EQ(BMimeType(type).Install(), B_OK);
    BMessage message;
    EXPECT_EQ(BMimeType::GetInstalledTypes(&message), B_OK);
    EXPECT_EQ(Strings(message, "types"), (Texts{"audio", "audio/ogg", "audio/x-mpeg", "image/png"}));
    EXPECT_EQ(BMimeType::GetInstalledTypes("Audio", &message), B_OK);
    EXPECT_EQ(Strings(message, "types"), (Texts{"audio/ogg", "audio/x-mpeg"}));
    EXPECT_EQ(BMimeType::GetInstalledTypes("audio/ogg", &message), B_BAD_VALUE);
    EXPECT_EQ(BMimeType::GetInstalledSupertypes(&message), B_OK);
    EXPECT_EQ(Strings(message, "super_types"), (Texts{"audio", "image"}));
    EXPECT_EQ(BMimeType::GetInstalledTypes(nullptr), B_BAD_VALUE);
}

TEST_F(MimeType, FindsTheApplicationsOfATypeAndItsSupertype) {
    BMessage types = Message("types", {"audio/x-mpeg", "audio"});
    ASSERT_EQ(BMimeType("application/x-vnd.both").SetSupportedTypes(&types), B_OK);
    types = Message("types", {"audio"});
    ASSERT_EQ(BMimeType("application/x-vnd.any").SetSupportedTypes(&types), B_OK);
    BMessage apps;
    EXPECT_EQ(BMimeType("Audio/x-mpeg").GetSupportingApps(&apps), B_OK);
    EXPECT_EQ(Strings(apps, "applications"), (Texts{"application/x-vnd.any", "application/x-vnd.both"}));
    int32 count = -1;
    EXPECT_EQ(apps.FindInt32("be:sub", &count), B_OK);
    EXPECT_EQ(count, 1);
    EXPECT_EQ(apps.FindInt32("be:super", &count), B_OK);
    EXPECT_EQ(count, 1);
    EXPECT_EQ(BMimeType::GetWildcardApps(&apps), B_OK);
    EXPECT_EQ(Strings(apps, "applications"), Texts());
}

TEST_F(MimeType, GuessesByNameContentsAndKind) {
    BMimeType type;
    EXPECT_EQ(BMimeType::GuessMimeType("song.mp3", &type), B_OK);
    EXPECT_STREQ(type.Type(), "audio/x-mpeg");
    EXPECT_EQ(BMimeType::GuessMimeType("SONG.MP3", &type), B_OK);
    EXPECT_STREQ(type.Type(), "audio/x-mpeg");
    EXPECT_EQ(BMimeType::GuessMimeType("\xFF\xFE.zzzzz", &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/octet-stream");
    EXPECT_EQ(BMimeType::GuessMimeType("\x89PNG\r\n\x1A\n", 8, &type), B_OK);
    EXPECT_STREQ(type.Type(), "image/png");
    EXPECT_EQ(BMimeType::GuessMimeType(nullptr, 0, &type), B_OK);

    entry_ref ref;
    ref = RefOf(MakeFile("picture", "\x89PNG\r\n\x1A\n"));
    EXPECT_EQ(BMimeType::GuessMimeType(&ref, &type), B_OK);
    EXPECT_STREQ(type.Type(), "image/png");
    ref = RefOf(Directory());
    EXPECT_EQ(BMimeType::GuessMimeType(&ref, &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/x-vnd.be-directory");
    ref = RefOf(Volume());
    EXPECT_EQ(BMimeType::GuessMimeType(&ref, &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/x-vnd.be-volume");
    ref = RefOf(MakeLink("link", "x"));
    EXPECT_EQ(BMimeType::GuessMimeType(&ref, &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/x-vnd.be-symlink");
    ref = RefOf(At("nothing"));
    EXPECT_EQ(BMimeType::GuessMimeType(&ref, &type), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BMimeType::GuessMimeType(static_cast<const char*>(nullptr), &type), B_BAD_VALUE);
    EXPECT_EQ(BMimeType::GuessMimeType("x", nullptr), B_BAD_VALUE);
}

TEST_F(MimeType, InstalledExtensionsComeBeforeTheDesktops) {
    BMessage extensions = Message("extensions", {"mp3", "QRN"});
    ASSERT_EQ(BMimeType("application/x-vnd.test").SetFileExtensions(&extensions), B_OK);
    BMessage found;
    EXPECT_EQ(BMimeType("application/x-vnd.test").GetFileExtensions(&found), B_OK);
    EXPECT_EQ(Strings(found, "extensions"), (Texts{"QRN", "mp3"}));
    BMimeType type;
    EXPECT_EQ(BMimeType::GuessMimeType("a.mp3", &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/x-vnd.test");
    EXPECT_EQ(BMimeType::GuessMimeType("a.qrn", &type), B_OK);
    EXPECT_STREQ(type.Type(), "application/x-vnd.test");
    ASSERT_EQ(BMimeType("application/x-vnd.test").Delete(), B_OK);
    EXPECT_EQ(BMimeType::GuessMimeType("a.mp3", &type), B_OK);
    EXPECT_STREQ(type.Type(), "audio/x-mpeg");
}

TEST_F(MimeType, ADamagedRecordIsNotInstalledAndCanBeSetAnew) {
    BMimeType type("audio/x-mpeg");
    ASSERT_EQ(type.SetShortDescription("Song"), B_OK);
    const std::string file = Database() + "/audio,x-mpeg.mime";
    const std::string whole = test::read_file(file);
    ASSERT_FALSE(whole.empty());
    for (size_t size = 0; size < whole.size(); size++) {
        test::write_file(file, whole.substr(0, size));
        ASSERT_FALSE(type.IsInstalled()) << size;
    }
    test::write_file(file, whole + "x");
    EXPECT_FALSE(type.IsInstalled());
    char text[B_MIME_TYPE_LENGTH];
    EXPECT_EQ(type.GetShortDescription(text), B_ENTRY_NOT_FOUND);
    BMessage types;
    EXPECT_EQ(BMimeType::GetInstalledTypes(&types), B_OK);
    EXPECT_TRUE(types.IsEmpty());
    EXPECT_EQ(type.SetLongDescription("New"), B_OK);
    EXPECT_EQ(type.GetLongDescription(text), B_OK);
}

TEST_F(MimeType, ARecordUnderAnotherTypesNameIsDamaged) {
    ASSERT_EQ(BMimeType("audio/ogg").Install(), B_OK);
    fs::copy_file(Database() + "/audio,ogg.mime", Database() + "/audio,flac.mime");
    EXPECT_FALSE(BMimeType("audio/flac").IsInstalled());
}

TEST_F(MimeType, ADatabaseThatCannotBeMadeSaysSo) {
    fs::create_directories(host::config_directory());
    test::write_file(Database(), "in the way");
    EXPECT_NE(BMimeType("audio/ogg").Install(), B_OK);
    EXPECT_FALSE(BMimeType("audio/ogg").IsInstalled());
    fs::remove(Database());
}

TEST_F(MimeType, ThreadsThatChangeOneRecordAllFindTheirChangeInIt) {
    constexpr int kThreads = 4;
    constexpr int kChanges = 10;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < kThreads; thread++) {
        threads.emplace_back([thread] {
            for (int i = 0; i < kChanges; i++) {
                std::string text = std::to_string(thread) + "." + std::to_string(i);
                MimeDatabase::Change("audio/x-mpeg", [&](MimeRecord& record) {
                    BMessage list;
                    (void)record.GetList(MimeRecord::List::attributeInfo, list);
                    list.AddString("attr:name", text.c_str());
                    return record.SetList(MimeRecord::List::attributeInfo, &list);
                });
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    BMessage info;
    ASSERT_EQ(BMimeType("audio/x-mpeg").GetAttrInfo(&info), B_OK);
    EXPECT_EQ(Strings(info, "attr:name").size(), 40u);
}
