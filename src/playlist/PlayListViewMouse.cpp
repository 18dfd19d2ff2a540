// The part of PlayListView that selects, drags out and opens with the mouse.
#include "playlist/PlayListView.h"

#include "playlist/FolderMenu.h"
#include "playlist/PlayListItem.h"
#include "widgets/IconMenuItem.h"

#include <InterfaceDefs.h>
#include <Message.h>
#include <MessageQueue.h>
#include <OS.h>
#include <PopUpMenu.h>
#include <Window.h>

namespace {

constexpr bigtime_t kPollInterval = 20000;
constexpr float kDragWidth = 40;
constexpr float kDragHeight = 20;
// The menu opens under the pointer, not beside it.
constexpr float kMenuOffset = 4;

} // namespace

void PlayListView::MouseDown(BPoint where) {
    int32 buttons = 0;
    int32 clicks = 0;
    if (const BMessage* const press = Window()->CurrentMessage(); press != nullptr) {
        press->FindInt32("buttons", &buttons);
        press->FindInt32("clicks", &clicks);
    }
    const int32 index = IndexOf(where);
    if (clicks == 2)
        OpenItem(index);
    if (index >= 0 && clicks == 1 && (buttons & B_SECONDARY_MOUSE_BUTTON) != 0) {
        ShowFolderMenu(dynamic_cast<PlayListItem*>(ItemAt(index)), where);
        return;
    }
    if (index >= 0 && clicks == 1 && (buttons & B_PRIMARY_MOUSE_BUTTON) != 0) {
        SelectAndDrag(where);
        return;
    }
    ColumnListView::MouseDown(where);
}

void PlayListView::ShowFolderMenu(PlayListItem* item, BPoint where) {
    BPopUpMenu menu("popup", true, true, B_ITEMS_IN_COLUMN);
    if (item != nullptr) {
        entry_ref ref;
        item->GetRef(&ref);
        AddFileAndFolders(menu, ref);
    }
    const BPoint corner = ConvertToScreen(where) - BPoint(kMenuOffset, kMenuOffset);
    if (auto* const chosen = dynamic_cast<IconMenuItem*>(menu.Go(corner, false, false, false));
        chosen != nullptr)
        chosen->ShowInTracker();
}

void PlayListView::SelectAndDrag(BPoint where) {
    if (!IsFocus())
        MakeFocus();
    const bool wasActive = Window()->IsActive();
    uint32 buttons = B_PRIMARY_MOUSE_BUTTON;
    do {
        const int32 index = IndexOf(where);
        PressOutcome outcome;
        if (index >= 0)
            outcome = PressRow(index);

        const BRect outline(where.x, where.y, where.x + kDragWidth, where.y + kDragHeight);
        BMessage message(B_SIMPLE_DATA);
        if (outcome.mayDrag && AddSelectionTo(message))
            outcome.waitLeave = true;

        if (!outcome.waitLeave) {
            GetMouse(&where, &buttons, true);
            snooze(kPollInterval);
            continue;
        }
        while (buttons != 0 && IndexOf(where) == index && !PressIsOver(wasActive)) {
            snooze(kPollInterval);
            GetMouse(&where, &buttons, true);
        }
        if (buttons != 0 && IndexOf(where) != index && outcome.mayDrag) {
            DragMessage(&message, outline);
            return;
        }
    } while (buttons != 0 && !PressIsOver(wasActive));
}

// What the button going down on, or the held button coming to, a row does.
PlayListView::PressOutcome PlayListView::PressRow(int32 index) {
    const bool hadSelection = CurrentSelection(0) >= 0;
    const bool selected = IsItemSelected(index);
    const bool toggle = (modifiers() & B_CONTROL_KEY) != 0;
    const bool extend = (modifiers() & B_SHIFT_KEY) != 0;
    PressOutcome outcome;
    if (selected && toggle) {
        Deselect(index);
        outcome.waitLeave = true;
    } else if (selected) {
        outcome.mayDrag = true;
    } else if (toggle) {
        Select(index, true);
        outcome.waitLeave = true;
    } else if (extend && hadSelection) {
        SelectRangeTo(index);
        outcome.waitLeave = true;
    } else {
        if (hadSelection)
            DeselectAll();
        Select(index, false);
        outcome.mayDrag = !extend;
        outcome.waitLeave = extend;
    }
    return outcome;
}

// Down from the row to the first one selected, or to the row from the nearest one selected above it.
void PlayListView::SelectRangeTo(int32 index) {
    const int32 first = CurrentSelection(0);
    if (index <= first) {
        Select(index, first, true);
        return;
    }
    int32 nearest = first;
    for (int32 i = 1, next = CurrentSelection(1); next >= 0 && next < index; next = CurrentSelection(++i))
        nearest = next;
    Select(nearest, index, true);
}

bool PlayListView::AddSelectionTo(BMessage& message) const {
    for (int32 i = 0, index = CurrentSelection(0); index >= 0; index = CurrentSelection(++i)) {
        if (const auto* const item = dynamic_cast<PlayListItem*>(ItemAt(index)); item != nullptr) {
            entry_ref ref;
            item->GetRef(&ref);
            message.AddRef("refs", &ref);
        }
    }
    return CurrentSelection(0) >= 0;
}

// Besides letting go: the window is being closed, another thread waits for it, or it has lost the keyboard,
// and with it perhaps the news of the button.
bool PlayListView::PressIsOver(bool wasActive) const {
    BWindow* const window = Window();
    return window->MessageQueue()->FindMessage(B_QUIT_REQUESTED, 0) != nullptr ||
           window->CountLockRequests() > window->CountLocks() || (wasActive && !window->IsActive());
}
