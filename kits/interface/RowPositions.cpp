#include "RowPositions.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <numeric>

namespace {

constexpr size_t kFullBlock = 1024;
// Two neighbours that have fewer together become one.
constexpr size_t kSmallPair = 256;

int64 Sum(std::vector<int32>::const_iterator from, std::vector<int32>::const_iterator to) {
    return std::accumulate(from, to, int64{0});
}

} // namespace

size_t RowPositions::BlockOf(int32 row) const {
    const auto behind =
        std::upper_bound(mBlocks.begin(), mBlocks.end(), row,
                         [](int32 wanted, const Block& block) { return wanted < block.firstRow; });
    return static_cast<size_t>(behind - mBlocks.begin()) - 1;
}

// From the nearer end of its block: the last row, behind which the next is appended, is asked for most.
int64 RowPositions::TopOf(int32 row) const {
    const Block& block = mBlocks[BlockOf(row)];
    const auto offset = static_cast<size_t>(row - block.firstRow);
    const auto at = block.heights.begin() + static_cast<std::ptrdiff_t>(offset);
    if (offset > block.heights.size() / 2) {
        return block.top + block.height - Sum(at, block.heights.end());
    }
    return block.top + Sum(block.heights.begin(), at);
}

int32 RowPositions::HeightOf(int32 row) const {
    const Block& block = mBlocks[BlockOf(row)];
    return block.heights[static_cast<size_t>(row - block.firstRow)];
}

int32 RowPositions::RowAt(int64 y) const {
    if (y < 0 || y >= mHeight) {
        return -1;
    }
    const auto behind = std::upper_bound(mBlocks.begin(), mBlocks.end(), y,
                                         [](int64 wanted, const Block& block) { return wanted < block.top; });
    const Block& block = *std::prev(behind);
    int64 bottom = block.top;
    int32 row = block.firstRow;
    for (const int32 height : block.heights) {
        bottom += height;
        if (y < bottom) {
            break;
        }
        ++row;
    }
    return row;
}

void RowPositions::Insert(int32 row, const std::vector<int32>& heights) {
    if (row == mCount) {
        Append(heights);
        return;
    }
    if (heights.size() >= kSmallPair) {
        InsertBlocks(row, heights);
        return;
    }
    for (const int32 height : heights) {
        const size_t index = BlockOf(row);
        Block& block = mBlocks[index];
        block.heights.insert(block.heights.begin() + (row - block.firstRow), height);
        block.height += height;
        mHeight += height;
        ++mCount;
        ++row;
        PlaceBlocksFrom(index);
        SplitWhenFull(index);
    }
}

// Many at once: in blocks of their own, so that what is behind moves once.
void RowPositions::InsertBlocks(int32 row, const std::vector<int32>& heights) {
    size_t index = BlockOf(row);
    if (const int32 offset = row - mBlocks[index].firstRow; offset > 0) {
        Split(index, static_cast<size_t>(offset));
        ++index;
    }
    RowPositions added;
    added.Append(heights);
    const auto place = mBlocks.begin() + static_cast<ptrdiff_t>(index);
    mBlocks.insert(place, std::make_move_iterator(added.mBlocks.begin()),
                   std::make_move_iterator(added.mBlocks.end()));
    mCount += added.mCount;
    mHeight += added.mHeight;
    PlaceBlocksFrom(index);
    MergeWhenSmall(index + added.mBlocks.size());
    MergeWhenSmall(index);
}

void RowPositions::Append(const std::vector<int32>& heights) {
    for (const int32 height : heights) {
        // Half full, so that later insertions find room.
        if (mBlocks.empty() || mBlocks.back().heights.size() >= kFullBlock / 2) {
            mBlocks.push_back({mCount, mHeight, 0, {}});
        }
        mBlocks.back().heights.push_back(height);
        mBlocks.back().height += height;
        mHeight += height;
        ++mCount;
    }
}

void RowPositions::Remove(int32 row, int32 count) {
    while (count > 0) {
        const size_t index = BlockOf(row);
        Block& block = mBlocks[index];
        const auto begin = block.heights.begin() + (row - block.firstRow);
        const int32 taken = std::min(count, static_cast<int32>(block.heights.end() - begin));
        const int64 height = Sum(begin, begin + taken);
        block.heights.erase(begin, begin + taken);
        block.height -= height;
        mHeight -= height;
        mCount -= taken;
        count -= taken;
        if (block.heights.empty()) {
            mBlocks.erase(mBlocks.begin() + static_cast<ptrdiff_t>(index));
        }
        PlaceBlocksFrom(index);
        if (index < mBlocks.size()) {
            MergeWhenSmall(index);
        }
    }
}

void RowPositions::SetHeight(int32 row, int32 height) {
    const size_t index = BlockOf(row);
    Block& block = mBlocks[index];
    int32& kept = block.heights[static_cast<size_t>(row - block.firstRow)];
    block.height += height - kept;
    mHeight += height - kept;
    kept = height;
    PlaceBlocksFrom(index);
}

void RowPositions::Clear() {
    *this = RowPositions();
}

void RowPositions::SplitWhenFull(size_t index) {
    if (mBlocks[index].heights.size() >= kFullBlock) {
        Split(index, kFullBlock / 2);
        PlaceBlocksFrom(index);
    }
}

// Where the second one begins is the caller's to find out.
void RowPositions::Split(size_t index, size_t offset) {
    Block& first = mBlocks[index];
    const auto middle = first.heights.begin() + static_cast<ptrdiff_t>(offset);
    Block second;
    second.heights.assign(middle, first.heights.end());
    second.height = Sum(middle, first.heights.end());
    first.heights.erase(middle, first.heights.end());
    first.height -= second.height;
    mBlocks.insert(mBlocks.begin() + static_cast<ptrdiff_t>(index) + 1, std::move(second));
}

void RowPositions::MergeWhenSmall(size_t index) {
    const size_t second = std::max<size_t>(index, 1);
    if (second >= mBlocks.size() ||
        mBlocks[second - 1].heights.size() + mBlocks[second].heights.size() >= kSmallPair) {
        return;
    }
    Block& kept = mBlocks[second - 1];
    const Block& gone = mBlocks[second];
    kept.heights.insert(kept.heights.end(), gone.heights.begin(), gone.heights.end());
    kept.height += gone.height;
    mBlocks.erase(mBlocks.begin() + static_cast<ptrdiff_t>(second));
}

void RowPositions::PlaceBlocksFrom(size_t index) {
    for (; index < mBlocks.size(); ++index) {
        Block& block = mBlocks[index];
        block.firstRow = 0;
        block.top = 0;
        if (index > 0) {
            const Block& before = mBlocks[index - 1];
            block.firstRow = before.firstRow + static_cast<int32>(before.heights.size());
            block.top = before.top + before.height;
        }
    }
}
