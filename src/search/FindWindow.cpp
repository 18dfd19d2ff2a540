#include "search/FindWindow.h"

#include "app/AppMessages.h"
#include "app/QuirnelApp.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "playlist/PlayListView.h"
#include "search/SongQuery.h"
#include "widgets/WindowFrame.h"

#include <MenuBar.h>
#include <Message.h>
#include <Messenger.h>
#include <NodeMonitor.h>
#include <Query.h>
#include <Screen.h>
#include <TextControl.h>
#include <View.h>
#include <Volume.h>
#include <VolumeRoster.h>

#include <cstdio>

namespace {

constexpr BPoint kFirstPlace(300, 30);
constexpr rgb_color kBackground = {34, 34, 119, 255};
constexpr float kListTop = 48;
constexpr float kScrollBarRoom = 14;

} // namespace

FindWindow::FindWindow(BMessage* settings)
    : BWindow(BRect(50, 100, 500, 300), "Find song", B_DOCUMENT_WINDOW, 0) {
    if (settings != nullptr)
        LoadPreferences(settings);
    else
        MoveTo(kFirstPlace);
    AddViews();
    mMessenger = std::make_unique<BMessenger>(this);
    AddVolumes();
    mVolumeRoster->StartWatching(*mMessenger);
    brindle_app->FindWindowSlot().Fill(this);
    Show();
}

FindWindow::~FindWindow() = default;

void FindWindow::AddViews() {
    auto* const back = new BView(Bounds(), "back", B_FOLLOW_ALL_SIDES, B_WILL_DRAW);
    back->SetViewColor(kBackground);
    AddChild(back);

    auto* const menuBar = new BMenuBar(BRect(0, 0, 300, 20), "menubar", B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP);
    menuBar->AddItem(brindle_app->MakeFileMenu(MSG_OPEN_FIND_WINDOW, MSG_FIND_WINDOW_CLOSED));
    back->AddChild(menuBar);

    mFindText = new BTextControl(BRect(5, 25, 240, 41), "findtext", nullptr, "", new BMessage(MSG_SEARCH_NOW),
                                 B_FOLLOW_LEFT | B_FOLLOW_RIGHT);
    mFindText->SetDivider(0);
    back->AddChild(mFindText);

    BRect list = Bounds();
    list.top = kListTop;
    list.right -= kScrollBarRoom;
    list.bottom -= kScrollBarRoom;
    mList = new PlayListView(list, &mContainer);
    back->AddChild(mContainer);
    mFindText->MakeFocus();
}

void FindWindow::AddVolumes() {
    mVolumeRoster = std::make_unique<BVolumeRoster>();
    BVolume volume;
    while (mVolumeRoster->GetNextVolume(&volume) != B_BAD_VALUE) {
        auto entry = std::make_unique<VolumeListEntry>();
        entry->query = std::make_unique<BQuery>();
        entry->volume = std::make_unique<BVolume>(volume);
        entry->knowsQuery = volume.KnowsQuery();
        mVolumes.push_back(std::move(entry));
    }
}

void FindWindow::MessageReceived(BMessage* message) {
    switch (message->what) {
    // These two are what volumes' messages say in their opcode; here they only print, and meant so.
    case B_DEVICE_MOUNTED:
        printf("B_DEVICE_MOUNTED recv'd\n");
        break;
    case B_DEVICE_UNMOUNTED:
        printf("B_DEVICE_UNMOUNTED recv'd\n");
        break;
    case MSG_FORWARD_101:
    case MSG_FORWARD_102:
    case MSG_OPEN_PLAYLIST_WINDOW:
    case MSG_OPEN_INDEX_WINDOW:
        brindle_app->PostMessage(message);
        break;
    case MSG_FIND_WINDOW_CLOSED:
        message->AddPointer("winptr", this);
        brindle_app->PostMessage(message);
        break;
    case MSG_SEARCH_NOW:
        SearchFor(mFindText->Text());
        break;
    case B_QUERY_UPDATE: {
        const char* name = "";
        message->FindString("name", &name);
        printf("B_QUERY_UPDATE recv'd '%s'\n", name);
        break;
    }
    default:
        BWindow::MessageReceived(message);
    }
}

void FindWindow::SearchFor(const char* text) {
    mList->MakeEmpty();
    for (const auto& entry : mVolumes) {
        if (entry->knowsQuery)
            SearchVolume(*entry, text);
    }
}

void FindWindow::SearchVolume(VolumeListEntry& entry, const char* text) {
    BQuery& query = *entry.query;
    query.Clear();
    query.SetVolume(entry.volume.get());
    PushSongsContaining(query, text);
    query.Fetch();
    // A query that fails ends like one that has found all.
    entry_ref ref;
    while (query.GetNextRef(&ref) == B_OK)
        AddToList(&ref);
    // Comes too late for the query to become live, and is meant so: what it finds does not change.
    query.SetTarget(*mMessenger);
}

void FindWindow::AddToList(entry_ref* ref) {
    mList->AddToList(ref);
}

bool FindWindow::QuitRequested() {
    brindle_app->FindWindowSlot().Empty(this);
    brindle_app->MaybeQuit();
    return true;
}

void FindWindow::SavePreferences(BMessage* settings) {
    AddWindowFrame(settings, Frame());
}

void FindWindow::LoadPreferences(BMessage* settings) {
    if (settings == nullptr)
        return;
    const BRect frame = WindowFrameOf(*settings, BScreen(B_MAIN_SCREEN_ID).Frame());
    MoveTo(frame.LeftTop());
    ResizeTo(frame.Width(), frame.Height());
}
