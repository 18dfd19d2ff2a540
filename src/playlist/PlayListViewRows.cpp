// The part of PlayListView that adds and removes rows, and knows which files have one.
#include "playlist/PlayListView.h"

#include "playlist/PlayListItem.h"

#include <Font.h>

#include <algorithm>

void PlayListView::AddToList(entry_ref* ref) {
    if (ref == nullptr || mListedRefs.Has(*ref))
        return;
    auto item = std::make_unique<PlayListItem>(ref);
    if (!AddItem(item.get()))
        return;
    item->Update(this, be_plain_font);
    mOwnRows.push_back(std::move(item));
}

void PlayListView::RemoveSelection() {
    BList selected(20);
    for (int32 i = 0, index = CurrentSelection(0); index >= 0; index = CurrentSelection(++i))
        selected.AddItem(reinterpret_cast<void*>(static_cast<intptr_t>(index)));
    if (selected.IsEmpty())
        return;
    for (int32 i = selected.CountItems() - 1; i >= 0; --i)
        RemoveItem(static_cast<int32>(reinterpret_cast<intptr_t>(selected.ItemAt(i))));
    Select(static_cast<int32>(reinterpret_cast<intptr_t>(selected.FirstItem())), false);
}

bool PlayListView::AddItem(BListItem* item) {
    const bool added = ColumnListView::AddItem(item);
    if (added)
        NoteRow(item);
    return added;
}

bool PlayListView::AddItem(BListItem* item, int32 full_index) {
    const bool added = ColumnListView::AddItem(item, full_index);
    if (added)
        NoteRow(item);
    return added;
}

bool PlayListView::AddList(BList* items) {
    return AddList(items, FullListCountItems());
}

bool PlayListView::AddList(BList* items, int32 full_index) {
    const int32 before = FullListCountItems();
    const bool added = ColumnListView::AddList(items, full_index);
    // Those before the first one that was refused are in.
    for (int32 i = 0; i < FullListCountItems() - before; ++i)
        NoteRow(static_cast<BListItem*>(items->ItemAt(i)));
    return added;
}

bool PlayListView::AddUnder(BListItem* item, BListItem* superitem) {
    const bool added = ColumnListView::AddUnder(item, superitem);
    if (added)
        NoteRow(item);
    return added;
}

bool PlayListView::RemoveItem(BListItem* item) {
    const std::vector<entry_ref> refs = RefsInRun(FullListIndexOf(dynamic_cast<CLVListItem*>(item)), 1);
    return ForgetRefsIf(ColumnListView::RemoveItem(item), refs);
}

BListItem* PlayListView::RemoveItem(int32 full_index) {
    const std::vector<entry_ref> refs = RefsInRun(full_index, 1);
    BListItem* const removed = ColumnListView::RemoveItem(full_index);
    ForgetRefsIf(removed != nullptr, refs);
    return removed;
}

bool PlayListView::RemoveItems(int32 full_index, int32 count) {
    const std::vector<entry_ref> refs = RefsInRun(full_index, count);
    return ForgetRefsIf(ColumnListView::RemoveItems(full_index, count), refs);
}

void PlayListView::MakeEmpty() {
    ColumnListView::MakeEmpty();
    mListedRefs.Clear();
    mOwnRows.clear();
}

void PlayListView::NoteRow(BListItem* item) {
    if (const auto* const row = dynamic_cast<PlayListItem*>(item); row != nullptr) {
        entry_ref ref;
        row->GetRef(&ref);
        mListedRefs.Add(ref);
    }
}

std::vector<entry_ref> PlayListView::RefsInRun(int32 full_index, int32 count) const {
    std::vector<entry_ref> refs;
    uint32 shallowest = UINT32_MAX;
    for (int32 i = full_index; i >= 0 && i < FullListCountItems(); ++i) {
        const CLVListItem* const row = FullListItemAt(i);
        if (i - full_index < count)
            shallowest = std::min(shallowest, row->OutlineLevel());
        else if (row->OutlineLevel() <= shallowest)
            break;
        if (const auto* const song = dynamic_cast<const PlayListItem*>(row); song != nullptr)
            song->GetRef(&refs.emplace_back());
    }
    return refs;
}

bool PlayListView::ForgetRefsIf(bool removed, const std::vector<entry_ref>& refs) {
    if (removed) {
        for (const entry_ref& ref : refs)
            mListedRefs.Remove(ref);
    }
    return removed;
}
