#include "gui/ColumnListView/OutlineRows.h"

#include "gui/ColumnListView/CLVListItem.h"
#include "gui/ColumnListView/OutlineBlock.h"

#include <algorithm>
#include <iterator>

OutlineRows::OutlineRows() = default;

OutlineRows::~OutlineRows() = default;

size_t OutlineRows::BlockOf(int32 index) const {
    const auto behind = std::upper_bound(
        mBlocks.begin(), mBlocks.end(), index,
        [](int32 wanted, const std::shared_ptr<OutlineBlock>& block) { return wanted < block->firstRow; });
    return static_cast<size_t>(behind - mBlocks.begin()) - 1;
}

CLVListItem* OutlineRows::RowAt(int32 index) const {
    const OutlineBlock& block = *mBlocks[BlockOf(index)];
    return block.entries[static_cast<size_t>(index - block.firstRow)].row;
}

bool OutlineRows::Has(const CLVListItem* row) const {
    if (row == nullptr) {
        return false;
    }
    const std::shared_ptr<OutlineBlock> block = row->PlaceInOutline().block.lock();
    return block != nullptr && block->list == this;
}

int32 OutlineRows::IndexOf(const CLVListItem* row) const {
    if (!Has(row)) {
        return -1;
    }
    const OutlineBlock& block = *row->PlaceInOutline().block.lock();
    return block.firstRow + block.OffsetOf(row);
}

std::vector<CLVListItem*> OutlineRows::Rows(int32 from, int32 to) const {
    std::vector<CLVListItem*> rows;
    rows.reserve(static_cast<size_t>(std::max(0, to - from)));
    for (size_t index = from < to ? BlockOf(from) : 0; from < to; ++index) {
        const OutlineBlock& block = *mBlocks[index];
        const int32 end = std::min(to, block.firstRow + static_cast<int32>(block.Size()));
        for (; from < end; ++from) {
            rows.push_back(block.entries[static_cast<size_t>(from - block.firstRow)].row);
        }
    }
    return rows;
}

bool OutlineRows::IsVisible(const CLVListItem* row) const {
    if (!Has(row)) {
        return false;
    }
    const OutlineBlock& block = *row->PlaceInOutline().block.lock();
    return block.entries[static_cast<size_t>(block.OffsetOf(row))].visible;
}

int32 OutlineRows::CountVisibleBefore(int32 index) const {
    if (index >= mCount) {
        return mCountVisible;
    }
    OutlineBlock& block = *mBlocks[BlockOf(index)];
    const auto end = block.At(static_cast<size_t>(index - block.firstRow));
    return block.firstVisible +
           static_cast<int32>(std::count_if(block.entries.begin(), end,
                                            [](const OutlineBlock::Entry& entry) { return entry.visible; }));
}

int32 OutlineRows::IndexOfVisible(int32 visible) const {
    // Of several blocks with the same number of visible rows before them, the last has them.
    const auto behind = std::upper_bound(mBlocks.begin(), mBlocks.end(), visible,
                                         [](int32 wanted, const std::shared_ptr<OutlineBlock>& block) {
                                             return wanted < block->firstVisible;
                                         });
    const OutlineBlock& block = **std::prev(behind);
    int32 left = visible - block.firstVisible;
    int32 index = block.firstRow;
    for (const OutlineBlock::Entry& entry : block.entries) {
        if (entry.visible && left-- == 0) {
            break;
        }
        ++index;
    }
    return index;
}

int32 OutlineRows::FindSuper(int32 index, uint32 level) const {
    if (level == 0) {
        return -1;
    }
    if (index < mCount) {
        return ScanForSuper(index, level);
    }
    if (!mAncestorsOfEndAreKnown) {
        FindAncestorsOfEnd();
    }
    const auto super = std::find_if(mAncestorsOfEnd.rbegin(), mAncestorsOfEnd.rend(),
                                    [level](const Ancestor& ancestor) { return ancestor.level < level; });
    return super == mAncestorsOfEnd.rend() ? -1 : super->index;
}

int32 OutlineRows::ScanForSuper(int32 index, uint32 level) const {
    if (index == 0) {
        return -1;
    }
    const size_t first = BlockOf(index - 1);
    for (size_t number = first + 1; number-- > 0;) {
        const OutlineBlock& block = *mBlocks[number];
        if (block.smallestLevel >= level) {
            continue;
        }
        const size_t end = number == first ? static_cast<size_t>(index - block.firstRow) : block.Size();
        for (size_t offset = end; offset-- > 0;) {
            if (block.entries[offset].level < level) {
                return block.firstRow + static_cast<int32>(offset);
            }
        }
    }
    return -1;
}

void OutlineRows::FindAncestorsOfEnd() const {
    mAncestorsOfEnd.clear();
    uint32 level = kDeepestLevel;
    for (int32 index = ScanForSuper(mCount, level); index >= 0; index = ScanForSuper(index, level)) {
        const OutlineBlock& block = *mBlocks[BlockOf(index)];
        level = block.entries[static_cast<size_t>(index - block.firstRow)].level;
        mAncestorsOfEnd.push_back({index, level});
    }
    std::reverse(mAncestorsOfEnd.begin(), mAncestorsOfEnd.end());
    mAncestorsOfEndAreKnown = true;
}

int32 OutlineRows::FindEndBelow(int32 index, uint32 level) const {
    if (index + 1 >= mCount) {
        return mCount;
    }
    const size_t first = BlockOf(index + 1);
    for (size_t number = first; number < mBlocks.size(); ++number) {
        const OutlineBlock& block = *mBlocks[number];
        if (block.smallestLevel > level) {
            continue;
        }
        size_t offset = number == first ? static_cast<size_t>(index + 1 - block.firstRow) : 0;
        for (; offset < block.Size(); ++offset) {
            if (block.entries[offset].level <= level) {
                return block.firstRow + static_cast<int32>(offset);
            }
        }
    }
    return mCount;
}

uint32 OutlineRows::SmallestLevel(int32 index, int32 count) const {
    const int32 end = index + count;
    uint32 smallest = kDeepestLevel;
    for (size_t number = BlockOf(index); index < end; ++number) {
        const OutlineBlock& block = *mBlocks[number];
        const int32 blockEnd = block.firstRow + static_cast<int32>(block.Size());
        if (index == block.firstRow && blockEnd <= end) {
            smallest = std::min(smallest, block.smallestLevel);
            index = blockEnd;
            continue;
        }
        for (; index < std::min(end, blockEnd); ++index) {
            smallest = std::min(smallest, block.entries[static_cast<size_t>(index - block.firstRow)].level);
        }
    }
    return smallest;
}
