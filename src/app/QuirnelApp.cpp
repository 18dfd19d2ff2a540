#include "app/QuirnelApp.h"

#include "app/AppMessages.h"
#include "indexing/FileIndexWindow.h"
#include "indexing/UnattendedJobs.h"
#include "playlist/PlayListWindow.h"
#include "search/FindWindow.h"
#include "soundplay/SoundplayScripter.h"

#include <Alert.h>
#include <IndexMaintenance.h>
#include <Menu.h>
#include <MenuItem.h>
#include <Message.h>
#include <MimeType.h>
#include <VolumeRoster.h>

#include <cstdio>

QuirnelApp* brindle_app = nullptr;

QuirnelApp::QuirnelApp()
    : BApplication(kQuirnelSignature), mJobsWithoutWindow(std::make_unique<UnattendedJobs>()) {
    BMimeType type(kQuirnelSignature);
    if (type.InitCheck() != B_OK)
        printf("Hmm, error!\n");
    else if (!type.IsInstalled())
        type.Install();
}

QuirnelApp::~QuirnelApp() {
    mScripter.reset();
    mJobsWithoutWindow.reset();
    // What the jobs have changed is in the index before the program ends.
    close_indices();
}

void QuirnelApp::ReadyToRun() {
    CheckTrackerDisplayAttributes();
    CheckCreateIndices();
    const bool loaded = LoadPreferences(static_cast<BFile*>(nullptr));
    // The windows do not wait for what other programs did meanwhile.
    follow_index_changes();
    if (loaded)
        return;
    printf("No preferences found...\n");
    PostMessage(MSG_OPEN_INDEX_WINDOW);
    PostMessage(MSG_OPEN_FIND_WINDOW);
}

// A code about windows, from the program that has launched this one, before the windows of the settings are
// open: acted upon at once, it would open one of them twice.
bool QuirnelApp::IsEarly(const BMessage& message) const {
    return IsRunning() && IsLaunching() && message.what >= MSG_OPEN_PLAYLIST_WINDOW &&
           message.what <= MSG_INDEX_WINDOW_CLOSED;
}

void QuirnelApp::MessageReceived(BMessage* message) {
    if (IsEarly(*message)) {
        PostMessage(message);
        return;
    }
    switch (message->what) {
    case MSG_OPEN_PLAYLIST_WINDOW:
        if (!mPlayListWindow.Activate())
            OpenPlayListWindow(nullptr);
        break;
    case MSG_PLAYLIST_WINDOW_CLOSED:
        mPlayListWindow.Close();
        break;
    case MSG_OPEN_FIND_WINDOW:
        if (!mFindWindow.Activate())
            OpenFindWindow(nullptr);
        break;
    case MSG_FIND_WINDOW_CLOSED:
        mFindWindow.Close();
        if (mIndexWindow.IsEmpty())
            PostMessage(B_QUIT_REQUESTED);
        break;
    case MSG_OPEN_INDEX_WINDOW:
        if (!mIndexWindow.Activate())
            OpenIndexWindow(nullptr);
        break;
    case MSG_INDEX_WINDOW_CLOSED:
        mIndexWindow.Close();
        if (mFindWindow.IsEmpty())
            PostMessage(B_QUIT_REQUESTED);
        break;
    default:
        BApplication::MessageReceived(message);
    }
}

// Windows fill their slots themselves, and belong to nobody.
void QuirnelApp::OpenIndexWindow(BMessage* settings) {
    new FileIndexWindow(settings);
}

void QuirnelApp::OpenFindWindow(BMessage* settings) {
    new FindWindow(settings);
}

void QuirnelApp::OpenPlayListWindow(BMessage* settings) {
    new PlayListWindow(settings);
}

bool QuirnelApp::QuitRequested() {
    SavePreferences(static_cast<BFile*>(nullptr));
    mFindWindow.Close();
    mIndexWindow.Close();
    return true;
}

void QuirnelApp::SaveStateRequested() {
    SavePreferences(static_cast<BFile*>(nullptr));
}

void QuirnelApp::MaybeQuit() {
    // The playlist window does not keep the program.
    if (mFindWindow.IsEmpty() && mIndexWindow.IsEmpty())
        PostMessage(B_QUIT_REQUESTED);
}

// The code to open with is not used: both items open the same windows wherever the menu hangs.
BMenu* QuirnelApp::MakeFileMenu(long, long closeCode) {
    auto* const menu = new BMenu("File", B_ITEMS_IN_COLUMN);
    menu->AddItem(new BMenuItem("Find song...", new BMessage(MSG_OPEN_FIND_WINDOW), 'F'));
    menu->AddItem(new BMenuItem("File indexer, disks...", new BMessage(MSG_OPEN_INDEX_WINDOW), 'D'));
    menu->AddSeparatorItem();
    menu->AddItem(new BMenuItem("Close", new BMessage(static_cast<uint32>(closeCode)), 'W'));
    return menu;
}

SoundplayScripter* QuirnelApp::GetSoundplayScripter() {
    if (!mScripter)
        mScripter = std::make_unique<SoundplayScripter>();
    return mScripter.get();
}

void QuirnelApp::AboutRequested() {
    // The one button has no label.
    auto* const alert = new BAlert("",
                                   "Quirnel 0.9 by the Quirnel developers\n"
                                   "Contact: see the README that comes with it\n"
                                   "Freeware",
                                   "", nullptr, nullptr, B_WIDTH_AS_USUAL, B_INFO_ALERT);
    alert->SetShortcut(0, B_ESCAPE);
    alert->Go();
}
