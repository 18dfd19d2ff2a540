// Column lists with nothing in them, with far too much, and with no room.
#include "HeaderGestures.h"

#include <ScrollBar.h>

#include <memory>

namespace {

// Everywhere in the header, with what each gesture does.
void PressEverywhere(HeaderStage& stage) {
    for (float x = -1; x < 12; ++x) {
        stage.Click(x);
        stage.Drag(x, x + 30);
        stage.Drag(x, x - 30);
    }
    stage.Drag(5, 100000);
    stage.Drag(5, -100000);
}

TEST(ColumnListLimits, AListWithoutColumnsIsDrawnAndTakesGestures) {
    HeaderStage stage(200, 90, true);
    stage.AddRow(0, {"text"});
    PressEverywhere(stage);
    stage.Locked([&] {
        const std::unique_ptr<int32[]> order(stage.list->DisplayOrder());
        EXPECT_TRUE(stage.list->SetDisplayOrder(order.get()));
        EXPECT_FALSE(stage.list->RemoveColumn(nullptr));
        EXPECT_FALSE(stage.list->AddColumn(nullptr));
        EXPECT_EQ(stage.list->Sorting(nullptr, nullptr), 0);
        stage.list->SortItems();
        stage.list->Collapse(stage.rows[0].get());
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST(ColumnListLimits, AListWhoseColumnsAreAllHiddenIsDrawnAndTakesGestures) {
    HeaderStage stage(200, 90, true);
    auto* const expander = new CLVColumn(nullptr, 20, CLV_COLUMN_EXPANDER, 20);
    stage.Locked([&] { EXPECT_TRUE(stage.list->AddColumn(expander)); });
    CLVColumn* const other = stage.AddColumn("Other", 50, CLV_COLUMN_SORTABLE | CLV_COLUMN_TELL_ITEMS_WIDTH);
    stage.AddRow(1, {"", "text"});
    stage.Press(40);
    stage.Locked([&] {
        expander->SetShown(false);
        other->SetShown(false);
    });
    stage.MoveTo(60);
    stage.Release(60);
    PressEverywhere(stage);
    stage.Locked([&] {
        other->SetWidth(100);
        stage.list->SetSortKey(1);
        EXPECT_EQ(stage.container->GetDataRect().right, 0);
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());

    stage.Locked([&] { other->SetShown(true); });
    EXPECT_EQ(other->ColumnEnd(), 100);
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST(ColumnListLimits, ARowThatChangesItsHeightByItselfChangesTheData) {
    HeaderStage stage(200, 90);
    stage.AddColumn("Only", 50);
    stage.AddRow(0, {"first"});
    stage.AddRow(0, {"second"});
    const auto change = [&](size_t row, float height) {
        stage.Locked([&] {
            stage.rows[row]->SetHeight(height);
            stage.list->InvalidateItem(static_cast<int32>(row));
        });
        stage.Redraw();
    };
    change(0, 19);
    change(1, 499);
    float most = 0;
    stage.Locked([&] {
        EXPECT_EQ(stage.container->GetDataRect(), BRect(0, 0, 50, 519));
        stage.container->ScrollBar(B_VERTICAL)->GetRange(nullptr, &most);
        EXPECT_EQ(most, 519 - stage.list->Bounds().Height());
        stage.list->ScrollTo(BPoint(0, most));
    });
    stage.Redraw();

    change(1, 29);
    stage.Locked([&] {
        EXPECT_EQ(stage.container->GetDataRect(), BRect(0, 0, 50, 49));
        EXPECT_EQ(stage.list->Bounds().top, 0) << "nothing shows beyond the rows";
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST(ColumnListLimits, AColumnOfAHundredThousandPixelsCanBeScrolledAndResized) {
    HeaderStage stage(200, 90);
    CLVColumn* const wide = stage.AddColumn("Wide", 100000, CLV_COLUMN_HEADER_TRUNCATE);
    CLVColumn* const last = stage.AddColumn("Last", 50, CLV_COLUMN_TELL_ITEMS_WIDTH);
    stage.AddRow(0, {"wide", "last"});
    stage.DrawAll();
    EXPECT_EQ(last->ColumnEnd(), 100051);
    float most = 0;
    stage.Locked([&] {
        stage.container->ScrollBar(B_HORIZONTAL)->GetRange(nullptr, &most);
        stage.list->ScrollTo(BPoint(100051 - 199, 0));
    });
    EXPECT_EQ(most, 100051 - 199);
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());

    stage.Drag(100000, 99950);
    EXPECT_EQ(wide->Width(), 99950);
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
    stage.Locked([&] {
        wide->SetWidth(10);
        last->SetWidth(1.0e6F);
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST(ColumnListLimits, ViewsOfAPixelOrNoneAreDrawnAndTakeGestures) {
    HeaderStage stage(60, 60, true);
    auto* const expander = new CLVColumn(nullptr, 20, CLV_COLUMN_EXPANDER, 20);
    stage.Locked([&] { EXPECT_TRUE(stage.list->AddColumn(expander)); });
    CLVColumn* const other = stage.AddColumn("Other", 50, CLV_COLUMN_HEADER_TRUNCATE);
    stage.AddRow(0, {"", "text"});
    stage.AddRow(1, {"", "text"});
    for (const float size : {1.0F, 0.0F, 16.0F, 40.0F, 30.0F, -1.0F, 60.0F}) {
        SCOPED_TRACE(size);
        stage.Locked([&] {
            stage.container->ResizeTo(size, size);
            stage.container->FrameResized(size, size);
            stage.list->FrameResized(stage.list->Bounds().Width(), stage.list->Bounds().Height());
        });
        stage.DrawAll();
        PressEverywhere(stage);
        stage.Locked([&] {
            stage.list->ScrollTo(BPoint(3, 3));
            other->SetWidth(other->Width() + 5);
            stage.list->Collapse(stage.rows[0].get());
            stage.list->Expand(stage.rows[0].get());
            for (const orientation which : {B_HORIZONTAL, B_VERTICAL}) {
                const BScrollBar* const bar = stage.container->ScrollBar(which);
                EXPECT_GE(bar->Proportion(), 0);
                EXPECT_LE(bar->Proportion(), 1);
                float least = 0;
                float most = 0;
                bar->GetRange(&least, &most);
                EXPECT_LE(least, most);
            }
        });
        stage.DrawAll();
    }
}

TEST(ColumnListLimits, LabelsAndTextsOfTenThousandBytesAreShortened) {
    std::string texts[] = {std::string(10000, 'm'), std::string(10000, ' '), std::string(10000, '\xC3'),
                           std::string(10000, '\xFF'), ""};
    while (texts[4].size() < 10000) {
        // Four bytes each, so that the cut falls into one three times of four.
        texts[4] += "\xF0\x9D\x84\x9E";
    }
    for (const std::string& text : texts) {
        HeaderStage stage(200, 90);
        CLVColumn* const column = stage.AddColumn(
            text.c_str(), 60, CLV_COLUMN_SORTABLE | CLV_COLUMN_HEADER_TRUNCATE | CLV_COLUMN_TELL_ITEMS_WIDTH);
        stage.AddColumn(text.c_str(), 60, CLV_COLUMN_SORTABLE);
        stage.AddRow(0, {text, "b"});
        stage.AddRow(0, {text.substr(1), "a"});
        stage.Locked([&] { stage.list->SetSortFunction(CLVEasyItem::CompareItems); });
        stage.Click(30);
        for (const float width : {61.0F, 62.0F, 63.0F, 64.0F, 30.0F, 10.0F}) {
            stage.Locked([&] { column->SetWidth(width); });
            EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew()) << width;
        }
        EXPECT_EQ(std::string(column->GetLabel()), text);
        EXPECT_LT(std::string(column->TruncatedLabel()).size(), 10U);
    }
}

TEST(ColumnListLimits, RowsMayChangeTheirHeightWhileTheyAreShown) {
    HeaderStage stage(200, 90);
    stage.AddColumn("Label", 60);
    stage.AddRow(0, {"one"});
    stage.AddRow(0, {"two"});
    stage.DrawAll();
    stage.Locked([&] {
        const float height = stage.rows[0]->Height();
        const float before = stage.list->ItemFrame(1).top;
        stage.rows[0]->SetHeight(height + 30);
        stage.list->InvalidateItem(0);
        EXPECT_EQ(stage.list->ItemFrame(0).Height(), height + 30);
        EXPECT_EQ(stage.list->ItemFrame(1).top, before + 30);
        EXPECT_EQ(stage.list->FullListIndexOf(BPoint(5, before + 10)), 0);
        EXPECT_EQ(stage.list->FullListIndexOf(BPoint(5, before + 31)), 1);
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
    stage.Locked([&] {
        stage.rows[0]->SetHeight(1);
        stage.list->InvalidateItem(0);
        stage.list->UpdateColumnSizesDataRectSizeScrollBars(true);
        EXPECT_EQ(stage.container->GetDataRect().bottom, stage.list->ItemFrame(1).bottom);
    });
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

// Tells how often it was set.
class CountingColumn : public CLVColumn {
  public:
    CountingColumn() : CLVColumn("Counted", 100, 0, 40) {}
    void SetWidth(float width) override {
        widths.push_back(width);
        CLVColumn::SetWidth(width);
    }
    std::vector<float> widths;
};

TEST(ColumnListLimits, AWidthIsSetWhenItChangesAndNeverBelowTheMinimum) {
    HeaderStage stage(200, 90);
    auto* const column = new CountingColumn;
    stage.Locked([&] { EXPECT_TRUE(stage.list->AddColumn(column)); });

    stage.Press(100);
    for (const float x : {90.0F, 30.0F, 20.0F, 10.0F, 40.0F, 41.0F, 41.0F}) {
        stage.MoveTo(x);
    }
    stage.Release(41);

    EXPECT_EQ(column->widths, std::vector<float>({90, 40, 41}));
}

TEST_F(HeaderGestureTest, TheHookForAWidthMayTakeTheColumnAway) {
    AddColumns();
    stage.list->onWidthChanged = [&] { delete b; };

    stage.Press(151);
    stage.MoveTo(160);
    stage.list->onWidthChanged = nullptr;
    stage.MoveTo(170);
    stage.Release(170);

    EXPECT_EQ(stage.Labels(), "ACD");
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, TheHookForANewOrderMayPutTheOldOneBackOrHideAll) {
    AddColumns();
    stage.list->onOrderChanged = [&] {
        stage.list->onOrderChanged = nullptr;
        const int32 order[] = {0, 1, 2, 3};
        EXPECT_TRUE(stage.list->SetDisplayOrder(order));
    };
    stage.Drag(240, 5);
    EXPECT_EQ(stage.Labels(), "ABCD");
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());

    stage.list->onOrderChanged = [&] {
        for (CLVColumn* const column : {a, b, c, d}) {
            column->SetShown(false);
        }
    };
    stage.Drag(240, 5);
    stage.list->onOrderChanged = nullptr;
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST(ColumnListLimits, AnArrowIsWhereItsColumnHasMovedTo) {
    HeaderStage stage(300, 90, true);
    CLVColumn* const first = stage.AddColumn("First", 40);
    auto* const expander = new CLVColumn(nullptr, 20, CLV_COLUMN_EXPANDER, 20);
    stage.Locked([&] { EXPECT_TRUE(stage.list->AddColumn(expander)); });
    stage.AddColumn("Last", 60);
    stage.AddRow(0, {"one"});
    stage.AddRow(1, {"two"});
    stage.DrawAll();
    const auto visibleAfterPressAt = [&](float x) {
        int32 count = 0;
        stage.MouseDown(stage.list, BPoint(x, 8));
        stage.MouseUp(stage.list, BPoint(x, 8));
        stage.Locked([&] { count = stage.list->CountItems(); });
        return count;
    };
    EXPECT_EQ(visibleAfterPressAt(53), 1);

    for (const float width : {90.0F, 30.0F, 31.5F}) {
        stage.Locked([&] { first->SetWidth(width); });
        // Not drawn anew, but moved.
        EXPECT_EQ(visibleAfterPressAt(53 - 40 + width), 2) << width;
        EXPECT_EQ(visibleAfterPressAt(53 - 40 + width), 1) << width;
        stage.Redraw();
        EXPECT_EQ(visibleAfterPressAt(53 - 40 + width), 2) << width;
        EXPECT_EQ(visibleAfterPressAt(53 - 40 + width), 1) << width;
    }
}

} // namespace
