#include "HeaderStage.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr unsigned long kMerge = CLV_COLUMN_MERGE_WITH_RIGHT;

// One row of the header: 'w' and 's' for light and shadow, 'B' for what the mouse holds, '.' for the ground.
std::string RowOf(HeaderStage& stage, int32 y, int32 count) {
    std::string row;
    stage.Locked([&] {
        for (int32 x = 0; x < count; ++x) {
            const uint32 color = stage.At(x, y);
            row += color == 0xFFFFFF   ? 'w'
                   : color == 0x989898 ? 's'
                   : color == 0x0000E5 ? 'B'
                   : color == 0xD8D8D8 ? '.'
                                       : '?';
        }
    });
    return row;
}

// Top, second, middle and bottom row; those between are like the middle one.
std::vector<std::string> HeaderOf(HeaderStage& stage, int32 count = 30) {
    stage.Redraw();
    const auto bottom = static_cast<int32>(stage.header->Bounds().bottom);
    for (int32 y = 2; y < bottom; ++y) {
        EXPECT_EQ(RowOf(stage, y, count), RowOf(stage, 5, count)) << "row " << y;
    }
    return {RowOf(stage, 0, count), RowOf(stage, 1, count), RowOf(stage, 5, count),
            RowOf(stage, bottom, count)};
}

typedef std::vector<std::string> Rows;

TEST(CLVColumnLabelView, ItIsAsHighAsTheFontAndHasTheGroundOfPanels) {
    HeaderStage stage(200, 90);
    font_height height;
    be_plain_font->GetHeight(&height);

    EXPECT_EQ(stage.header->Bounds().Height(), std::ceil(height.ascent) + std::ceil(height.descent) + 4);
    EXPECT_EQ(stage.header->ViewColor(), (rgb_color{216, 216, 216, 255}));
    EXPECT_EQ(stage.header->LowColor(), (rgb_color{216, 216, 216, 255}));
    EXPECT_EQ(stage.header->ResizingMode(), static_cast<uint32>(B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP));
}

TEST(CLVColumnLabelView, CellsAndWhatIsLeftOfTheHeaderHaveBevels) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10);
    stage.AddColumn(nullptr, 12);
    stage.DrawAll();

    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwwwswwwwwwwwwwwwswwwwww",
                                   "w.........sw...........sw.....",
                                   "w.........sw...........sw.....",
                                   "wssssssssss"
                                   "wssssssssssss"
                                   "wsssss",
                               }));
}

TEST(CLVColumnLabelView, MergedCellsHaveNoLineBetweenThem) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10, kMerge);
    stage.AddColumn(nullptr, 12);
    stage.DrawAll();

    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwwwwwwwwwwwwwwwwswwwwww",
                                   "w......................sw.....",
                                   "w......................sw.....",
                                   "wsssssssssssssssssssssss"
                                   "wsssss",
                               }));
}

TEST(CLVColumnLabelView, WithoutAShownColumnItIsEmpty) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10, CLV_COLUMN_HIDDEN);
    stage.DrawAll();

    EXPECT_EQ(HeaderOf(stage, 8), (Rows{"wwwwwwww", "w.......", "w.......", "wsssssss"}));
}

TEST(CLVColumnLabelView, TheBorderThatIsHeldIsBlueUntilItIsLetGo) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10);
    stage.AddColumn(nullptr, 12);
    stage.DrawAll();
    const Rows before = HeaderOf(stage);

    stage.Press(10);
    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwwwBwwwwwwwwwwwwswwwwww",
                                   "w.........Bw...........sw.....",
                                   "w.........Bw...........sw.....",
                                   "wsssssssssBwssssssssssss"
                                   "wsssss",
                               }));
    stage.Release(10);
    EXPECT_EQ(HeaderOf(stage), before);
}

TEST(CLVColumnLabelView, AMergedCellsBorderShowsWhileItIsHeld) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10, kMerge);
    stage.AddColumn(nullptr, 12);
    stage.DrawAll();

    stage.Press(9);

    EXPECT_EQ(HeaderOf(stage, 16), (Rows{
                                       "wwwwwwwwwwBwwwww",
                                       "w.........B.....",
                                       "w.........B.....",
                                       "wsssssssssBsssss",
                                   }));
}

TEST(CLVColumnLabelView, ADraggedGroupHasAnOutlineWhereThePointerTakesIt) {
    HeaderStage stage(200, 90);
    stage.AddColumn(nullptr, 10);
    stage.AddColumn(nullptr, 12);
    stage.DrawAll();

    stage.Press(15);
    stage.MoveTo(18);

    // The second column, 11 .. 23, is held 4 pixels from its edge and has no next group: it stays in place.
    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwwwsBBBBBBBBBBBBBwwwwww",
                                   "w.........sB...........Bw.....",
                                   "w.........sB...........Bw.....",
                                   "wssssssssssBBBBBBBBBBBBBwsssss",
                               }));
    stage.MoveTo(12);
    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwBBBBBBBBBBBBBwwswwwwww",
                                   "w.......B.sw........B..sw.....",
                                   "w.......B.sw........B..sw.....",
                                   "wsssssssBBBBBBBBBBBBBsss"
                                   "wsssss",
                               }));
    stage.Release(12);
    EXPECT_EQ(HeaderOf(stage), (Rows{
                                   "wwwwwwwwwwswwwwwwwwwwwwswwwwww",
                                   "w.........sw...........sw.....",
                                   "w.........sw...........sw.....",
                                   "wssssssssss"
                                   "wssssssssssss"
                                   "wsssss",
                               }));
}

TEST(CLVColumnLabelView, LabelsAreCutOffInsideTheirCells) {
    HeaderStage stage(200, 90);
    stage.AddColumn("WWWWWWWWWWWW", 40);
    stage.AddColumn(nullptr, 60);
    stage.DrawAll();
    stage.Redraw();

    const auto bottom = static_cast<int32>(stage.header->Bounds().bottom);
    int inked = 0;
    for (int32 y = 0; y <= bottom; ++y) {
        const std::string row = RowOf(stage, y, 90);
        EXPECT_EQ(row[40], 's') << y;
        EXPECT_EQ(row.find('?', 40), std::string::npos) << y;
        inked += row.find('?') != std::string::npos;
    }
    EXPECT_GT(inked, 4);
}

TEST(CLVColumnLabelView, TheLabelUnderTheMouseIsBlueUntilItIsLetGo) {
    HeaderStage stage(200, 90);
    stage.AddColumn("Some name", 100);
    stage.DrawAll();
    const auto bluest = [&] {
        stage.Redraw();
        int most = 0;
        stage.Locked([&] {
            for (int32 y = 1; y < 14; ++y) {
                for (int32 x = 8; x < 80; ++x) {
                    const uint32 color = stage.At(x, y);
                    most = std::max(most, static_cast<int>(color & 0xFF) - static_cast<int>(color >> 16));
                }
            }
        });
        return most;
    };
    ASSERT_EQ(bluest(), 0);

    stage.Press(50);
    EXPECT_GT(bluest(), 100);
    stage.Release(50);
    EXPECT_EQ(bluest(), 0);
}

TEST(CLVColumnLabelView, SortKeysAreUnderlined) {
    HeaderStage stage(200, 90);
    stage.AddColumn("A", 50, CLV_COLUMN_SORTABLE);
    stage.AddColumn("B", 50, CLV_COLUMN_SORTABLE);
    stage.DrawAll();
    font_height height;
    be_plain_font->GetHeight(&height);
    // The cell's inside begins at 1, the label a pixel lower than its ascent.
    const auto line = static_cast<int32>(1 + std::ceil(height.ascent) + 1 + 2);
    const auto underlined = [&](int32 x) {
        stage.Redraw();
        bool black = false;
        stage.Locked([&] { black = stage.At(x, line) == 0; });
        return black;
    };
    ASSERT_FALSE(underlined(8));

    stage.Click(30);
    EXPECT_TRUE(underlined(8));
    EXPECT_FALSE(underlined(51 + 8));

    stage.Click(80);
    EXPECT_FALSE(underlined(8));
    EXPECT_TRUE(underlined(51 + 8));

    stage.Click(80);
    EXPECT_TRUE(underlined(51 + 8)) << "descending";
    stage.Click(80);
    EXPECT_FALSE(underlined(51 + 8)) << "no key any more";
}

TEST(CLVColumnLabelView, OnlyCellsInTheUpdateRectAreDrawn) {
    HeaderStage stage(200, 90);
    CLVColumn* const a = stage.AddColumn("A", 50);
    CLVColumn* const b = stage.AddColumn("B", 50);
    stage.Damage().MakeEmpty();

    stage.Locked([&] { stage.header->Invalidate(BRect(60, 0, 70, 5)); });
    stage.Redraw();

    EXPECT_EQ(a->HeaderFrame(), BRect(-1, -1, -1, -1));
    EXPECT_NE(b->HeaderFrame(), BRect(-1, -1, -1, -1));
}

} // namespace
