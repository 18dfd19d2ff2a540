// The part of OutlineRows that changes what is in it.
#include "gui/ColumnListView/OutlineRows.h"

#include "gui/ColumnListView/CLVListItem.h"
#include "gui/ColumnListView/OutlineBlock.h"

#include <algorithm>

namespace {

constexpr size_t kFullBlock = 1024;
// Two neighbours that have fewer together become one.
constexpr size_t kSmallPair = 256;

} // namespace

void OutlineRows::Insert(int32 index, CLVListItem* row, bool visible) {
    if (index >= mCount) {
        Append(row, visible);
        return;
    }
    const size_t number = BlockOf(index);
    OutlineBlock& block = *mBlocks[number];
    const OutlineBlock::Entry entry{row, row->OutlineLevel(), visible};
    block.entries.insert(block.At(static_cast<size_t>(index - block.firstRow)), entry);
    block.Count(entry);
    row->PlaceInOutline().block = mBlocks[number];
    ++mCount;
    mCountVisible += visible ? 1 : 0;
    mAncestorsOfEndAreKnown = false;
    if (block.Size() >= kFullBlock) {
        SplitBlock(number, kFullBlock / 2);
    }
    NumberBlocksFrom(number);
}

void OutlineRows::Insert(int32 index, const std::vector<NewRow>& rows) {
    if (index >= mCount || rows.size() < kSmallPair) {
        for (const NewRow& added : rows) {
            Insert(index++, added.row, added.visible);
        }
        return;
    }
    const std::vector<std::shared_ptr<OutlineBlock>> behind = TakeBlocksFrom(index);
    const size_t firstNew = mBlocks.size();
    for (const NewRow& added : rows) {
        Append(added.row, added.visible);
    }
    const size_t firstBehind = mBlocks.size();
    mBlocks.insert(mBlocks.end(), behind.begin(), behind.end());
    for (const auto& block : behind) {
        mCount += static_cast<int32>(block->Size());
        mCountVisible += block->countVisible;
    }
    mAncestorsOfEndAreKnown = false;
    NumberBlocksFrom(firstNew);
    MergeWhenSmall(firstBehind);
    MergeWhenSmall(firstNew);
}

void OutlineRows::Append(CLVListItem* row, bool visible) {
    // Half full, so that later insertions find room.
    if (mBlocks.empty() || mBlocks.back()->Size() >= kFullBlock / 2) {
        mBlocks.push_back(std::make_shared<OutlineBlock>(this));
        mBlocks.back()->firstRow = mCount;
        mBlocks.back()->firstVisible = mCountVisible;
    }
    OutlineBlock& block = *mBlocks.back();
    const OutlineBlock::Entry entry{row, row->OutlineLevel(), visible};
    block.entries.push_back(entry);
    block.Count(entry);
    row->PlaceInOutline().block = mBlocks.back();
    if (mAncestorsOfEndAreKnown) {
        while (!mAncestorsOfEnd.empty() && mAncestorsOfEnd.back().level >= entry.level) {
            mAncestorsOfEnd.pop_back();
        }
        mAncestorsOfEnd.push_back({mCount, entry.level});
    }
    ++mCount;
    mCountVisible += visible ? 1 : 0;
}

void OutlineRows::Remove(int32 index, int32 count) {
    if (count <= 0) {
        return;
    }
    const size_t first = BlockOf(index);
    size_t number = first;
    for (int32 left = count; left > 0; ++number) {
        OutlineBlock& block = *mBlocks[number];
        const auto begin = block.At(number == first ? static_cast<size_t>(index - block.firstRow) : 0);
        const auto end = begin + std::min<ptrdiff_t>(left, block.entries.end() - begin);
        for (auto entry = begin; entry != end; ++entry) {
            entry->row->PlaceInOutline().block.reset();
            mCountVisible -= entry->visible ? 1 : 0;
        }
        left -= static_cast<int32>(end - begin);
        block.entries.erase(begin, end);
        block.CountAll();
    }
    mCount -= count;
    mAncestorsOfEndAreKnown = false;
    const auto from = mBlocks.begin() + static_cast<ptrdiff_t>(first);
    const auto to = mBlocks.begin() + static_cast<ptrdiff_t>(number);
    mBlocks.erase(std::remove_if(from, to, [](const auto& block) { return block->entries.empty(); }), to);
    NumberBlocksFrom(first);
    MergeWhenSmall(first + 1);
    MergeWhenSmall(first);
}

void OutlineRows::Clear() {
    mBlocks.clear();
    mCount = 0;
    mCountVisible = 0;
    mAncestorsOfEnd.clear();
    mAncestorsOfEndAreKnown = true;
}

std::vector<CLVListItem*> OutlineRows::Show(int32 from, int32 to) {
    std::vector<CLVListItem*> shown;
    if (from >= to) {
        return shown;
    }
    const size_t first = BlockOf(from);
    size_t number = first;
    while (from < to) {
        OutlineBlock& block = *mBlocks[number];
        const int32 end = std::min(to, block.firstRow + static_cast<int32>(block.Size()));
        int32 next = from;
        while (next < end) {
            OutlineBlock::Entry& entry = block.entries[static_cast<size_t>(next - block.firstRow)];
            entry.visible = true;
            shown.push_back(entry.row);
            const bool nextIsDeeper =
                next + 1 == end ||
                block.entries[static_cast<size_t>(next + 1 - block.firstRow)].level > entry.level;
            next = nextIsDeeper && !entry.row->IsExpanded() ? FindEndBelow(next, entry.level) : next + 1;
        }
        block.CountAll();
        from = next;
        while (number + 1 < mBlocks.size() && mBlocks[number + 1]->firstRow <= from) {
            ++number;
        }
    }
    NumberBlocksFrom(first);
    mCountVisible = mBlocks.back()->firstVisible + mBlocks.back()->countVisible;
    return shown;
}

int32 OutlineRows::Hide(int32 from, int32 to) {
    const int32 before = mCountVisible;
    if (from >= to) {
        return 0;
    }
    const size_t first = BlockOf(from);
    for (size_t number = first; from < to; ++number) {
        OutlineBlock& block = *mBlocks[number];
        const int32 end = std::min(to, block.firstRow + static_cast<int32>(block.Size()));
        for (; from < end; ++from) {
            block.entries[static_cast<size_t>(from - block.firstRow)].visible = false;
        }
        block.CountAll();
    }
    NumberBlocksFrom(first);
    mCountVisible = mBlocks.back()->firstVisible + mBlocks.back()->countVisible;
    return before - mCountVisible;
}

void OutlineRows::Reorder(const std::vector<CLVListItem*>& rows) {
    std::vector<NewRow> reordered;
    reordered.reserve(rows.size());
    for (CLVListItem* const row : rows) {
        row->PlaceInOutline().rank = static_cast<int32>(reordered.size());
        reordered.push_back({row, false});
    }
    for (const auto& block : mBlocks) {
        for (const OutlineBlock::Entry& entry : block->entries) {
            reordered[static_cast<size_t>(entry.row->PlaceInOutline().rank)].visible = entry.visible;
        }
    }
    Clear();
    Insert(0, reordered);
}

void OutlineRows::LevelChanged(const CLVListItem* row) {
    const std::shared_ptr<OutlineBlock> block = row->PlaceInOutline().block.lock();
    if (block != nullptr) {
        block->entries[static_cast<size_t>(block->OffsetOf(row))].level = row->OutlineLevel();
        block->CountAll();
        block->list->mAncestorsOfEndAreKnown = false;
    }
}

std::vector<std::shared_ptr<OutlineBlock>> OutlineRows::TakeBlocksFrom(int32 index) {
    size_t number = BlockOf(index);
    if (const int32 offset = index - mBlocks[number]->firstRow; offset > 0) {
        SplitBlock(number, static_cast<size_t>(offset));
        ++number;
    }
    const auto from = mBlocks.begin() + static_cast<ptrdiff_t>(number);
    std::vector<std::shared_ptr<OutlineBlock>> taken(from, mBlocks.end());
    mBlocks.erase(from, mBlocks.end());
    for (const auto& block : taken) {
        mCount -= static_cast<int32>(block->Size());
        mCountVisible -= block->countVisible;
    }
    mAncestorsOfEndAreKnown = false;
    return taken;
}

// The numbers of what comes behind are the caller's to mend.
void OutlineRows::SplitBlock(size_t number, size_t offset) {
    OutlineBlock& block = *mBlocks[number];
    auto second = std::make_shared<OutlineBlock>(this);
    second->entries.assign(block.At(offset), block.entries.end());
    block.entries.erase(block.At(offset), block.entries.end());
    for (const OutlineBlock::Entry& entry : second->entries) {
        entry.row->PlaceInOutline().block = second;
    }
    block.CountAll();
    second->CountAll();
    mBlocks.insert(mBlocks.begin() + static_cast<ptrdiff_t>(number) + 1, std::move(second));
}

// With the one before it.
void OutlineRows::MergeWhenSmall(size_t number) {
    if (number == 0 || number >= mBlocks.size() ||
        mBlocks[number - 1]->Size() + mBlocks[number]->Size() >= kSmallPair) {
        return;
    }
    OutlineBlock& kept = *mBlocks[number - 1];
    for (const OutlineBlock::Entry& entry : mBlocks[number]->entries) {
        entry.row->PlaceInOutline().block = mBlocks[number - 1];
        kept.entries.push_back(entry);
        kept.Count(entry);
    }
    mBlocks.erase(mBlocks.begin() + static_cast<ptrdiff_t>(number));
}

void OutlineRows::NumberBlocksFrom(size_t number) {
    for (; number < mBlocks.size(); ++number) {
        OutlineBlock& block = *mBlocks[number];
        block.firstRow = 0;
        block.firstVisible = 0;
        if (number > 0) {
            const OutlineBlock& before = *mBlocks[number - 1];
            block.firstRow = before.firstRow + static_cast<int32>(before.Size());
            block.firstVisible = before.firstVisible + before.countVisible;
        }
    }
}
