// The settings file. No test here has a display: frames then never lie on the screen and fall back to
// (0, 0, 400, 150). What a display shows of them is tested in tests/desktop.
#include "app/QuirnelApp.h"

#include "TrackVolume.h"

#include "support/captured_output.h"
#include "support/loop_volume.h"

#include <File.h>
#include <FindDirectory.h>
#include <Message.h>
#include <MessageQueue.h>
#include <Path.h>
#include <Window.h>

#include <sys/resource.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>

namespace {

BMessage Frame(float x, float y, float width, float height) {
    BMessage frame;
    frame.AddFloat("winX", x);
    frame.AddFloat("winY", y);
    frame.AddFloat("winWidth", width);
    frame.AddFloat("winHeight", height);
    return frame;
}

class QuirnelAppSettings : public TrackTest {
  protected:
    QuirnelAppSettings() {
        TestVolumes::Instance();
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
        BPath directory;
        find_directory(B_COMMON_SETTINGS_DIRECTORY, &directory);
        mDirectory = directory.Path();
        std::filesystem::remove_all(Path());
    }
    ~QuirnelAppSettings() override {
        CloseWindows();
        std::filesystem::remove_all(Path());
        mApp.reset();
        brindle_app = nullptr;
    }

    std::string Path() const { return mDirectory + "/Quirnel settings"; }
    bool HasIndexWindow() const { return !mApp->IndexWindowSlot().IsEmpty(); }
    bool HasFindWindow() const { return !mApp->FindWindowSlot().IsEmpty(); }
    void CloseWindows() {
        mApp->IndexWindowSlot().Close();
        mApp->FindWindowSlot().Close();
        mApp->PlayListWindowSlot().Close();
    }

    bool LoadFromSettingsFile() { return mApp->LoadPreferences(static_cast<BFile*>(nullptr)); }
    void SaveToSettingsFile() { mApp->SavePreferences(static_cast<BFile*>(nullptr)); }

    static void Write(const std::string& path, const BMessage& settings) {
        BFile file(path.c_str(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
        ASSERT_EQ(settings.Flatten(&file), B_OK);
    }
    static BMessage Read(const std::string& path) {
        BFile file(path.c_str(), B_READ_ONLY);
        BMessage settings;
        EXPECT_EQ(settings.Unflatten(&file), B_OK);
        off_t size = 0;
        file.GetSize(&size);
        EXPECT_EQ(settings.FlattenedSize(), size) << "the file holds the message and nothing else";
        return settings;
    }

    std::unique_ptr<QuirnelApp> mApp;
    std::string mDirectory;
};

TEST_F(QuirnelAppSettings, AMissingFileIsSilent) {
    CapturedOutput output;
    EXPECT_FALSE(LoadFromSettingsFile());
    EXPECT_EQ(output.text(), "");
    EXPECT_FALSE(HasIndexWindow());
}

TEST_F(QuirnelAppSettings, AFileThatCannotBeOpenedIsSilent) {
    // A link to itself.
    std::filesystem::create_symlink("Quirnel settings", Path());
    CapturedOutput output;
    EXPECT_FALSE(LoadFromSettingsFile());
    EXPECT_EQ(output.text(), "");
    EXPECT_FALSE(HasIndexWindow());

    CapturedOutput savingOutput;
    SaveToSettingsFile();
    EXPECT_EQ(savingOutput.text(), "SavePreferences: can't write to settings file '" + Path() + "'\n");
}

TEST_F(QuirnelAppSettings, AMissingDirectoryIsTold) {
    std::filesystem::remove_all(mDirectory);
    CapturedOutput output;
    EXPECT_FALSE(LoadFromSettingsFile());
    EXPECT_EQ(output.text(), "no settings directory found!\n");

    CapturedOutput savingOutput;
    SaveToSettingsFile();
    EXPECT_EQ(savingOutput.text(), "SavePreferences: no settings directory found!\n");
    EXPECT_FALSE(std::filesystem::exists(Path()));
    std::filesystem::create_directories(mDirectory);
}

TEST_F(QuirnelAppSettings, AFileThatCannotBeMadeIsTold) {
    std::filesystem::create_directory(Path());
    CapturedOutput output;
    SaveToSettingsFile();
    EXPECT_EQ(output.text(), "SavePreferences: can't write to settings file '" + Path() + "'\n");
    EXPECT_TRUE(std::filesystem::is_directory(Path()));
}

TEST_F(QuirnelAppSettings, AFileThatIsNotOpenIsNeitherReadNorWritten) {
    CapturedOutput output;
    BFile none;
    EXPECT_FALSE(mApp->LoadPreferences(&none));
    mApp->SavePreferences(&none);
    EXPECT_EQ(output.text(), "");
    EXPECT_FALSE(HasIndexWindow());
}

TEST_F(QuirnelAppSettings, WithoutAWindowAnEmptyMessageIsSaved) {
    CapturedOutput output;
    SaveToSettingsFile();
    EXPECT_EQ(output.text(), "");
    const BMessage saved = Read(Path());
    EXPECT_EQ(saved.what, 0u);
    EXPECT_TRUE(saved.IsEmpty());
}

TEST_F(QuirnelAppSettings, AnOpenIndexerIsSavedAndReopened) {
    BMessage settings;
    BMessage frame = Frame(0, 0, 400, 150);
    settings.AddMessage("indexwindow", &frame);
    Write(Path(), settings);

    CapturedOutput output;
    ASSERT_TRUE(LoadFromSettingsFile());
    EXPECT_EQ(output.text(), "");
    EXPECT_TRUE(HasIndexWindow());

    std::filesystem::remove(Path());
    SaveToSettingsFile();
    const BMessage saved = Read(Path());
    EXPECT_EQ(saved.what, 0u);
    EXPECT_EQ(saved.CountNames(B_ANY_TYPE), 1);
    BMessage savedFrame;
    ASSERT_EQ(saved.FindMessage("indexwindow", &savedFrame), B_OK);
    EXPECT_EQ(savedFrame.what, 0u);
    EXPECT_EQ(savedFrame.CountNames(B_ANY_TYPE), 4);
    EXPECT_EQ(savedFrame.GetFloat("winX", -1), 0);
    EXPECT_EQ(savedFrame.GetFloat("winY", -1), 0);
    EXPECT_EQ(savedFrame.GetFloat("winWidth", -1), 400);
    EXPECT_EQ(savedFrame.GetFloat("winHeight", -1), 150);
}

TEST_F(QuirnelAppSettings, SavingReplacesTheWholeFile) {
    std::ofstream(Path()) << std::string(100000, 'x');
    SaveToSettingsFile();
    EXPECT_TRUE(Read(Path()).IsEmpty());
}

TEST_F(QuirnelAppSettings, NothingIsLeftBesideTheFile) {
    // As a program leaves it that was killed at the wrong moment.
    test::write_file(Path() + ".new", std::string(100000, 'x'));
    SaveToSettingsFile();
    EXPECT_TRUE(Read(Path()).IsEmpty());
    EXPECT_FALSE(std::filesystem::exists(Path() + ".new"));
}

TEST_F(QuirnelAppSettings, AFileThatLiesElsewhereIsReplacedThere) {
    const std::string elsewhere = Volume() + "/settings";
    std::filesystem::create_symlink(elsewhere, Path());
    SaveToSettingsFile();
    SaveToSettingsFile();
    EXPECT_TRUE(std::filesystem::is_symlink(Path()));
    EXPECT_TRUE(Read(elsewhere).IsEmpty());
    EXPECT_FALSE(std::filesystem::exists(elsewhere + ".new"));
}

TEST_F(QuirnelAppSettings, AFullDiskKeepsTheOldSettings) {
    test::LoopVolume disk("ext4", 4);
    if (!disk.mounted())
        GTEST_SKIP() << disk.reason();
    const std::string file = disk.path() + "/settings";
    BMessage settings;
    BMessage frame = Frame(0, 0, 400, 150);
    settings.AddMessage("indexwindow", &frame);
    Write(file, settings);
    std::filesystem::create_symlink(file, Path());
    ASSERT_TRUE(LoadFromSettingsFile());
    const std::string before = test::read_file(file);
    const std::string filler = disk.fill();

    mApp->IndexWindowSlot().UseLocked([](BWindow* window) { window->ResizeTo(500, 300); });
    CapturedOutput output;
    SaveToSettingsFile();
    EXPECT_EQ(output.text(), "SavePreferences: can't write to settings file '" + Path() + "'\n");
    EXPECT_EQ(test::read_file(file), before);
    EXPECT_FALSE(std::filesystem::exists(file + ".new"));

    std::filesystem::remove(filler);
    SaveToSettingsFile();
    BMessage saved;
    ASSERT_EQ(Read(file).FindMessage("indexwindow", &saved), B_OK);
    EXPECT_EQ(saved.GetFloat("winWidth", -1), 500);
}

TEST_F(QuirnelAppSettings, AGivenFileIsReadFromWhereItStands) {
    const std::string path = Volume() + "/settings";
    BMessage settings;
    BMessage frame;
    settings.AddMessage("indexwindow", &frame);
    {
        BFile file(path.c_str(), B_WRITE_ONLY | B_CREATE_FILE);
        file.Write("before", 6);
        ASSERT_EQ(settings.Flatten(&file), B_OK);
    }
    BFile file(path.c_str(), B_READ_ONLY);
    file.Seek(6, SEEK_SET);

    EXPECT_TRUE(mApp->LoadPreferences(&file));
    EXPECT_TRUE(HasIndexWindow());
    EXPECT_EQ(file.InitCheck(), B_OK);
}

TEST_F(QuirnelAppSettings, AGivenFileIsWrittenToWhereItStands) {
    const std::string path = Volume() + "/settings";
    BFile file(path.c_str(), B_READ_WRITE | B_CREATE_FILE);
    file.Write("before", 6);

    mApp->SavePreferences(&file);

    EXPECT_EQ(file.InitCheck(), B_OK);
    EXPECT_FALSE(std::filesystem::exists(Path()));
    file.Seek(6, SEEK_SET);
    BMessage saved;
    EXPECT_EQ(saved.Unflatten(&file), B_OK);
    EXPECT_TRUE(saved.IsEmpty());
}

TEST_F(QuirnelAppSettings, NoMessageIsFilledForNull) {
    mApp->SavePreferences(static_cast<BMessage*>(nullptr));
}

TEST_F(QuirnelAppSettings, SettingsThatNameNoWindowOpenTheFindWindowAlone) {
    Write(Path(), BMessage());
    CapturedOutput output;
    EXPECT_TRUE(LoadFromSettingsFile());
    EXPECT_EQ(output.text(), "");
    EXPECT_FALSE(HasIndexWindow());
    ASSERT_TRUE(HasFindWindow());
    mApp->FindWindowSlot().UseLocked(
        [](BWindow* window) { EXPECT_EQ(window->Frame(), BRect(300, 30, 750, 230)); });
}

TEST_F(QuirnelAppSettings, TheWindowsThatAreNamedAreOpened) {
    const struct { bool index, find; } cases[] = {{true, false}, {false, true}, {true, true}};
    for (const auto& named : cases) {
        BMessage settings;
        BMessage frame = Frame(10, 20, 300, 200);
        if (named.find)
            settings.AddMessage("findwindow", &frame);
        if (named.index)
            settings.AddMessage("indexwindow", &frame);
        mApp->LoadPreferences(&settings);
        EXPECT_EQ(HasIndexWindow(), named.index);
        EXPECT_EQ(HasFindWindow(), named.find);
        EXPECT_TRUE(mApp->PlayListWindowSlot().IsEmpty());
        CloseWindows();
    }
}

TEST_F(QuirnelAppSettings, TheFindWindowIsSavedBeforeTheIndexerAndThePlaylistNever) {
    BMessage settings;
    BMessage frame = Frame(10, 20, 300, 200);
    settings.AddMessage("indexwindow", &frame);
    settings.AddMessage("findwindow", &frame);
    mApp->LoadPreferences(&settings);
    BMessage open(103);
    mApp->MessageReceived(&open);
    ASSERT_FALSE(mApp->PlayListWindowSlot().IsEmpty());

    BMessage saved;
    mApp->SavePreferences(&saved);
    ASSERT_EQ(saved.CountNames(B_ANY_TYPE), 2);
    const char* const names[] = {"findwindow", "indexwindow"};
    for (int32 i = 0; i < 2; ++i) {
        char* name = nullptr;
        type_code type = 0;
        ASSERT_EQ(saved.GetInfo(B_ANY_TYPE, i, &name, &type), B_OK);
        EXPECT_STREQ(name, names[i]);
        BMessage window;
        ASSERT_EQ(saved.FindMessage(names[i], &window), B_OK);
        EXPECT_EQ(window.CountNames(B_FLOAT_TYPE), 4);
    }

    mApp->FindWindowSlot().Close();
    BMessage later;
    mApp->SavePreferences(&later);
    EXPECT_FALSE(later.HasMessage("findwindow"));
    EXPECT_TRUE(later.HasMessage("indexwindow"));
}

TEST_F(QuirnelAppSettings, FieldsOfOtherTypesNameNoWindow) {
    BMessage settings;
    settings.AddString("indexwindow", "open");
    settings.AddInt32("findwindow", 1);
    mApp->LoadPreferences(&settings);
    EXPECT_FALSE(HasIndexWindow());
    EXPECT_TRUE(HasFindWindow());
}

TEST_F(QuirnelAppSettings, WhatIsNoMessageCountsAsOneThatNamesNoWindow) {
    BMessage whole;
    BMessage frame = Frame(0, 0, 400, 150);
    whole.AddMessage("indexwindow", &frame);
    Write(Path(), whole);
    std::string bytes = test::read_file(Path());
    const std::string contents[] = {"",
                                    "x",
                                    std::string(16, '\0'),
                                    "no message at all, but longer than the head of one",
                                    bytes.substr(0, 10),
                                    bytes.substr(0, bytes.size() - 1),
                                    bytes.substr(1)};
    for (const std::string& content : contents) {
        test::write_file(Path(), content);
        CapturedOutput output;
        EXPECT_TRUE(LoadFromSettingsFile()) << content.size();
        EXPECT_EQ(output.text(), "");
        EXPECT_FALSE(HasIndexWindow()) << content.size();
        EXPECT_TRUE(HasFindWindow()) << content.size();
        CloseWindows();
    }
}

TEST_F(QuirnelAppSettings, AHugeFileTakesNeitherTimeNorMemory) {
    const auto peak = [] {
        rusage usage{};
        getrusage(RUSAGE_SELF, &usage);
        return usage.ru_maxrss;
    };
    // The first window of the process has its price.
    Write(Path(), BMessage());
    EXPECT_TRUE(LoadFromSettingsFile());
    CloseWindows();
    constexpr char kHead[] = {'B', 'K', 'M', 1, 0, 0, 0x40, 6, 0, 0, 0, 0, 1, 0, 0, 0};
    for (const std::string& head : {std::string(), std::string(kHead, sizeof(kHead))}) {
        test::write_file(Path(), head);
        std::filesystem::resize_file(Path(), 0x6400000);
        const long before = peak();
        EXPECT_TRUE(LoadFromSettingsFile());
        EXPECT_LT(peak() - before, 20 * 1024) << "kilobytes";
        EXPECT_TRUE(HasFindWindow());
        CloseWindows();
    }
}

TEST_F(QuirnelAppSettings, ADirectoryInTheFilesPlaceIsNoTrouble) {
    std::filesystem::create_directory(Path());
    LoadFromSettingsFile();
}

} // namespace
