// RowPositions: where the rows of a list lie, without walking through them.
#pragma once

#include <SupportDefs.h>

#include <vector>

// Rows stacked from 0 downwards, each some whole pixels high, without gaps. They are kept in blocks of some
// hundred rows that know where they begin: appending costs nothing that grows with the number of rows;
// finding a row, inserting and removing cost one block and one step for each block. Indices are the caller's
// to keep in range. Not synchronised.
class RowPositions {
  public:
    int32 CountRows() const { return mCount; }
    int64 TotalHeight() const { return mHeight; }

    int64 TopOf(int32 row) const;
    int32 HeightOf(int32 row) const;
    // The row that covers this pixel; -1 above the first and below the last.
    int32 RowAt(int64 y) const;

    void Insert(int32 row, const std::vector<int32>& heights);
    void Remove(int32 row, int32 count);
    void SetHeight(int32 row, int32 height);
    void Clear();

  private:
    struct Block {
        int32 firstRow = 0;
        int64 top = 0;
        int64 height = 0;
        std::vector<int32> heights;
    };

    size_t BlockOf(int32 row) const;
    void Append(const std::vector<int32>& heights);
    void InsertBlocks(int32 row, const std::vector<int32>& heights);
    void SplitWhenFull(size_t block);
    void Split(size_t block, size_t offset);
    void MergeWhenSmall(size_t block);
    // Where this block and all behind it begin.
    void PlaceBlocksFrom(size_t block);

    std::vector<Block> mBlocks; // none of them empty
    int32 mCount = 0;
    int64 mHeight = 0;
};
