#include "HeaderStage.h"

#include "support/random_seed.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

namespace {

constexpr BRect kNowhere(-1, -1, -1, -1);

// A list 300 x 100 with columns A, B and C of 50, 100 and 60 pixels.
class CLVColumnInListTest : public testing::Test {
  protected:
    CLVColumnInListTest() : stage(300, 100) {
        a = stage.AddColumn("A", 50);
        b = stage.AddColumn("B", 100);
        c = stage.AddColumn("C", 60);
        stage.AddRow(0, {"Aria", "Ballad of a long name", "Canon"});
        stage.DrawAll();
        stage.TakeNotes();
        stage.Damage().MakeEmpty();
    }
    // Of the list's and the header's coordinates, which are the stage's across.
    bool IsDamaged(BView* view, float x) {
        bool damaged = false;
        stage.Locked([&] { damaged = stage.Damage().Contains(view->ConvertToSurface(BPoint(x, 3))); });
        return damaged;
    }

    HeaderStage stage;
    CLVColumn* a;
    CLVColumn* b;
    CLVColumn* c;
};

TEST_F(CLVColumnInListTest, ANewWidthMovesWhatLiesRightOfTheColumn) {
    stage.Locked([&] { b->SetWidth(110); });

    EXPECT_EQ(b->ColumnBegin(), 51);
    EXPECT_EQ(b->ColumnEnd(), 161);
    EXPECT_EQ(c->ColumnBegin(), 162);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"width 1 110"}));
    for (BView* const view : {static_cast<BView*>(stage.header), static_cast<BView*>(stage.list)}) {
        EXPECT_FALSE(IsDamaged(view, 150));
        EXPECT_TRUE(IsDamaged(view, 152)) << "the new part of the column";
        EXPECT_TRUE(IsDamaged(view, 161));
        EXPECT_FALSE(IsDamaged(view, 162)) << "moved, not drawn";
        EXPECT_FALSE(IsDamaged(view, 222));
    }
    EXPECT_TRUE(IsDamaged(stage.header, 151)) << "where the border was";
    EXPECT_FALSE(IsDamaged(stage.list, 151));
}

TEST_F(CLVColumnInListTest, AShrinkingColumnUncoversTheRightEdge) {
    stage.Locked([&] { b->SetWidth(90); });

    for (BView* const view : {static_cast<BView*>(stage.header), static_cast<BView*>(stage.list)}) {
        EXPECT_FALSE(IsDamaged(view, 140));
        EXPECT_FALSE(IsDamaged(view, 142));
        EXPECT_TRUE(IsDamaged(view, 290));
    }
    EXPECT_TRUE(IsDamaged(stage.header, 141)) << "where the border is now";
}

TEST_F(CLVColumnInListTest, TheWidthThatItHasIsNoChange) {
    stage.Locked([&] { b->SetWidth(100); });

    EXPECT_EQ(stage.TakeNotes(), Notes());
    EXPECT_EQ(stage.Damage().CountRects(), 0);
}

TEST_F(CLVColumnInListTest, AWidthBelowTheMinimumBecomesTheMinimum) {
    stage.Locked([&] {
        b->SetWidth(3);
        b->SetWidth(5);
    });

    EXPECT_EQ(b->Width(), 10);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"width 1 10"}));
}

TEST_F(CLVColumnInListTest, AHiddenColumnsNewWidthIsToldButMovesNothing) {
    stage.Locked([&] { b->SetShown(false); });
    stage.Redraw();
    stage.TakeNotes();

    stage.Locked([&] { b->SetWidth(150); });

    EXPECT_EQ(stage.TakeNotes(), (Notes{"width 1 150"}));
    EXPECT_EQ(stage.Damage().CountRects(), 0);
    EXPECT_EQ(c->ColumnBegin(), 51);
}

TEST_F(CLVColumnInListTest, HidingAColumnClosesItsPlace) {
    stage.Locked([&] { b->SetShown(false); });

    EXPECT_EQ(c->ColumnBegin(), 51);
    for (BView* const view : {static_cast<BView*>(stage.header), static_cast<BView*>(stage.list)}) {
        EXPECT_FALSE(IsDamaged(view, 49));
        EXPECT_TRUE(IsDamaged(view, 51));
        EXPECT_TRUE(IsDamaged(view, 290));
    }
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());

    stage.Locked([&] { b->SetShown(true); });
    EXPECT_EQ(c->ColumnBegin(), 152);
    EXPECT_FALSE(IsDamaged(stage.list, 50));
    EXPECT_TRUE(IsDamaged(stage.list, 51));
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(CLVColumnInListTest, ShowingAShownColumnIsNoChange) {
    stage.Locked([&] { b->SetShown(true); });

    EXPECT_EQ(stage.Damage().CountRects(), 0);
}

TEST_F(CLVColumnInListTest, TheSortModeGoesThroughTheList) {
    CLVColumn* const sortable = stage.AddColumn("S", 40, CLV_COLUMN_SORTABLE);

    stage.Locked([&] {
        sortable->SetSortMode(CLV_SORT_DESCENDING);
        b->SetSortMode(CLV_SORT_DESCENDING);
    });

    EXPECT_EQ(stage.TakeNotes(), (Notes{"mode 3 1", "mode 1 1"}));
    EXPECT_EQ(sortable->SortMode(), CLV_SORT_DESCENDING);
    EXPECT_EQ(b->SortMode(), CLV_SORT_NONE) << "not sortable";
}

TEST_F(CLVColumnInListTest, ADeletedColumnLeavesItsListFirst) {
    stage.Locked([&] { delete b; });

    stage.Locked([&] { EXPECT_EQ(stage.list->CountColumns(), 2); });
    EXPECT_EQ(c->ColumnBegin(), 51);
    EXPECT_EQ(stage.Labels(), "AC");
}

TEST_F(CLVColumnInListTest, ItKnowsItsListAndHeader) {
    EXPECT_EQ(a->GetParent(), stage.list);
    EXPECT_EQ(a->GetHeaderView(), stage.header);
    stage.Locked([&] { EXPECT_TRUE(stage.list->RemoveColumn(a)); });
    EXPECT_EQ(a->GetParent(), nullptr);
    EXPECT_EQ(a->GetHeaderView(), nullptr);
    delete a;
}

TEST_F(CLVColumnInListTest, TheHeaderFrameFollowsTheColumn) {
    EXPECT_EQ(c->HeaderFrame().left, 153);
    stage.Locked([&] { a->SetWidth(70); });

    EXPECT_EQ(c->HeaderFrame().left, 173) << "moved, though not drawn again";
    EXPECT_EQ(c->HeaderFrame().right, 231);
    EXPECT_NE(c->HeaderFrame(), kNowhere);
}

typedef CLVColumnInListTest CLVColumnDeathTest;

TEST_F(CLVColumnDeathTest, ChangesNeedTheWindowsLock) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_DEATH(b->SetWidth(110), "The looper must be locked.");
    EXPECT_DEATH(b->SetShown(false), "The looper must be locked.");
    EXPECT_DEATH(b->SetSortMode(CLV_SORT_ASCENDING), "The looper must be locked.");
}

std::string FirstDifference(const std::vector<uint32>& a, const std::vector<uint32>& b) {
    const auto at = static_cast<size_t>(std::mismatch(a.begin(), a.end(), b.begin()).first - a.begin());
    constexpr size_t kWidth = 315; // the list's and its bar's
    return at == a.size() ? "" : "at " + std::to_string(at % kWidth) + ", " + std::to_string(at / kWidth);
}

// What is moved and redrawn in parts must come to the same as what is drawn anew.
void ResizeAtRandom(HeaderStage& stage, const std::vector<CLVColumn*>& columns, int rounds) {
    std::mt19937_64 random(RandomSeed());
    stage.DrawAll();
    for (int round = 0; round < rounds; ++round) {
        const size_t index = random() % columns.size();
        CLVColumn* const column = columns[index];
        const auto dice = random() % 10;
        stage.Locked([&] {
            if (dice == 0) {
                column->SetShown(!column->IsShown());
            } else if (dice == 1) {
                const auto x = static_cast<float>(random() % 120);
                stage.list->ScrollTo(BPoint(x, stage.list->Bounds().top));
            } else if (dice < 6) {
                column->SetWidth(column->Width() + static_cast<float>(random() % 9) - 4);
            } else {
                column->SetWidth(static_cast<float>(10 + random() % 140));
            }
        });
        const auto picture = stage.Picture();
        ASSERT_EQ(FirstDifference(picture, stage.PictureDrawnAnew()), "")
            << "round " << round << ", column " << index << ", width " << column->Width() << ", dice "
            << dice;
    }
}

TEST(CLVColumnPicture, ResizingAFlatListLeavesThePictureThatDrawingMakes) {
    HeaderStage stage(300, 90);
    std::vector<CLVColumn*> columns;
    for (int i = 0; i < 4; ++i) {
        const unsigned long flags = i % 2 == 0 ? CLV_COLUMN_HEADER_TRUNCATE | CLV_COLUMN_TELL_ITEMS_WIDTH
                                               : CLV_COLUMN_HEADER_TRUNCATE;
        columns.push_back(stage.AddColumn("Quite a long label", 60, flags));
    }
    columns.push_back(stage.AddColumn("Merged", 60, CLV_COLUMN_MERGE_WITH_RIGHT));
    columns.push_back(stage.AddColumn("Last", 40));
    for (int i = 0; i < 7; ++i) {
        stage.AddRow(0, {"Sun rises", "Wind in the west", "Rain", "Snow on Monday", "Fog", "Hail"});
    }
    stage.Locked([&] { stage.list->Select(2); });
    ResizeAtRandom(stage, columns, 60);
}

TEST(CLVColumnPicture, ResizingAnOutlineLeavesThePictureThatDrawingMakes) {
    for (const unsigned long tells : {0UL, static_cast<unsigned long>(CLV_COLUMN_TELL_ITEMS_WIDTH)}) {
        HeaderStage stage(300, 90, true);
        std::vector<CLVColumn*> columns;
        columns.push_back(stage.AddColumn("First", 30, tells));
        auto* const expander = new CLVColumn(nullptr, 20, CLV_COLUMN_EXPANDER, 20);
        stage.Locked([&] { EXPECT_TRUE(stage.list->AddColumn(expander)); });
        columns.push_back(expander);
        columns.push_back(
            stage.AddColumn("Pushed", 60, CLV_COLUMN_PUSH_PASS | CLV_COLUMN_HEADER_TRUNCATE | tells));
        columns.push_back(stage.AddColumn("Pushed too", 50, CLV_COLUMN_HEADER_TRUNCATE | tells));
        columns.push_back(stage.AddColumn("Not pushed", 70, tells));
        for (uint32 i = 0; i < 7; ++i) {
            stage.AddRow(i % 4, {"Sun", "", "Wind in the west", "Snow on Monday", "Fog and hail"});
        }
        ResizeAtRandom(stage, columns, 60);
    }
}

} // namespace
