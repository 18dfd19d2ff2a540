#include "indexing/FileIndexWindow.h"

#include "app/AppMessages.h"
#include "app/QuirnelApp.h"
#include "indexing/FileIndexListItem.h"
#include "indexing/PulseView.h"
#include "indexing/UnattendedJobs.h"
#include "widgets/WindowFrame.h"

#include <Button.h>
#include <ListView.h>
#include <Menu.h>
#include <MenuBar.h>
#include <Message.h>
#include <Query.h>
#include <Screen.h>
#include <ScrollView.h>
#include <View.h>
#include <Volume.h>
#include <VolumeRoster.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr bigtime_t kPulseRate = 200000;
constexpr float kNoLimit = 1000000;
// Around the list and the buttons, and between them.
constexpr float kInset = 7;
// A button is as wide as its share of the window, within these. The least one shows the longest label, also
// in a window that was opened too small for it, which can grow.
constexpr float kMinButtonWidth = 50;
constexpr float kMaxButtonWidth = 80;

BButton* AddButton(BView* parent, BRect frame, const char* name, const char* label, uint32 code) {
    auto* const button = new BButton(frame, name, label, new BMessage(code), B_FOLLOW_LEFT | B_FOLLOW_BOTTOM);
    // Until a volume is selected there is nothing to be done.
    button->SetEnabled(false);
    parent->AddChild(button);
    return button;
}

float PreferredButtonHeight() {
    BButton button(BRect(), "", "Status", nullptr);
    float width = 0;
    float height = 0;
    button.GetPreferredSize(&width, &height);
    return std::ceil(height);
}

} // namespace

FileIndexWindow::FileIndexWindow(BMessage* settings)
    : BWindow(BRect(100, 100, 550, 300), "Indexer", B_TITLED_WINDOW, 0) {
    LoadPreferences(settings);
    const BRect bounds = Bounds();
    SetSizeLimits(bounds.Width(), kNoLimit, bounds.Height(), kNoLimit);
    // Zooming grows the window downwards only.
    SetZoomLimits(bounds.Width(), kNoLimit);

    AddViews();
    AddVolumes();
    mVolumeList->Select(0);
    UpdateButtons(SelectedItem());

    AddChild(new PulseView(this));
    SetPulseRate(kPulseRate);
    brindle_app->IndexWindowSlot().Fill(this);
    Show();
}

// Without QuitRequested() before it, jobs may be at work, which are neither stopped nor waited for.
FileIndexWindow::~FileIndexWindow() {
    for (auto& item : TakeItems()) {
        if (item->IsRunning())
            brindle_app->JobsWithoutWindow().Take(std::move(item));
    }
}

void FileIndexWindow::AddViews() {
    const BRect bounds = Bounds();
    auto* const back = new BView(bounds, "back", B_FOLLOW_ALL_SIDES, B_WILL_DRAW);
    back->SetViewColor(ui_color(B_PANEL_BACKGROUND_COLOR));
    AddChild(back);

    auto* const menuBar = new BMenuBar(BRect(0, 0, 300, 20), "menubar");
    menuBar->AddItem(brindle_app->MakeFileMenu(MSG_OPEN_INDEX_WINDOW, MSG_INDEX_WINDOW_CLOSED));
    back->AddChild(menuBar);

    BRect inside = bounds.InsetByCopy(kInset, kInset);
    inside.top = menuBar->Frame().bottom + 1 + kInset;

    BRect button = inside;
    button.top = button.bottom - PreferredButtonHeight();
    button.right = button.left + std::clamp(std::floor((inside.Width() - 3 * kInset) / 4), kMinButtonWidth,
                                            kMaxButtonWidth);

    // Before the buttons, as the keyboard goes through the views in their order.
    constexpr float kBorder = 2;
    BRect list = inside;
    list.bottom = button.top - 1 - kInset;
    list.InsetBy(kBorder, kBorder);
    list.right -= B_V_SCROLL_BAR_WIDTH;
    mVolumeList = new BListView(list, "volumelist", B_SINGLE_SELECTION_LIST, B_FOLLOW_ALL_SIDES);
    mVolumeList->SetSelectionMessage(new BMessage(MSG_INDEX_SELECTION));
    back->AddChild(
        new BScrollView("volumescroller", mVolumeList, B_FOLLOW_ALL_SIDES, 0, false, true, B_FANCY_BORDER));

    const float step = button.Width() + 1 + kInset;
    const auto next = [&] {
        const BRect frame = button;
        button.OffsetBy(step, 0);
        return frame;
    };
    mStatusButton = AddButton(back, next(), "stat", "Status", MSG_INDEX_STATUS);
    mStripButton = AddButton(back, next(), "strip", "Strip", MSG_INDEX_STRIP);
    mStopButton = AddButton(back, next(), "stop", "Stop", MSG_INDEX_STOP);
    mIndexButton = AddButton(back, next(), "index", "Index", MSG_INDEX_START);
    mVolumeList->MakeFocus();
}

void FileIndexWindow::AddVolumes() {
    mVolumeRoster = std::make_unique<BVolumeRoster>();
    BVolume volume;
    while (mVolumeRoster->GetNextVolume(&volume) != B_BAD_VALUE) {
        if (!volume.IsPersistent())
            continue;
        auto entry = std::make_unique<VolumeListEntry>();
        entry->volume = std::make_unique<BVolume>(volume);
        entry->query = std::make_unique<BQuery>();
        entry->knowsQuery = volume.KnowsQuery();
        mVolumeList->AddItem(new FileIndexListItem(entry.release()));
    }
}

FileIndexListItem* FileIndexWindow::SelectedItem() const {
    return dynamic_cast<FileIndexListItem*>(mVolumeList->ItemAt(mVolumeList->CurrentSelection()));
}

std::vector<std::unique_ptr<FileIndexListItem>> FileIndexWindow::TakeItems() {
    std::vector<std::unique_ptr<FileIndexListItem>> items;
    for (int32 i = 0; i < mVolumeList->CountItems(); ++i)
        items.emplace_back(dynamic_cast<FileIndexListItem*>(mVolumeList->ItemAt(i)));
    mVolumeList->MakeEmpty();
    return items;
}

void FileIndexWindow::Pulse() {
    if (!Lock())
        return;
    for (int32 i = 0; i < mVolumeList->CountItems(); ++i) {
        auto* const item = dynamic_cast<FileIndexListItem*>(mVolumeList->ItemAt(i));
        if (item == nullptr)
            continue;
        const bool done = item->IsDone();
        if (done || item->IsRunning())
            mVolumeList->InvalidateItem(i);
        if (done) {
            // The buttons follow the row whose job has ended, whichever one is selected.
            UpdateButtons(item);
            item->ClearDone();
        }
    }
    Unlock();
}

void FileIndexWindow::UpdateButtons(FileIndexListItem* item) {
    if (item == nullptr)
        return;
    const bool supported = item->IsSupported();
    const bool running = item->IsRunning();
    // Never enabled: its job only moves the progress.
    mStatusButton->SetEnabled(false);
    mStripButton->SetEnabled(supported && !running);
    mIndexButton->SetEnabled(supported && !running);
    mStopButton->SetEnabled(supported && running);
    // A button that is disabled loses the keyboard, which then goes to nobody by itself.
    if (CurrentFocus() == nullptr)
        mVolumeList->MakeFocus();
}

void FileIndexWindow::MessageReceived(BMessage* message) {
    FileIndexListItem* const selected = SelectedItem();
    switch (message->what) {
    case MSG_FORWARD_101:
    case MSG_FORWARD_102:
    case MSG_OPEN_PLAYLIST_WINDOW:
    case MSG_OPEN_FIND_WINDOW:
    case MSG_OPEN_INDEX_WINDOW:
    case MSG_INDEX_WINDOW_CLOSED:
        brindle_app->PostMessage(message);
        break;
    case MSG_INDEX_SELECTION:
        UpdateButtons(selected);
        break;
    case MSG_INDEX_STATUS:
        StartJob(selected, &FileIndexListItem::StatAttributes);
        break;
    case MSG_INDEX_STRIP:
        StartJob(selected, &FileIndexListItem::EraseAttributes);
        break;
    case MSG_INDEX_START:
        StartJob(selected, &FileIndexListItem::IndexAttributes);
        break;
    case MSG_INDEX_STOP:
        if (selected != nullptr)
            selected->CancelScan();
        UpdateButtons(selected);
        break;
    default:
        BWindow::MessageReceived(message);
    }
}

void FileIndexWindow::StartJob(FileIndexListItem* item, void (FileIndexListItem::*start)()) {
    // A button may be pressed once more before the first press has come here and disabled it.
    if (item != nullptr && !item->IsRunning())
        (item->*start)();
    UpdateButtons(item);
}

bool FileIndexWindow::QuitRequested() {
    for (const auto& item : TakeItems())
        item->CancelScan();
    brindle_app->IndexWindowSlot().Empty(this);
    brindle_app->MaybeQuit();
    return true;
}

void FileIndexWindow::SavePreferences(BMessage* settings) {
    AddWindowFrame(settings, Frame());
}

void FileIndexWindow::LoadPreferences(BMessage* settings) {
    if (settings == nullptr)
        return;
    const BRect frame = WindowFrameOf(*settings, BScreen(B_MAIN_SCREEN_ID).Frame());
    MoveTo(frame.LeftTop());
    ResizeTo(frame.Width(), frame.Height());
}
