// A header of four columns, and what its clicks have made of the sort keys.
#pragma once

#include "HeaderStage.h"

#include <gtest/gtest.h>

#include <string>

constexpr unsigned long kSortable = CLV_COLUMN_SORTABLE;
constexpr int32 kShift = B_SHIFT_KEY;

// Columns A 0 .. 100, B 101 .. 151, C 152 .. 222 and D 223 .. 253, all sortable.
class HeaderGestureTest : public testing::Test {
  protected:
    HeaderGestureTest() : stage(400, 90) {}
    void AddColumns(unsigned long ofA = 0, unsigned long ofB = 0, unsigned long ofC = 0,
                    unsigned long ofD = 0) {
        a = stage.AddColumn("A", 100, kSortable | ofA);
        b = stage.AddColumn("B", 50, kSortable | ofB);
        c = stage.AddColumn("C", 70, kSortable | ofC);
        d = stage.AddColumn("D", 30, kSortable | ofD);
        stage.DrawAll();
        stage.TakeNotes();
    }
    std::string Keys() {
        std::string text;
        stage.Locked([&] {
            int32 keys[8];
            CLVSortMode modes[8];
            const int32 count = stage.list->Sorting(keys, modes);
            for (int32 i = 0; i < count; ++i) {
                text += static_cast<char>('A' + keys[i]);
                text += modes[i] == CLV_SORT_ASCENDING ? '+' : '-';
            }
        });
        return text;
    }

    HeaderStage stage;
    CLVColumn* a = nullptr;
    CLVColumn* b = nullptr;
    CLVColumn* c = nullptr;
    CLVColumn* d = nullptr;
};
