// A column list on a stage, without bars.
#pragma once

#include "kits/interface/ViewStage.h"

#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/ColumnListView.h"

#include <gtest/gtest.h>

class ListOnStage : public testing::Test {
  protected:
    static constexpr int32 kWidth = 300;
    static constexpr int32 kHeight = 200;

    // With columns of these widths and flags, from the left.
    struct Column {
        float width;
        unsigned long flags;
    };

    ~ListOnStage() override {
        if (mList != nullptr) {
            mStage.Locked([this] { mList->MakeEmpty(); });
        }
    }
    void MakeList(bool hierarchical, const std::vector<Column>& columns) {
        CLVContainerView* container = nullptr;
        mList = new ColumnListView(BRect(0, 0, kWidth - 1, kHeight - 1), &container, "list", B_FOLLOW_NONE,
                                   B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE, B_MULTIPLE_SELECTION_LIST,
                                   hierarchical, false, false, false, B_NO_BORDER);
        for (const Column& column : columns) {
            EXPECT_TRUE(mList->AddColumn(new CLVColumn("Label", column.width, column.flags, 4)));
        }
        mStage.Add(container);
        mStage.Redraw();
    }
    void Add(CLVListItem* row) {
        mStage.Locked([&] { EXPECT_TRUE(mList->AddItem(row)); });
    }
    void RedrawAll() {
        mStage.Locked([this] { mList->Invalidate(); });
        mStage.Redraw();
    }

    // In the list's coordinates.
    uint32 At(float x, float y) const {
        const BPoint point = mList->ConvertToSurface(BPoint(x, y));
        return mStage.At(static_cast<int32>(point.x), static_cast<int32>(point.y));
    }
    BRect OnStage(BRect rect) const {
        const BPoint origin = mList->ConvertToSurface(B_ORIGIN);
        return rect.OffsetByCopy(origin);
    }
    // Pixels of this colour, or of any but this one.
    int CountOf(uint32 color, BRect rect) const { return mStage.CountOf(color, OnStage(rect)); }
    int CountOther(uint32 color, BRect rect) const { return mStage.CountOther(color, OnStage(rect)); }
    // Everything that shows of the list.
    std::vector<uint32> Pixels() const {
        std::vector<uint32> pixels;
        const BRect bounds = OnStage(mList->Bounds());
        for (auto y = static_cast<int32>(bounds.top); y <= static_cast<int32>(bounds.bottom); ++y) {
            for (auto x = static_cast<int32>(bounds.left); x <= static_cast<int32>(bounds.right); ++x) {
                pixels.push_back(mStage.At(x, y));
            }
        }
        return pixels;
    }

    // That what shows would look the same if all of it were drawn anew, which it then is.
    testing::AssertionResult IsDrawnAsAnew() {
        const std::vector<uint32> before = Pixels();
        RedrawAll();
        const std::vector<uint32> after = Pixels();
        const auto differs = std::mismatch(before.begin(), before.end(), after.begin(), after.end()).first;
        if (before.size() == after.size() && differs == before.end()) {
            return testing::AssertionSuccess();
        }
        const auto at = static_cast<int32>(differs - before.begin());
        return testing::AssertionFailure()
               << "the first difference is at " << at % kWidth << "," << at / kWidth;
    }

    ViewStage mStage{kWidth, kHeight};
    ColumnListView* mList = nullptr; // the stage's
};
