#include "playlist/PlayListWindow.h"

#include "app/AppMessages.h"
#include "app/QuirnelApp.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "playlist/PlayListView.h"
#include "widgets/WindowFrame.h"

#include <MenuBar.h>
#include <Message.h>
#include <Screen.h>
#include <View.h>

namespace {

// Of the walking ants, which are back where they were after eight of them.
constexpr bigtime_t kPulseRate = 40000;
constexpr BPoint kFirstPlace(300, 30);
constexpr rgb_color kBackground = {34, 34, 119, 255};
constexpr float kMenuBarHeight = 20;
constexpr float kScrollBarRoom = 14;

} // namespace

PlayListWindow::PlayListWindow(BMessage* settings)
    : BWindow(BRect(100, 100, 400, 300), "Playlist", B_DOCUMENT_WINDOW, 0) {
    if (settings != nullptr)
        LoadPreferences(settings);
    else
        MoveTo(kFirstPlace);
    AddViews();
    SetPulseRate(kPulseRate);
    brindle_app->PlayListWindowSlot().Fill(this);
    Show();
}

PlayListWindow::~PlayListWindow() = default;

void PlayListWindow::AddViews() {
    auto* const back = new BView(Bounds(), "back", B_FOLLOW_ALL_SIDES, B_WILL_DRAW);
    back->SetViewColor(kBackground);
    AddChild(back);

    auto* const menuBar =
        new BMenuBar(BRect(0, 0, 300, kMenuBarHeight), "menubar", B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP);
    menuBar->AddItem(brindle_app->MakeFileMenu(MSG_OPEN_PLAYLIST_WINDOW, MSG_PLAYLIST_WINDOW_CLOSED));
    back->AddChild(menuBar);

    BRect list = Bounds();
    list.top = kMenuBarHeight;
    list.right -= kScrollBarRoom;
    list.bottom -= kScrollBarRoom;
    mList = new PlayListView(list, &mContainer);
    back->AddChild(mContainer);
    mList->MakeFocus();
}

void PlayListWindow::MessageReceived(BMessage* message) {
    switch (message->what) {
    case MSG_FORWARD_102:
    case MSG_OPEN_PLAYLIST_WINDOW:
    case MSG_OPEN_FIND_WINDOW:
    case MSG_OPEN_INDEX_WINDOW:
        brindle_app->PostMessage(message);
        break;
    case MSG_PLAYLIST_WINDOW_CLOSED:
        message->AddPointer("winptr", this);
        brindle_app->PostMessage(message);
        break;
    default:
        BWindow::MessageReceived(message);
    }
}

bool PlayListWindow::QuitRequested() {
    brindle_app->PlayListWindowSlot().Empty(this);
    return true;
}

void PlayListWindow::SavePreferences(BMessage* settings) {
    AddWindowFrame(settings, Frame());
}

void PlayListWindow::LoadPreferences(BMessage* settings) {
    if (settings == nullptr)
        return;
    const BRect frame = WindowFrameOf(*settings, BScreen(B_MAIN_SCREEN_ID).Frame());
    MoveTo(frame.LeftTop());
    ResizeTo(frame.Width(), frame.Height());
}
