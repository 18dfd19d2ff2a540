// A list of songs: dropped into, selected, dragged out, opened.
#pragma once

#include "gui/ColumnListView/ColumnListView.h"
#include "playlist/ListedRefs.h"
#include "playlist/WalkingAnts.h"

#include <EntryRef.h>

#include <memory>
#include <vector>

class BMenu;
class BMenuItem;
class PlayListItem;

// Shows PlayListItems in the columns of PlayListColumn, each of which can be sorted by. A song stands in the
// list once. Files are dragged out as "refs"; audio files that are dragged over the list are taken in when
// they are let go while the walking ants show. A double click has a song opened by the user's preferred
// player, the right button shows its folders.
//
// The rows that AddToList() makes are the list's, which deletes them when it is emptied and at its end;
// rows that are merely removed live until then. Thread rule: that of BView.
class PlayListView : public ColumnListView {
  public:
    // What is added to a window is the container, which is handed out here.
    PlayListView(BRect frame, CLVContainerView** container_out);
    ~PlayListView() override;

    // Fills the menu, which stays the caller's and must outlive the list's use of its items.
    void MakeAndMaintainEditMenu(BMenu* menu);
    // Nothing can be cut, copied or pasted, or moved to the trash.
    void UpdateEditMenu();

    // At the end, unless a row of the same file is in the list. Says nothing of the kind of file.
    void AddToList(entry_ref* ref);
    // Through Tracker, which is launched where it does not run. No row at the index: nothing more than that.
    void OpenItem(int32 index);
    // The row behind the first one removed is the only selected one afterwards.
    void RemoveSelection();

    void UpdateWalkingAnts();
    bool AntsAreVisible() const { return mAntsVisible; }
    BRect AntsRect() const { return mAntsRect; }

    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 transit, const BMessage* drag) override;
    void MouseUp(BPoint where) override;
    // Delete removes the selection, Space opens the first selected song, Return does nothing.
    void KeyDown(const char* bytes, int32 count) override;
    void Pulse() override;
    void MessageReceived(BMessage* message) override;
    status_t Invoke(BMessage* message = nullptr) override;

    bool AddItem(BListItem* item) override;
    bool AddItem(BListItem* item, int32 full_index) override;
    bool AddList(BList* items) override;
    bool AddList(BList* items, int32 full_index) override;
    bool AddUnder(BListItem* item, BListItem* superitem) override;
    bool RemoveItem(BListItem* item) override;
    BListItem* RemoveItem(int32 full_index) override;
    bool RemoveItems(int32 full_index, int32 count) override;
    void MakeEmpty() override;

  private:
    // What a press on a row asks for.
    struct PressOutcome {
        // Nothing more happens while the pointer stays on the row.
        bool waitLeave = false;
        // Leaving the row starts a drag.
        bool mayDrag = false;
    };

    void AddColumns();
    void NoteRow(BListItem* item);
    // Of the rows that leave with a run of the full list.
    std::vector<entry_ref> RefsInRun(int32 full_index, int32 count) const;
    // Answers `removed`.
    bool ForgetRefsIf(bool removed, const std::vector<entry_ref>& refs);
    void ShowFolderMenu(PlayListItem* item, BPoint where);
    void SelectAndDrag(BPoint where);
    PressOutcome PressRow(int32 index);
    void SelectRangeTo(int32 index);
    // A "refs" field for each selected row. False when none is selected.
    bool AddSelectionTo(BMessage& message) const;
    bool PressIsOver(bool wasActive) const;
    void DragEntered(BPoint where, const BMessage* drag);
    void HideAnts();

    // The menu's items, owned by it; null until there is one.
    BMenu* mEditMenu = nullptr;
    BMenuItem* mCutItem = nullptr;
    BMenuItem* mCopyItem = nullptr;
    BMenuItem* mPasteItem = nullptr;
    BMenuItem* mInfoItem = nullptr;

    // A drag that carries "refs" has come in.
    bool mDropAccepted = false;
    // The ants show, and letting go drops.
    bool mAntsVisible = false;
    // The ants were switched off by leaving them.
    bool mAntsCleared = false;
    // Invalid until audio files are dragged in for the first time; never reset, on purpose.
    BRect mAntsRect;
    WalkingAnts mAnts;
    // The last drag that came in with "refs".
    std::unique_ptr<BMessage> mDragMessage;

    // A key that is being handled invokes the list.
    bool mKeyInvokes = false;

    ListedRefs mListedRefs;
    std::vector<std::unique_ptr<PlayListItem>> mOwnRows;
};
