#include "RegionBuilder.h"

#include <algorithm>
#include <limits>
#include <span>

namespace {

using Rects = std::vector<clipping_rect>;

// Rectangles of one band, or of none.
using Band = std::span<const clipping_rect>;

// Walks a region's rectangle list band by band.
class BandWalker {
  public:
    explicit BandWalker(const Rects& rects) : mRects(rects) { FindEnd(); }

    bool AtEnd() const { return mBegin == mRects.size(); }
    int32 Top() const { return mRects[mBegin].top; }
    int32 Bottom() const { return mRects[mBegin].bottom; }
    Band Current() const { return Band(mRects).subspan(mBegin, mEnd - mBegin); }
    void Next() {
        mBegin = mEnd;
        FindEnd();
    }

  private:
    void FindEnd() {
        mEnd = mBegin;
        while (mEnd < mRects.size() && mRects[mEnd].top == mRects[mBegin].top) {
            ++mEnd;
        }
    }

    const Rects& mRects;
    std::size_t mBegin = 0;
    std::size_t mEnd = 0;
};

// Appends bands, joining each with the one above it where both have the same runs.
class BandWriter {
  public:
    void Begin(int32 top, int32 bottom) {
        mTop = top;
        mBottom = bottom;
        mStart = mOut.size();
    }
    void AddRun(int32 left, int32 right) {
        if (mOut.size() > mStart && mOut.back().right >= left - 1) {
            mOut.back().right = std::max(mOut.back().right, right);
        } else {
            mOut.push_back({left, mTop, right, mBottom});
        }
    }
    void End() {
        const std::size_t count = mOut.size() - mStart;
        if (count == 0) {
            return;
        }
        if (count == mPreviousCount && JoinsPrevious()) {
            for (std::size_t i = mStart - count; i < mStart; ++i) {
                mOut[i].bottom = mBottom;
            }
            mOut.resize(mStart);
            return;
        }
        mPreviousCount = count;
    }
    Rects Take() { return std::move(mOut); }

  private:
    bool JoinsPrevious() const {
        const std::size_t count = mPreviousCount;
        if (mOut[mStart - count].bottom + 1 != mTop) {
            return false;
        }
        for (std::size_t i = 0; i < count; ++i) {
            const clipping_rect& above = mOut[mStart - count + i];
            const clipping_rect& here = mOut[mStart + i];
            if (above.left != here.left || above.right != here.right) {
                return false;
            }
        }
        return true;
    }

    Rects mOut;
    std::size_t mStart = 0;
    std::size_t mPreviousCount = 0;
    int32 mTop = 0;
    int32 mBottom = 0;
};

// Emits the runs of one band for which `keep(inA, inB)` holds.
template <typename Keep>
void CombineRuns(Band a, Band b, Keep keep, BandWriter& out) {
    static constexpr int32 kNever = std::numeric_limits<int32>::max();
    std::size_t edgeA = 0; // even: outside, waiting for a run's left; odd: inside, waiting for its end
    std::size_t edgeB = 0;
    const auto edge = [](Band band, std::size_t index) {
        if (index / 2 >= band.size()) {
            return kNever;
        }
        const clipping_rect& rect = band[index / 2];
        return index % 2 == 0 ? rect.left : rect.right + 1;
    };
    bool inside = false;
    int32 left = 0;
    for (;;) {
        const int32 x = std::min(edge(a, edgeA), edge(b, edgeB));
        if (x == kNever) {
            break;
        }
        while (edge(a, edgeA) == x) {
            ++edgeA;
        }
        while (edge(b, edgeB) == x) {
            ++edgeB;
        }
        const bool now = keep(edgeA % 2 != 0, edgeB % 2 != 0);
        if (now && !inside) {
            left = x;
        } else if (!now && inside) {
            out.AddRun(left, x - 1);
        }
        inside = now;
    }
}

template <typename Keep>
Rects Combine(const Rects& first, const Rects& second, Keep keep) {
    BandWalker a(first);
    BandWalker b(second);
    BandWriter out;
    int32 y = std::numeric_limits<int32>::min();
    while (!a.AtEnd() || !b.AtEnd()) {
        int32 nearestTop = std::numeric_limits<int32>::max();
        for (const BandWalker* walker : {&a, &b}) {
            if (!walker->AtEnd()) {
                nearestTop = std::min(nearestTop, walker->Top());
            }
        }
        y = std::max(y, nearestTop);
        int32 bottom = std::numeric_limits<int32>::max();
        for (const BandWalker* walker : {&a, &b}) {
            if (!walker->AtEnd()) {
                bottom = std::min(bottom, walker->Top() <= y ? walker->Bottom() : walker->Top() - 1);
            }
        }
        const bool inA = !a.AtEnd() && a.Top() <= y;
        const bool inB = !b.AtEnd() && b.Top() <= y;
        out.Begin(y, bottom);
        CombineRuns(inA ? a.Current() : Band(), inB ? b.Current() : Band(), keep, out);
        out.End();
        if (inA && a.Bottom() == bottom) {
            a.Next();
        }
        if (inB && b.Bottom() == bottom) {
            b.Next();
        }
        y = bottom + 1;
    }
    return out.Take();
}

} // namespace

void RegionBuilder::AddRun(int32 y, int32 left, int32 right) {
    if (left <= right) {
        mRuns.push_back({y, left, right});
    }
}

BRegion RegionBuilder::Build() {
    const auto before = [](const Run& a, const Run& b) { return a.y != b.y ? a.y < b.y : a.left < b.left; };
    if (!std::is_sorted(mRuns.begin(), mRuns.end(), before)) {
        std::sort(mRuns.begin(), mRuns.end(), before);
    }
    BandWriter out;
    for (std::size_t i = 0; i < mRuns.size();) {
        const int32 y = mRuns[i].y;
        out.Begin(y, y);
        for (; i < mRuns.size() && mRuns[i].y == y; ++i) {
            out.AddRun(mRuns[i].left, mRuns[i].right);
        }
        out.End();
    }
    mRuns.clear();
    BRegion region;
    region.mRects = out.Take();
    return region;
}

std::vector<clipping_rect> RegionBuilder::Union(const std::vector<clipping_rect>& a,
                                                const std::vector<clipping_rect>& b) {
    return Combine(a, b, [](bool inA, bool inB) { return inA || inB; });
}

std::vector<clipping_rect> RegionBuilder::Intersection(const std::vector<clipping_rect>& a,
                                                       const std::vector<clipping_rect>& b) {
    return Combine(a, b, [](bool inA, bool inB) { return inA && inB; });
}

std::vector<clipping_rect> RegionBuilder::Difference(const std::vector<clipping_rect>& a,
                                                     const std::vector<clipping_rect>& b) {
    return Combine(a, b, [](bool inA, bool inB) { return inA && !inB; });
}
