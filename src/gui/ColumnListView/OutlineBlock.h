// OutlineBlock: some rows of an outline that follow each other.
#pragma once

#include <SupportDefs.h>

#include <algorithm>
#include <cstddef>
#include <limits>
#include <vector>

class CLVListItem;
class OutlineRows;

constexpr uint32 kDeepestLevel = std::numeric_limits<uint32>::max();

// For OutlineRows alone, which keeps the numbers right.
struct OutlineBlock {
    struct Entry {
        CLVListItem* row;
        uint32 level;
        bool visible;
    };
    typedef std::vector<Entry>::iterator Position;

    explicit OutlineBlock(OutlineRows* owner) : list(owner) {}
    size_t Size() const { return entries.size(); }
    Position At(size_t offset) { return entries.begin() + static_cast<ptrdiff_t>(offset); }
    int32 OffsetOf(const CLVListItem* row) const {
        const auto found = std::find_if(entries.begin(), entries.end(),
                                        [row](const Entry& entry) { return entry.row == row; });
        return static_cast<int32>(found - entries.begin());
    }
    void Count(const Entry& entry) {
        countVisible += entry.visible ? 1 : 0;
        smallestLevel = std::min(smallestLevel, entry.level);
    }
    void CountAll() {
        countVisible = 0;
        smallestLevel = kDeepestLevel;
        for (const Entry& entry : entries) {
            Count(entry);
        }
    }

    OutlineRows* const list;
    int32 firstRow = 0;
    int32 firstVisible = 0;
    int32 countVisible = 0;
    uint32 smallestLevel = kDeepestLevel;
    std::vector<Entry> entries;
};
