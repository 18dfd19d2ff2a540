// The part of QuirnelApp that keeps the settings file.
#include "app/QuirnelApp.h"

#include "indexing/FileIndexWindow.h"
#include "search/FindWindow.h"

#include <Entry.h>
#include <File.h>
#include <FindDirectory.h>
#include <Message.h>
#include <Path.h>

#include <cstdio>
#include <string>

namespace {

constexpr char kSettingsFile[] = "Quirnel settings";
// Where new settings are written before they take the old ones' place.
constexpr char kNewSettingsSuffix[] = ".new";
constexpr char kFindWindow[] = "findwindow";
constexpr char kIndexWindow[] = "indexwindow";

// Settings take some hundred bytes. A file beyond this is not ours, and not read into memory to find out.
constexpr off_t kMaxSettingsSize = 1024 * 1024;

status_t FindSettingsFile(BPath* path) {
    const status_t status = find_directory(B_COMMON_SETTINGS_DIRECTORY, path, false);
    return status == B_OK ? path->Append(kSettingsFile) : status;
}

// The whole file at once: when the disk is full or the machine stops, the old settings are still there. False
// when the file cannot be written.
bool ReplaceSettingsFile(const BPath& path, const BMessage& settings) {
    // One that is protected stays, though another could be put in its place.
    const status_t present = BFile(path.Path(), B_WRITE_ONLY).InitCheck();
    if (present != B_OK && present != B_ENTRY_NOT_FOUND)
        return false;
    // The file may lie elsewhere, with a link in this place.
    BPath place;
    if (BEntry(path.Path(), true).GetPath(&place) != B_OK)
        return false;
    const std::string newPath = std::string(place.Path()) + kNewSettingsSuffix;
    BFile file(newPath.c_str(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
    if (file.InitCheck() != B_OK)
        return false;
    BEntry entry(newPath.c_str());
    if (settings.Flatten(&file) == B_OK && file.Sync() == B_OK && entry.Rename(place.Leaf(), true) == B_OK)
        return true;
    entry.Remove();
    return false;
}

} // namespace

bool QuirnelApp::LoadPreferences(BFile* file) {
    BFile settingsFile;
    if (file != nullptr) {
        settingsFile = *file;
    } else {
        BPath path;
        if (FindSettingsFile(&path) != B_OK) {
            printf("no settings directory found!\n");
            return false;
        }
        if (settingsFile.SetTo(path.Path(), B_READ_ONLY) != B_OK)
            return false;
    }
    if (settingsFile.InitCheck() != B_OK)
        return false;

    // What cannot be read leaves the message empty, which names no window.
    BMessage settings;
    off_t size = 0;
    if (settingsFile.GetSize(&size) == B_OK && size <= kMaxSettingsSize)
        settings.Unflatten(&settingsFile);
    LoadPreferences(&settings);
    return true;
}

void QuirnelApp::LoadPreferences(BMessage* settings) {
    BMessage window;
    if (settings->FindMessage(kIndexWindow, &window) == B_OK)
        OpenIndexWindow(&window);
    if (settings->FindMessage(kFindWindow, &window) == B_OK)
        OpenFindWindow(&window);
    if (mIndexWindow.IsEmpty() && mFindWindow.IsEmpty())
        OpenFindWindow(nullptr);
}

void QuirnelApp::SavePreferences(BFile* file) {
    BMessage settings;
    if (file != nullptr) {
        BFile settingsFile = *file;
        if (settingsFile.InitCheck() != B_OK)
            return;
        SavePreferences(&settings);
        settings.Flatten(&settingsFile);
        return;
    }
    BPath path;
    if (FindSettingsFile(&path) != B_OK) {
        printf("SavePreferences: no settings directory found!\n");
        return;
    }
    SavePreferences(&settings);
    if (!ReplaceSettingsFile(path, settings))
        printf("SavePreferences: can't write to settings file '%s'\n", path.Path());
}

void QuirnelApp::SavePreferences(BMessage* settings) {
    if (settings == nullptr)
        return;
    mFindWindow.UseLocked([&](BWindow* window) {
        BMessage frame;
        static_cast<FindWindow*>(window)->SavePreferences(&frame);
        settings->AddMessage(kFindWindow, &frame);
    });
    mIndexWindow.UseLocked([&](BWindow* window) {
        BMessage frame;
        static_cast<FileIndexWindow*>(window)->SavePreferences(&frame);
        settings->AddMessage(kIndexWindow, &frame);
    });
}
