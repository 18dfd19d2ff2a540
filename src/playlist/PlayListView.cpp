#include "playlist/PlayListView.h"

#include "app/AppMessages.h"
#include "gui/ColumnListView/CLVColumn.h"
#include "playlist/PlayListItem.h"

#include <Font.h>
#include <Menu.h>
#include <MenuItem.h>
#include <Message.h>
#include <Messenger.h>
#include <Roster.h>
#include <Window.h>

namespace {

constexpr char kTrackerSignature[] = "application/x-vnd.Be-TRAK";

} // namespace

PlayListView::PlayListView(BRect frame, CLVContainerView** container_out)
    : ColumnListView(frame, container_out, "playlist", B_FOLLOW_ALL_SIDES,
                     B_WILL_DRAW | B_PULSE_NEEDED | B_FRAME_EVENTS | B_NAVIGABLE, B_MULTIPLE_SELECTION_LIST,
                     true, true, true, false, B_NO_BORDER, be_plain_font) {
    // That of the rows' texts, which they would set as they are drawn.
    SetFontSize(PlayListItem::kTextSize);
    AddColumns();
    SetSortFunction(PlayListItem::CompareFunc);
}

PlayListView::~PlayListView() = default;

void PlayListView::AddColumns() {
    struct Column {
        const char* label;
        float width;
        float minWidth;
    };
    // In the order of PlayListColumn. The times' column is made narrower than it may be, and so starts at its
    // least width.
    for (const Column& column :
         {Column{"", 20, 10}, Column{"No", 30, 10}, Column{"Time", 30, 35}, Column{"Songname", 150, 10},
          Column{"Artist", 150, 10}, Column{"Album", 150, 10}})
        AddColumn(new CLVColumn(column.label, column.width, CLV_COLUMN_SORTABLE, column.minWidth));
}

void PlayListView::MakeAndMaintainEditMenu(BMenu* menu) {
    if (menu == nullptr)
        return;
    const auto add = [menu](const char* label, uint32 code, char shortcut) {
        auto* const item = new BMenuItem(label, new BMessage(code), shortcut);
        menu->AddItem(item);
        return item;
    };
    mEditMenu = menu;
    mCutItem = add("Cut", B_CUT, 'X');
    mCopyItem = add("Copy", B_COPY, 'C');
    mPasteItem = add("Paste", B_PASTE, 'V');
    add("Select All", MSG_SELECT_ALL_ROWS, 'A');
    add("Remove from list", MSG_REMOVE_FROM_LIST, 0);
    menu->AddSeparatorItem();
    mInfoItem = add("Edit info", MSG_EDIT_INFO, 'I');
    // Takes the info item's place, which so is never disabled; meant so.
    mInfoItem = add("Move to trash", MSG_MOVE_TO_TRASH, 'T');
    UpdateEditMenu();
}

void PlayListView::UpdateEditMenu() {
    for (BMenuItem* item : {mCutItem, mCopyItem, mPasteItem, mInfoItem}) {
        if (item != nullptr)
            item->SetEnabled(false);
    }
}

void PlayListView::OpenItem(int32 index) {
    if (!be_roster->IsRunning(kTrackerSignature))
        be_roster->Launch(kTrackerSignature);
    const auto* const item = dynamic_cast<PlayListItem*>(ItemAt(index));
    if (item == nullptr)
        return;
    entry_ref ref;
    item->GetRef(&ref);
    BMessage open(B_REFS_RECEIVED);
    open.AddRef("refs", &ref);
    BMessenger(kTrackerSignature).SendMessage(&open);
}

void PlayListView::KeyDown(const char* bytes, int32 count) {
    switch (count > 0 ? bytes[0] : 0) {
    case B_ENTER:
        break;
    case B_DELETE:
        RemoveSelection();
        break;
    default:
        mKeyInvokes = true;
        BListView::KeyDown(bytes, count);
        mKeyInvokes = false;
    }
}

status_t PlayListView::Invoke(BMessage* message) {
    // A double click opens its song by itself.
    bool notifying = false;
    InvokeKind(&notifying);
    if (mKeyInvokes && message == nullptr && !notifying)
        OpenItem(CurrentSelection(0));
    return ColumnListView::Invoke(message);
}

void PlayListView::MessageReceived(BMessage* message) {
    if (message->what == B_SELECT_ALL)
        Select(0, CountItems(), false);
    BListView::MessageReceived(message);
}
