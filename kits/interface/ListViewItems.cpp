// The part of BListView that keeps the rows.
#include <ListView.h>

#include "RowPositions.h"

#include <ScrollBar.h>

#include <algorithm>
#include <cmath>
#include <tuple>
#include <vector>

namespace {

int32 PixelsOf(const BListItem* item) {
    // Kept within what a list of any length can add up.
    return static_cast<int32>(std::clamp(std::ceil(item->Height()), 0.0F, 1.0e6F)) + 1;
}

// Where a row stands after `count` rows have come in before `index`, or have gone from there.
int32 AfterInsertion(int32 row, int32 index, int32 count) {
    return row >= index ? row + count : row;
}

int32 AfterRemoval(int32 row, int32 index, int32 count) {
    return row < index ? row : std::max(index, row - count);
}

} // namespace

BListItem* BListView::RowAt(int32 index) const {
    return static_cast<BListItem*>(mItems.ItemAtFast(index));
}

BListItem* BListView::ItemAt(int32 index) const {
    return static_cast<BListItem*>(mItems.ItemAt(index));
}

BListItem* BListView::FirstItem() const {
    return static_cast<BListItem*>(mItems.FirstItem());
}

BListItem* BListView::LastItem() const {
    return static_cast<BListItem*>(mItems.LastItem());
}

int32 BListView::CountItems() const {
    return mItems.CountItems();
}

bool BListView::IsEmpty() const {
    return mItems.IsEmpty();
}

const BListItem** BListView::Items() const {
    return reinterpret_cast<const BListItem**>(mItems.Items());
}

int32 BListView::IndexOf(BListItem* item) const {
    const int32 count = CountItems();
    const int32 start = std::clamp(mLastFound, 0, std::max(0, count - 1));
    for (int32 distance = 0; start - distance >= 0 || start + distance < count; ++distance) {
        for (const int32 row : {start - distance, start + distance}) {
            if (row >= 0 && row < count && RowAt(row) == item) {
                mLastFound = row;
                return row;
            }
        }
    }
    return -1;
}

int32 BListView::IndexOf(BPoint point) const {
    return mPositions->RowAt(std::lround(std::floor(point.y)));
}

bool BListView::HasItem(BListItem* item) const {
    return IndexOf(item) >= 0;
}

void BListView::DoForEach(bool (*function)(BListItem* item)) {
    for (int32 i = 0; i < CountItems(); ++i) {
        if (function(RowAt(i))) {
            return;
        }
    }
}

void BListView::DoForEach(bool (*function)(BListItem* item, void* argument), void* argument) {
    for (int32 i = 0; i < CountItems(); ++i) {
        if (function(RowAt(i), argument)) {
            return;
        }
    }
}

bool BListView::AddItem(BListItem* item) {
    return BListView::AddItem(item, CountItems());
}

bool BListView::AddItem(BListItem* item, int32 index) {
    if (item == nullptr || index < 0 || index > CountItems()) {
        return false;
    }
    BList one(1);
    one.AddItem(item);
    InsertRows(index, one);
    return true;
}

bool BListView::AddList(BList* items) {
    return BListView::AddList(items, CountItems());
}

bool BListView::AddList(BList* items, int32 index) {
    if (items == nullptr || index < 0 || index > CountItems() ||
        items->HasItem(static_cast<const void*>(nullptr))) {
        return false;
    }
    InsertRows(index, *items);
    return true;
}

bool BListView::RemoveItem(BListItem* item) {
    return RemoveRows(IndexOf(item), 1);
}

BListItem* BListView::RemoveItem(int32 index) {
    BListItem* const item = ItemAt(index);
    RemoveRows(index, 1);
    return item;
}

bool BListView::RemoveItems(int32 index, int32 count) {
    return RemoveRows(index, count);
}

void BListView::InsertRows(int32 index, const BList& rows) {
    const int32 count = rows.CountItems();
    std::vector<int32> heights(static_cast<size_t>(count));
    BFont font;
    GetFont(&font);
    for (int32 i = 0; i < count; ++i) {
        auto* const item = static_cast<BListItem*>(rows.ItemAtFast(i));
        if (Host() != nullptr) {
            item->Update(this, &font);
        }
        heights[static_cast<size_t>(i)] = PixelsOf(item);
    }
    mItems.AddList(&rows, index);
    mPositions->Insert(index, heights);
    if (HasSelection()) {
        mFirstSelected = AfterInsertion(mFirstSelected, index, count);
        mLastSelected = AfterInsertion(mLastSelected, index, count);
    }
    mAnchor = AfterInsertion(mAnchor, index, count);
    mCursor = AfterInsertion(mCursor, index, count);
    mPress.row = AfterInsertion(mPress.row, index, count);
    mPress.followedRow = AfterInsertion(mPress.followedRow, index, count);
    // A row may come with its selection, from an archive or another list.
    for (int32 i = index; i < index + count; ++i) {
        if (RowAt(i)->IsSelected()) {
            WidenSelectionBounds(i, i);
        }
    }
    ForgetSelectionCount();
    mLastFound = index + std::max(0, count - 1);
    FixupScrollBar();
    InvalidateFrom(index);
}

bool BListView::RemoveRows(int32 index, int32 count) {
    if (index < 0 || index >= CountItems() || count <= 0) {
        return false;
    }
    count = std::min(count, CountItems() - index);
    InvalidateFrom(index);
    const bool selectionChanged = HasSelection() && SetSelected(index, index + count - 1, false);
    mItems.RemoveItems(index, count);
    mPositions->Remove(index, count);
    if (HasSelection()) {
        // Nothing selected is left among those that go, so neither bound lies there.
        mFirstSelected = AfterRemoval(mFirstSelected, index, count);
        mLastSelected = AfterRemoval(mLastSelected, index, count);
    }
    // Keys go on from where the removed rows were.
    mAnchor = std::min(AfterRemoval(mAnchor, index, count), CountItems() - 1);
    mCursor = std::min(AfterRemoval(mCursor, index, count), CountItems() - 1);
    EndPress();
    ForgetSelectionCount();
    mLastFound = index;
    FixupScrollBar();
    if (selectionChanged) {
        SelectionHasChanged();
    }
    return true;
}

void BListView::MakeEmpty() {
    mItems.MakeEmpty();
    mPositions->Clear();
    mFirstSelected = 0;
    mLastSelected = -1;
    mAnchor = -1;
    mCursor = -1;
    mCursorShown = false;
    EndPress();
    ForgetSelectionCount();
    FixupScrollBar();
    Invalidate();
}

bool BListView::SwapItems(int32 a, int32 b) {
    MiscData data{};
    data.swap = {a, b};
    return DoMiscellaneous(B_SWAP_OP, &data);
}

bool BListView::MoveItem(int32 from, int32 to) {
    MiscData data{};
    data.move = {from, to};
    return DoMiscellaneous(B_MOVE_OP, &data);
}

bool BListView::ReplaceItem(int32 index, BListItem* item) {
    MiscData data{};
    data.replace = {index, item};
    return DoMiscellaneous(B_REPLACE_OP, &data);
}

bool BListView::DoMiscellaneous(MiscCode code, MiscData* data) {
    if (code == B_REPLACE_OP) {
        const int32 index = data->replace.index;
        if (data->replace.item == nullptr || index < 0 || index >= CountItems()) {
            return false;
        }
        const bool selectionChanged = SetSelected(index, index, false);
        mItems.ReplaceItem(index, data->replace.item);
        if (Host() != nullptr) {
            BFont font;
            GetFont(&font);
            RowAt(index)->Update(this, &font);
        }
        if (RowAt(index)->IsSelected()) {
            WidenSelectionBounds(index, index);
        }
        TakeHeightFromRow(index);
        InvalidateItem(index);
        if (selectionChanged) {
            SelectionHasChanged();
        }
        return true;
    }
    int32 first = 0;
    int32 last = 0;
    if (code == B_SWAP_OP && mItems.SwapItems(data->swap.a, data->swap.b)) {
        std::tie(first, last) = std::minmax(data->swap.a, data->swap.b);
    } else if (code == B_MOVE_OP && mItems.MoveItem(data->move.from, data->move.to)) {
        std::tie(first, last) = std::minmax(data->move.from, data->move.to);
    } else {
        return false;
    }
    std::vector<int32> heights;
    for (int32 i = first; i <= last; ++i) {
        heights.push_back(PixelsOf(RowAt(i)));
    }
    mPositions->Remove(first, last - first + 1);
    mPositions->Insert(first, heights);
    if (HasSelection()) {
        WidenSelectionBounds(first, last);
        TightenSelectionBounds();
    }
    ForgetSelectionCount();
    InvalidateFrom(first);
    return true;
}

void BListView::SortItems(int (*compare)(const void* first, const void* second)) {
    if (compare == nullptr || IsEmpty()) {
        return;
    }
    BListItem* const anchor = ItemAt(mAnchor);
    BListItem* const cursor = ItemAt(mCursor);
    auto** const begin = static_cast<BListItem**>(static_cast<void*>(mItems.Items()));
    std::stable_sort(begin, begin + CountItems(),
                     [compare](BListItem* a, BListItem* b) { return compare(&a, &b) < 0; });
    RebuildPositions();
    mAnchor = anchor == nullptr ? -1 : IndexOf(anchor);
    mCursor = cursor == nullptr ? -1 : IndexOf(cursor);
    EndPress();
    if (HasSelection()) {
        WidenSelectionBounds(0, CountItems() - 1);
        TightenSelectionBounds();
    }
    ForgetSelectionCount();
    Invalidate();
}

void BListView::UpdateAllRows() {
    if (Host() == nullptr) {
        return;
    }
    BFont font;
    GetFont(&font);
    for (int32 i = 0; i < CountItems(); ++i) {
        RowAt(i)->Update(this, &font);
    }
    RebuildPositions();
    FixupScrollBar();
    Invalidate();
}

void BListView::RebuildPositions() {
    std::vector<int32> heights;
    heights.reserve(static_cast<size_t>(CountItems()));
    for (int32 i = 0; i < CountItems(); ++i) {
        heights.push_back(PixelsOf(RowAt(i)));
    }
    mPositions->Clear();
    mPositions->Insert(0, heights);
}

// A row may change its height without telling; whoever looks at it next finds out.
void BListView::TakeHeightFromRow(int32 index) {
    const int32 pixels = PixelsOf(RowAt(index));
    if (pixels != mPositions->HeightOf(index)) {
        mPositions->SetHeight(index, pixels);
        FixupScrollBar();
        InvalidateFrom(index);
    }
}

void BListView::InvalidateItem(int32 index) {
    if (index >= 0 && index < CountItems()) {
        Invalidate(ItemFrame(index));
    }
}

void BListView::InvalidateFrom(int32 index) {
    if (Host() == nullptr) {
        return;
    }
    BRect below = Bounds();
    if (index < CountItems()) {
        below.top = std::max(below.top, static_cast<float>(mPositions->TopOf(index)));
    }
    if (below.IsValid()) {
        Invalidate(below);
    }
}

void BListView::FixupScrollBar() {
    BScrollBar* const bar = ScrollBar(B_VERTICAL);
    if (bar == nullptr) {
        return;
    }
    const float shown = Bounds().Height() + 1;
    const auto all = static_cast<float>(mPositions->TotalHeight());
    bar->SetRange(0, std::max(0.0F, all - shown));
    bar->SetProportion(all <= shown ? 1.0F : shown / all);
    const float step = IsEmpty() ? 1.0F : static_cast<float>(mPositions->HeightOf(0));
    bar->SetSteps(step, std::max(step, shown - step));
}
