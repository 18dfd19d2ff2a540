// A list in a scroll view on a stage, with rows that count what is done to them.
#pragma once

#include "MessageCatcher.h"
#include "ViewStage.h"

#include <ListView.h>
#include <ScrollView.h>

#include <gtest/gtest.h>
#include <memory>
#include <numeric>
#include <vector>

// A row of a height of its own that counts how often it was drawn and updated.
class TestRow : public BListItem {
  public:
    explicit TestRow(int number, float height = 9) : mNumber(number), mHeightAtUpdate(height) {}
    void DrawItem(BView* owner, BRect frame, bool complete) override {
        ++drawn;
        drawnComplete = complete;
        if (IsSelected()) {
            owner->SetHighColor(178, 178, 178);
            owner->FillRect(frame);
        }
    }
    void Update(BView* /*owner*/, const BFont* /*font*/) override {
        ++updated;
        SetHeight(mHeightAtUpdate);
        SetWidth(50);
    }
    int Number() const { return mNumber; }

    int drawn = 0;
    int updated = 0;
    bool drawnComplete = true;

  private:
    int mNumber;
    float mHeightAtUpdate;
};

class TestList : public BListView {
  public:
    using BListView::BListView;
    void SelectionChanged() override { ++changes; }
    bool InitiateDrag(BPoint where, int32 index, bool wasSelected) override {
        ++drags;
        dragged = index;
        draggedFrom = where;
        draggedSelected = wasSelected;
        return dragsBegin;
    }
    int changes = 0;
    int drags = 0;
    int32 dragged = -1;
    BPoint draggedFrom;
    bool draggedSelected = false;
    bool dragsBegin = false;
};

// A list of 100 x 60 pixels in a vertical scroll view, filled with rows of 10 pixels.
class Lists : public ::testing::Test {
  protected:
    void Fill(int count, list_view_type type = B_MULTIPLE_SELECTION_LIST) {
        mList = new TestList(BRect(0, 0, 99, 59), "list", type, B_FOLLOW_ALL,
                             B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE);
        for (int i = 0; i < count; ++i) {
            mRows.push_back(std::make_unique<TestRow>(i));
            mList->AddItem(mRows.back().get());
        }
        mList->SetSelectionMessage(new BMessage('sele'));
        mList->SetInvocationMessage(new BMessage('invo'));
        mList->SetTarget(mCatcher.Messenger());
        auto* const scrollView =
            new BScrollView("scroll", mList, B_FOLLOW_ALL, 0, false, true, B_FANCY_BORDER);
        scrollView->MoveTo(0, 0);
        mStage.Add(scrollView);
        mStage.Redraw();
    }
    std::vector<int> Selection() {
        std::vector<int> rows;
        mStage.Locked([&] {
            for (int32 i = 0; mList->CurrentSelection(i) >= 0; ++i) {
                rows.push_back(mList->CurrentSelection(i));
            }
            std::vector<int> selected;
            for (int32 i = 0; i < mList->CountItems(); ++i) {
                if (mList->IsItemSelected(i)) {
                    selected.push_back(i);
                }
            }
            EXPECT_EQ(rows, selected);
        });
        return rows;
    }
    std::vector<int> Order() {
        std::vector<int> numbers;
        mStage.Locked([&] {
            for (int32 i = 0; i < mList->CountItems(); ++i) {
                numbers.push_back(static_cast<TestRow*>(mList->ItemAt(i))->Number());
            }
        });
        return numbers;
    }
    int Drawn() {
        return std::accumulate(mRows.begin(), mRows.end(), 0,
                               [](int sum, const auto& row) { return sum + row->drawn; });
    }
    void ForgetDrawn() {
        for (const auto& row : mRows) {
            row->drawn = 0;
        }
    }
    BPoint On(int row) { return {50, static_cast<float>(row * 10 + 5)}; }
    float Top() {
        float top = 0;
        mStage.Locked([&] { top = mList->Bounds().top; });
        return top;
    }

    typedef std::vector<int> Numbers;

    MessageCatcher mCatcher;
    ViewStage mStage{130, 80};
    TestList* mList = nullptr; // belongs to the stage
    std::vector<std::unique_ptr<TestRow>> mRows;
};
