// OutlineRows: all rows of an outline in order, and which of them are to be seen.
#pragma once

#include "gui/ColumnListView/OutlinePlace.h"

#include <SupportDefs.h>

#include <memory>
#include <vector>

class CLVListItem;

// Each row is followed by all rows below it, which have larger levels. The rows are kept in blocks of some
// hundred that know how many are visible and the smallest level in them: finding, inserting, removing, a
// row's super-row, the end of its subtree and its place among the visible rows cost one block and one step
// for each block, appending costs neither. Indices are the caller's to keep in range. The rows belong to the
// application, are in one OutlineRows at a time, and must live until they are removed; Clear() does not touch
// them. Not synchronised.
class OutlineRows {
  public:
    struct NewRow {
        CLVListItem* row;
        bool visible;
    };

    OutlineRows();
    ~OutlineRows();
    OutlineRows(const OutlineRows&) = delete;
    OutlineRows& operator=(const OutlineRows&) = delete;

    int32 CountRows() const { return mCount; }
    int32 CountVisible() const { return mCountVisible; }
    CLVListItem* RowAt(int32 index) const;
    // -1 when it is not in here.
    int32 IndexOf(const CLVListItem* row) const;
    bool Has(const CLVListItem* row) const;
    std::vector<CLVListItem*> Rows(int32 from, int32 to) const;

    bool IsVisible(const CLVListItem* row) const;
    // How many visible rows stand before this index, which may be CountRows().
    int32 CountVisibleBefore(int32 index) const;
    // The index of a visible row, given its place among them.
    int32 IndexOfVisible(int32 visible) const;

    // The nearest row before `index`, which may be CountRows(), of a smaller level than `level`; -1 when
    // there is none.
    int32 FindSuper(int32 index, uint32 level) const;
    // The first index behind `index` whose row is not deeper than `level`; CountRows() when there is none.
    int32 FindEndBelow(int32 index, uint32 level) const;
    // The smallest level among these rows, of which there is at least one.
    uint32 SmallestLevel(int32 index, int32 count) const;

    // Before the row at `index`, which may be CountRows().
    void Insert(int32 index, CLVListItem* row, bool visible);
    void Insert(int32 index, const std::vector<NewRow>& rows);
    void Remove(int32 index, int32 count);
    void Clear();
    // The rows from `from` to before `to` become visible, but for those below one among them that is
    // collapsed. Answers those that are visible now.
    std::vector<CLVListItem*> Show(int32 from, int32 to);
    // Answers how many of these rows were visible.
    int32 Hide(int32 from, int32 to);
    // The same rows in another order; visible ones stay so. Each row's `rank` becomes its index.
    void Reorder(const std::vector<CLVListItem*>& rows);

    // To be called when a row's level has changed, wherever the row is.
    static void LevelChanged(const CLVListItem* row);

  private:
    // A row, and the one nearest before it of a smaller level, and so on.
    struct Ancestor {
        int32 index;
        uint32 level;
    };

    size_t BlockOf(int32 index) const;
    void Append(CLVListItem* row, bool visible);
    std::vector<std::shared_ptr<OutlineBlock>> TakeBlocksFrom(int32 index);
    void SplitBlock(size_t number, size_t offset);
    void MergeWhenSmall(size_t number);
    void NumberBlocksFrom(size_t number);
    int32 ScanForSuper(int32 index, uint32 level) const;
    void FindAncestorsOfEnd() const;

    // None of them empty.
    std::vector<std::shared_ptr<OutlineBlock>> mBlocks;
    int32 mCount = 0;
    int32 mCountVisible = 0;
    // Of a row that would be appended with the largest level; the topmost first.
    mutable std::vector<Ancestor> mAncestorsOfEnd;
    mutable bool mAncestorsOfEndAreKnown = true;
};
