// The column list's rows, by mouse, wheel, bars and keys.
#include "desktop/GalleryOnDesktop.h"

namespace {

class ColumnRows : public GalleryOnDesktop {};

} // namespace

TEST_F(ColumnRows, AnArrowExpandsAndCollapses) {
    With("outline", [this] {
        KeepPicture("outline-1-opened");
        const int32 before = CountVisible();
        EXPECT_EQ("Cellar", TextAt(0, 1));
        Click(OnArrow(1));
        EXPECT_EQ(before - 3, CountVisible());
        EXPECT_TRUE(IsDrawnAsAnew());
        Click(OnArrow(1));
        EXPECT_EQ(before, CountVisible());
        Click(OnArrow(0));
        EXPECT_EQ("Shop", TextAt(1, 1));
        KeepPicture("outline-2-collapsed");
        EXPECT_EQ(Numbers{}, Selection()) << "the arrow selects nothing";
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, RightAndLeftExpandAndCollapse) {
    With("outline", [this] {
        const int32 before = CountVisible();
        Click(OnRow(0));
        EXPECT_EQ(Numbers{0}, Selection());
        Key("Left");
        EXPECT_EQ("Shop", TextAt(1, 1)) << "collapsed";
        Key("Right");
        EXPECT_EQ(before, CountVisible());
        EXPECT_EQ(Numbers{0}, Selection());
        Key("Right");
        EXPECT_EQ(Numbers{1}, Selection()) << "its first child";
        Key("Left");
        EXPECT_EQ(before - 3, CountVisible());
        Key("Left");
        EXPECT_EQ(Numbers{0}, Selection()) << "its super-row";
        KeepPicture("outline-3-keys");
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, ClicksSelectOneMoreOrAllBetween) {
    With("flat", [this] {
        Click(OnRow(2));
        EXPECT_EQ(Numbers{2}, Selection());
        ClickWith("shift", OnRow(5));
        EXPECT_EQ((Numbers{2, 3, 4, 5}), Selection());
        ClickWith("ctrl", OnRow(3));
        EXPECT_EQ((Numbers{2, 4, 5}), Selection());
        KeepPicture("flat-8-selected");
        EXPECT_TRUE(IsDrawnAsAnew());
        Key("Down");
        EXPECT_EQ(1U, Selection().size());
    });
}

TEST_F(ColumnRows, AddingAndDeletingByTheMenusKeys) {
    With("outline", [this] {
        const int32 before = CountVisible();
        Click(OnRow(0));
        Key("ctrl+n");
        EXPECT_EQ(before + 1, CountVisible()) << "below the selected super-row";
        Key("ctrl+d");
        EXPECT_EQ("Shop", TextAt(0, 1)) << "with all that is below it";
        Key("ctrl+l");
        EXPECT_EQ(3, CountVisible());
        KeepPicture("outline-4-collapsed-all");
        Key("ctrl+e");
        EXPECT_EQ(3 * (1 + 4 + 12), CountVisible());
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, ScrollByWheelBarAndKeys) {
    With("sorting", [this] {
        KeepPicture("sorting-1-opened");
        EXPECT_EQ("Maker up, Part down, Price up", Sorting());
        Click(OnRow(3), 5);
        const float byWheel = ScrolledTo().y;
        EXPECT_GT(byWheel, 0);
        EXPECT_TRUE(IsDrawnAsAnew());
        const BPoint bar = Read([this] {
            BScrollBar* const vertical = mList->ScrollBar(B_VERTICAL);
            return vertical->ConvertToScreen(BPoint(7, 30));
        });
        TheDesktop().drag(static_cast<int>(bar.x), static_cast<int>(bar.y), static_cast<int>(bar.x),
                          static_cast<int>(bar.y) + 100);
        snooze(300000);
        EXPECT_GT(ScrolledTo().y, byWheel + 200);
        KeepPicture("sorting-2-scrolled");
        EXPECT_TRUE(IsDrawnAsAnew());
        Key("End");
        EXPECT_EQ(Numbers{199}, Selection());
        const BRect last = Read([this] { return mList->ItemFrame(199); });
        EXPECT_EQ(last.bottom, Read([this] { return mList->Bounds().bottom; }));
        KeepPicture("sorting-3-end");
        Key("Home");
        EXPECT_EQ(0, ScrolledTo().y);
        Key("Page_Down");
        Key("Page_Down");
        EXPECT_GT(ScrolledTo().y, 0);
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, PicturesLieInTheirCells) {
    With("pictures", [this] {
        KeepPicture("pictures-1-opened");
        Click(OnRow(1, 60));
        Click(OnLabel(1));
        EXPECT_EQ("Part up", Sorting());
        KeepPicture("pictures-2-sorted");
        Drag(OnLabel(1), 90);
        KeepPicture("pictures-3-moved");
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, FiftyThousandAreReachedCollapsedAndSorted) {
    With("many", [this] {
        EXPECT_EQ(50000, CountVisible());
        Click(OnRow(0));
        Key("End");
        EXPECT_TRUE(Comes([this] { return mList->CurrentSelection() == 49999; }));
        KeepPicture("many-1-end");
        EXPECT_TRUE(IsDrawnAsAnew());
        Key("ctrl+l");
        EXPECT_TRUE(Comes([this] { return mList->CountItems() == 500; }));
        KeepPicture("many-2-collapsed");
        Key("ctrl+e");
        EXPECT_TRUE(Comes([this] { return mList->CountItems() == 50000; }));
        Key("Home");
        Click(OnLabel(2));
        EXPECT_TRUE(Comes([this] { return mList->CountItems() == 50000; }));
        EXPECT_EQ("Maker up", Sorting());
        KeepPicture("many-3-sorted");
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnRows, AColumnIsHiddenAndShownByTheMenu) {
    With("columns", [this] {
        const BPoint origin = FrameOf(mWindow).LeftTop();
        // The third menu; by its keys from there.
        Key("alt+c");
        KeepPicture("columns-5-menu");
        for (int i = 0; i < 4; ++i) {
            Key("Down");
        }
        Key("Return");
        EXPECT_TRUE(Comes([this] { return mList->ColumnAt(4)->IsShown(); }));
        KeepPicture("columns-6-shown");
        EXPECT_TRUE(IsDrawnAsAnew());
        EXPECT_EQ(origin, FrameOf(mWindow).LeftTop());
    });
}

TEST(Gallery, OpensOneWindowOrTellsTheNames) {
    ASSERT_TRUE(TheDesktop().works());
    const test::TemporaryEnvironment environment;
    const test::ProgramResult wrong = test::run_program(GALLERY_PROGRAM, {"--window", "nothing"});
    EXPECT_EQ(1, wrong.status);
    EXPECT_EQ("usage: column_list_gallery [--window NAME]\n"
              "names: flat outline texts pictures columns sorting many\n",
              wrong.errors);

    test::Program program(GALLERY_PROGRAM, {"--window", "flat"});
    ASSERT_NE("", TheDesktop().window("A flat list", 30));
    EXPECT_EQ("", TheDesktop().window("Columns of all kinds", 1));
    TheDesktop().tool({"windowactivate", "--sync", TheDesktop().window("A flat list")});
    snooze(300000);
    // The first menu's second entry.
    for (const char* const key : {"alt+g", "Down", "Return"}) {
        TheDesktop().key(key);
        snooze(200000);
    }
    EXPECT_NE("", TheDesktop().window("An outline of three levels"));
    TheDesktop().key("ctrl+q");
    const test::ProgramResult result = program.wait();
    EXPECT_EQ(0, result.status) << result.errors;
    EXPECT_EQ("", result.errors);
}
