// The part of QuirnelApp that keeps the settings file.
#include "app/QuirnelApp.h"

#include "indexing/FileIndexWindow.h"

#include <File.h>
#include <FindDirectory.h>
#include <Message.h>
#include <Path.h>

#include <cstdio>

namespace {

constexpr char kSettingsFile[] = "Quirnel settings";
constexpr char kFindWindow[] = "findwindow";
constexpr char kIndexWindow[] = "indexwindow";

// Settings take some hundred bytes. A file beyond this is not ours, and not read into memory to find out.
constexpr off_t kMaxSettingsSize = 1024 * 1024;

status_t FindSettingsFile(BPath* path) {
    const status_t status = find_directory(B_COMMON_SETTINGS_DIRECTORY, path, false);
    return status == B_OK ? path->Append(kSettingsFile) : status;
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
    // There is no find window yet: the program must not run without any.
    if (mIndexWindow.IsEmpty() && mFindWindow.IsEmpty())
        OpenIndexWindow(nullptr);
}

void QuirnelApp::SavePreferences(BFile* file) {
    BFile settingsFile;
    if (file != nullptr) {
        settingsFile = *file;
    } else {
        BPath path;
        if (FindSettingsFile(&path) != B_OK) {
            printf("SavePreferences: no settings directory found!\n");
            return;
        }
        if (settingsFile.SetTo(path.Path(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE) != B_OK) {
            printf("SavePreferences: can't write to settings file '%s'\n", path.Path());
            return;
        }
    }
    if (settingsFile.InitCheck() != B_OK)
        return;

    BMessage settings;
    SavePreferences(&settings);
    settings.Flatten(&settingsFile);
}

void QuirnelApp::SavePreferences(BMessage* settings) {
    if (settings == nullptr)
        return;
    // The find window's frame comes first, once there is such a window.
    mIndexWindow.UseLocked([&](BWindow* window) {
        BMessage frame;
        static_cast<FileIndexWindow*>(window)->SavePreferences(&frame);
        settings->AddMessage(kIndexWindow, &frame);
    });
}
