// Rows of a column list that know their number and are drawn white.
#pragma once

#include "gui/ColumnListView/CLVListItem.h"
#include "gui/ColumnListView/ColumnListView.h"

#include <memory>
#include <utility>
#include <vector>

class NumberedRow : public CLVListItem {
  public:
    explicit NumberedRow(int rowNumber, uint32 level = 0, bool expanded = true, float height = 19)
        : CLVListItem(level, false, expanded, height), number(rowNumber), mHeight(height) {
        SetHeight(height);
    }
    void DrawItemColumn(BView* owner, BRect rect, int32 columnIndex, bool complete) override {
        drawnColumns.push_back(columnIndex);
        if (complete) {
            owner->SetHighColor(255, 255, 255);
            owner->FillRect(rect);
        }
    }
    void Update(BView* owner, const BFont* /*font*/) override {
        SetHeight(mHeight);
        SetWidth(owner->Bounds().Width());
    }
    void ColumnWidthChanged(int32 columnIndex, float width, ColumnListView* /*owner*/) override {
        toldWidths.emplace_back(columnIndex, width);
    }
    void FrameChanged(int32 columnIndex, BRect frame, ColumnListView* /*owner*/) override {
        toldFrames.emplace_back(columnIndex, frame);
    }

    const int number;
    // What sort keys look at, by column.
    std::vector<int> keys;
    std::vector<int32> drawnColumns;
    std::vector<std::pair<int32, float>> toldWidths;
    std::vector<std::pair<int32, BRect>> toldFrames;

  private:
    float mHeight;
};

inline int NumberOf(const BListItem* item) {
    return item == nullptr ? -1 : static_cast<const NumberedRow*>(item)->number;
}

inline std::vector<int> NumbersOf(const std::vector<CLVListItem*>& rows) {
    std::vector<int> numbers;
    for (const CLVListItem* const row : rows) {
        numbers.push_back(NumberOf(row));
    }
    return numbers;
}
