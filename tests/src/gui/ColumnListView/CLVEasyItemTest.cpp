#include "gui/ColumnListView/CLVEasyItem.h"

#include "ListOnStage.h"
#include "gui/ColumnListView/TruncatedString.h"
#include "support/random_seed.h"

#include <Bitmap.h>

#include <memory>
#include <random>
#include <string.h>

namespace {

constexpr uint32 kWhite = 0xFFFFFF;
constexpr uint32 kSelected = 0xB2B2B2;
constexpr uint32 kRed = 0xFF0000;
constexpr unsigned long kTell = CLV_COLUMN_TELL_ITEMS_WIDTH;

class CLVEasyItemTest : public ListOnStage {
  protected:
    CLVEasyItem& MakeRow(uint32 level = 0, bool super = false) {
        mRows.push_back(std::make_unique<CLVEasyItem>(level, super, true, 19.0F));
        return *mRows.back();
    }
    CLVEasyItem& AddRow(uint32 level = 0, bool super = false) {
        CLVEasyItem& row = MakeRow(level, super);
        Add(&row);
        return row;
    }
    static std::unique_ptr<BBitmap> MakeRedBitmap(float right, float bottom) {
        auto bitmap = std::make_unique<BBitmap>(BRect(0, 0, right, bottom), B_RGB32);
        auto* const pixels = static_cast<uint32*>(bitmap->Bits());
        std::fill(pixels, pixels + bitmap->BitsLength() / 4, 0xFFFF0000U);
        return bitmap;
    }
    // What is drawn in this part of the list, drawn anew.
    std::vector<uint32> Drawn(BRect part) {
        RedrawAll();
        std::vector<uint32> pixels;
        for (float y = part.top; y <= part.bottom; ++y) {
            for (float x = part.left; x <= part.right; ++x) {
                pixels.push_back(At(x, y));
            }
        }
        return pixels;
    }

    std::vector<std::unique_ptr<CLVEasyItem>> mRows;
};

} // namespace

TEST_F(CLVEasyItemTest, KeepsACopyOfATextAndGivesItBackWhole) {
    CLVEasyItem& row = MakeRow();
    char text[] = "some text";
    row.SetColumnContent(2, text);
    text[0] = 'X';

    EXPECT_STREQ("some text", row.GetColumnContentText(2));
    EXPECT_EQ(nullptr, row.GetColumnContentBitmap(2));
    for (const int column : {-1, 0, 1, 3, 1000000}) {
        EXPECT_EQ(nullptr, row.GetColumnContentText(column)) << column;
        EXPECT_EQ(nullptr, row.GetColumnContentBitmap(column)) << column;
    }
}

TEST_F(CLVEasyItemTest, ANullOrEmptyTextEmptiesTheCell) {
    CLVEasyItem& row = MakeRow();
    for (const bool truncate : {false, true}) {
        row.SetColumnContent(0, "text", truncate);
        EXPECT_STREQ("text", row.GetColumnContentText(0));
        row.SetColumnContent(0, static_cast<const char*>(nullptr), truncate);
        EXPECT_EQ(nullptr, row.GetColumnContentText(0));
        row.SetColumnContent(0, "text", truncate);
        row.SetColumnContent(0, "", truncate);
        EXPECT_EQ(nullptr, row.GetColumnContentText(0));
    }
}

TEST_F(CLVEasyItemTest, ACellsOwnTextMayBeSetAgain) {
    CLVEasyItem& row = MakeRow();
    row.SetColumnContent(0, "its own");
    row.SetColumnContent(0, row.GetColumnContentText(0), false);
    EXPECT_STREQ("its own", row.GetColumnContentText(0));
}

TEST_F(CLVEasyItemTest, ANegativeColumnIsLeftAlone) {
    CLVEasyItem& row = MakeRow();
    row.SetColumnContent(-1, "nowhere");
    row.SetColumnContent(-1, MakeRedBitmap(3, 3).get());
    EXPECT_EQ(nullptr, row.GetColumnContentText(-1));
}

TEST_F(CLVEasyItemTest, CopiesAPictureOrRefersToIt) {
    CLVEasyItem& row = MakeRow();
    const std::unique_ptr<BBitmap> bitmap = MakeRedBitmap(7, 3);
    row.SetColumnContent(0, bitmap.get(), 2, false);
    EXPECT_EQ(bitmap.get(), row.GetColumnContentBitmap(0));
    EXPECT_EQ(nullptr, row.GetColumnContentText(0));

    row.SetColumnContent(0, bitmap.get(), 2, true);
    const BBitmap* const copy = row.GetColumnContentBitmap(0);
    ASSERT_NE(bitmap.get(), copy);
    EXPECT_EQ(BRect(0, 0, 7, 3), copy->Bounds());
    EXPECT_EQ(B_RGB32, copy->ColorSpace());
    ASSERT_EQ(bitmap->BitsLength(), copy->BitsLength());
    EXPECT_EQ(0, memcmp(bitmap->Bits(), copy->Bits(), static_cast<size_t>(copy->BitsLength())));

    row.SetColumnContent(0, static_cast<const BBitmap*>(nullptr));
    EXPECT_EQ(nullptr, row.GetColumnContentBitmap(0));
}

TEST_F(CLVEasyItemTest, ATextTakesAPicturesPlaceAndTheOtherWayRound) {
    CLVEasyItem& row = MakeRow();
    row.SetColumnContent(0, "text");
    row.SetColumnContent(0, MakeRedBitmap(7, 7).get());
    EXPECT_EQ(nullptr, row.GetColumnContentText(0));
    EXPECT_NE(nullptr, row.GetColumnContentBitmap(0));
    row.SetColumnContent(0, "text");
    EXPECT_STREQ("text", row.GetColumnContentText(0));
    EXPECT_EQ(nullptr, row.GetColumnContentBitmap(0));
}

TEST_F(CLVEasyItemTest, ComparesTextsWithoutRegardToTheCaseOfAsciiLetters) {
    struct Case {
        const char* a;
        const char* b;
        int sign;
    };
    const Case cases[] = {
        {"abc", "ABC", 0}, {"abc", "abd", -1},          {"B", "a", 1},
        {"a", "ab", -1},   {"\xC3\xA4", "\xC3\x84", 1}, // no letters of ASCII
    };
    CLVEasyItem& a = MakeRow();
    CLVEasyItem& b = MakeRow();
    for (const Case& one : cases) {
        for (const bool truncate : {false, true}) {
            a.SetColumnContent(1, one.a, truncate);
            b.SetColumnContent(1, one.b, !truncate);
            const int result = CLVEasyItem::CompareItems(&a, &b, 1);
            EXPECT_EQ(one.sign, (result > 0) - (result < 0)) << one.a << " and " << one.b;
        }
    }
}

TEST_F(CLVEasyItemTest, WhatHoldsNoTextComparesEqual) {
    class OtherRow : public CLVListItem {
      public:
        OtherRow() : CLVListItem(0, false, true, 10) {}
        void DrawItemColumn(BView*, BRect, int32, bool) override {}
    };
    CLVEasyItem& text = MakeRow();
    CLVEasyItem& picture = MakeRow();
    CLVEasyItem& empty = MakeRow();
    const OtherRow other;
    text.SetColumnContent(0, "b");
    picture.SetColumnContent(0, MakeRedBitmap(3, 3).get());

    const CLVListItem* const rows[] = {&picture, &empty, &other};
    for (const CLVListItem* row : rows) {
        EXPECT_EQ(0, CLVEasyItem::CompareItems(&text, row, 0));
        EXPECT_EQ(0, CLVEasyItem::CompareItems(row, &text, 0));
    }
    EXPECT_EQ(0, CLVEasyItem::CompareItems(&text, &text, 5));
    EXPECT_EQ(0, CLVEasyItem::CompareItems(&text, &text, -1));
}

TEST_F(CLVEasyItemTest, ATextIsDrawnBlackTwoPixelsInAndCentredInItsRow) {
    MakeList(false, {{100, 0}, {100, 0}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(0, "|");
    row.SetColumnContent(1, "H");
    mStage.Redraw();

    EXPECT_EQ(0, CountOther(kWhite, BRect(0, 0, 1, 19)));
    EXPECT_GT(CountOther(kWhite, BRect(2, 0, 12, 19)), 3);
    EXPECT_EQ(0, CountOther(kWhite, BRect(0, 20, 299, 39)));
    font_height height;
    be_plain_font->GetHeight(&height);
    const float ascent = std::ceil(height.ascent);
    const float baseline = ascent + (19 - (ascent + std::ceil(height.descent))) / 2;
    // A capital stands on the baseline.
    EXPECT_GT(CountOther(kWhite, BRect(101, std::floor(baseline) - 2, 120, std::floor(baseline))), 0);
    EXPECT_EQ(0, CountOther(kWhite, BRect(101, std::ceil(baseline) + 1, 120, 19)));
}

TEST_F(CLVEasyItemTest, ASelectedRowIsGreyFromEdgeToEdge) {
    MakeList(false, {{100, 0}, {50, 0}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(0, "I");
    mStage.Locked([this] { mList->Select(0); });
    mStage.Redraw();

    EXPECT_EQ(kSelected, At(0, 0));
    EXPECT_EQ(kSelected, At(99, 19));
    EXPECT_EQ(0, CountOther(kSelected, BRect(101, 0, 299, 19))) << "empty cell and what is right of it";
    EXPECT_EQ(0, CountOther(kWhite, BRect(0, 20, 299, 39)));

    mStage.Locked([this] { mList->DeselectAll(); });
    mStage.Redraw();
    EXPECT_EQ(0, CountOther(kWhite, BRect(50, 0, 299, 19)));
}

TEST_F(CLVEasyItemTest, CompleteDrawsTheGroundToo) {
    MakeList(false, {{100, 0}});
    CLVEasyItem& row = AddRow();
    mStage.Redraw();
    mStage.Locked([&] {
        mList->SetHighColor(0, 0, 255);
        mList->FillRect(mList->Bounds());
        row.DrawItem(mList, BRect(0, 0, 299, 19), false);
    });
    EXPECT_EQ(0, CountOther(0x0000FF, BRect(0, 0, 299, 39))) << "it counts on a ground that is cleared";
    mStage.Locked([&] { row.DrawItem(mList, BRect(0, 0, 299, 19), true); });
    EXPECT_EQ(0, CountOther(kWhite, BRect(0, 0, 299, 19)));
    EXPECT_EQ(0x0000FFU, At(0, 20));
}

TEST_F(CLVEasyItemTest, ALongTextIsCutOffOrShortenedAtItsCellsEnd) {
    MakeList(false, {{60, 0}, {60, 0}, {60, 0}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(0, "WWWWWWWWWWWWWWWWWWWW", false);
    row.SetColumnContent(1, "WWWWWWWWWWWWWWWWWWWW", true);
    mStage.Redraw();

    EXPECT_GT(CountOther(kWhite, BRect(55, 0, 60, 19)), 10) << "cut off";
    // Four pixels are left free, two of them on the left.
    EXPECT_EQ(0, CountOther(kWhite, BRect(120, 0, 182, 19)));
    CLVEasyItem& second = AddRow();
    char shortened[40];
    GetTruncatedString("WWWWWWWWWWWWWWWWWWWW", shortened, 56);
    second.SetColumnContent(1, shortened, false);
    EXPECT_EQ(Drawn(BRect(61, 0, 121, 19)), Drawn(BRect(61, 20, 121, 39)));
    EXPECT_STREQ("WWWWWWWWWWWWWWWWWWWW", row.GetColumnContentText(1));
}

TEST_F(CLVEasyItemTest, HalfACharacterBeforeTheEllipsisIsNotDrawn) {
    // Two bytes each, so that every other width cuts one in half.
    const std::string text = "\xC3\x84\xC3\x84\xC3\x84\xC3\x84\xC3\x84\xC3\x84\xC3\x84\xC3\x84\xC3\x84";
    MakeList(false, {{60, kTell}});
    CLVEasyItem& row = AddRow();
    CLVEasyItem& expected = AddRow();
    int halves = 0;
    for (float width = 20; width <= 60; width += 3) {
        std::vector<char> shortened(text.size() + 3);
        GetTruncatedString(text.c_str(), shortened.data(), width - 4);
        std::string whole = shortened.data();
        const size_t dots = whole.find('.');
        if (dots != std::string::npos && dots % 2 == 1) {
            whole.erase(dots - 1, 1);
            ++halves;
        }
        mStage.Locked([&] { mList->ColumnAt(0)->SetWidth(width); });
        row.SetColumnContent(0, text.c_str());
        expected.SetColumnContent(0, whole.c_str(), false);
        EXPECT_EQ(Drawn(BRect(0, 0, width, 19)), Drawn(BRect(0, 20, width, 39))) << width;
    }
    EXPECT_GT(halves, 0) << "no width of these tests anything";
}

TEST_F(CLVEasyItemTest, APictureIsDrawnAtItsRoundedOffsetAndCentred) {
    MakeList(false, {{60, 0}, {60, 0}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(1, MakeRedBitmap(9, 6).get(), 6.6F);
    mStage.Redraw();

    // 61 + 7; (19 - 6) / 2 rounded up.
    EXPECT_EQ(70, CountOf(kRed, BRect(68, 7, 77, 13)));
    EXPECT_EQ(70, CountOf(kRed, BRect(0, 0, 299, 19)));
    EXPECT_EQ(B_OP_COPY, mList->DrawingMode());
}

TEST_F(CLVEasyItemTest, APictureTallerOrWiderThanItsCellIsCutOff) {
    MakeList(false, {{30, 0}, {60, 0}});
    AddRow();
    CLVEasyItem& row = AddRow();
    AddRow();
    row.SetColumnContent(0, MakeRedBitmap(99, 99).get(), 10);
    mStage.Redraw();

    EXPECT_EQ(21 * 20, CountOf(kRed, BRect(10, 20, 30, 39)));
    EXPECT_EQ(21 * 20, CountOf(kRed, BRect(0, 0, 299, 99)));
}

TEST_F(CLVEasyItemTest, TransparentPixelsOfAPictureLetTheGroundThrough) {
    MakeList(false, {{60, 0}});
    CLVEasyItem& row = AddRow();
    BBitmap bitmap(BRect(0, 0, 7, 7), B_CMAP8);
    memset(bitmap.Bits(), B_TRANSPARENT_MAGIC_CMAP8, static_cast<size_t>(bitmap.BitsLength()));
    row.SetColumnContent(0, &bitmap);
    mStage.Locked([this] { mList->Select(0); });
    mStage.Redraw();
    EXPECT_EQ(0, CountOther(kSelected, BRect(0, 0, 60, 19)));
}

TEST_F(CLVEasyItemTest, AfterAWidthChangeOnlyTheChangedPartOfItsTextIsDrawn) {
    MakeList(false, {{100, kTell}, {50, kTell}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(0, "The beginning stays as it is when the end changes");
    mStage.Redraw();

    mStage.Locked([this] { mList->ColumnAt(0)->SetWidth(90); });

    const BRect origin = OnStage(BRect(0, 0, 0, 0));
    const BRect damage = mStage.Damage().Frame();
    EXPECT_GT(damage.left, origin.left + 30);
    mStage.Redraw();
    EXPECT_TRUE(IsDrawnAsAnew());
}

TEST_F(CLVEasyItemTest, AnyWidthChangesLeaveTheSamePictureAsDrawingAnew) {
    std::mt19937 random(static_cast<uint32>(RandomSeed()));
    MakeList(true, {{20, CLV_COLUMN_EXPANDER},
                    {80, kTell | CLV_COLUMN_PUSH_PASS},
                    {60, kTell},
                    {70, kTell},
                    {40, kTell}});
    const char* const texts[] = {"AVAVAVAVAVAVAVAV", "fluffiest office affair", "jjjj fjord jumps",
                                 "W W W W W W W", "Gr\xC3\xBC\xC3\x9F\x65 aus K\xC3\xB6ln am Rhein"};
    for (uint32 i = 0; i < 8; ++i) {
        CLVEasyItem& row = AddRow(i % 3, i % 3 < 2);
        for (int column = 1; column <= 4; ++column) {
            row.SetColumnContent(column, texts[random() % 5], random() % 4 != 0);
        }
    }
    mStage.Redraw();
    for (int step = 0; step < 300; ++step) {
        mStage.Locked([&] {
            CLVColumn* const column = mList->ColumnAt(static_cast<int32>(1 + random() % 4));
            column->SetWidth(column->Width() + static_cast<float>(random() % 31) - 15);
        });
        mStage.Redraw();
        ASSERT_TRUE(IsDrawnAsAnew()) << "after step " << step;
    }
}

TEST_F(CLVEasyItemTest, RowsOutOfSightAreShortenedWhenTheyComeIntoView) {
    MakeList(false, {{100, kTell}});
    for (int i = 0; i < 40; ++i) {
        AddRow().SetColumnContent(0, "A text that is too long for every width");
    }
    mStage.Redraw();
    mStage.Locked([this] {
        mList->ScrollTo(BPoint(0, 400));
        mList->ColumnAt(0)->SetWidth(60);
        mList->ScrollTo(BPoint(0, 0));
    });
    mStage.Redraw();
    EXPECT_EQ(0, CountOther(kWhite, BRect(59, 0, 299, 99)));
    EXPECT_TRUE(IsDrawnAsAnew());
}

TEST_F(CLVEasyItemTest, AFrameThatChangesShortensItsTextAnew) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, kTell}, {60, kTell}});
    AddRow(0, true);
    CLVEasyItem& row = AddRow(1);
    row.SetColumnContent(1, "As long as the wide column and longer");
    row.SetColumnContent(2, "As long as the wide column and longer");
    mStage.Redraw();

    // The other one is pushed now.
    const int32 order[] = {0, 2, 1};
    mStage.Locked([&] { mList->SetDisplayOrder(order); });
    mStage.Redraw();

    EXPECT_TRUE(IsDrawnAsAnew());
    EXPECT_EQ(0, CountOther(kWhite, BRect(80, 20, 83, 39))) << "shortened to 40 pixels";
}

TEST_F(CLVEasyItemTest, ANewTextShowsWhenItIsDrawn) {
    MakeList(false, {{100, kTell}});
    CLVEasyItem& row = AddRow();
    row.SetColumnContent(0, "WWW");
    mStage.Redraw();
    const std::vector<uint32> before = Pixels();
    row.SetColumnContent(0, "iii");
    mStage.Redraw();
    EXPECT_EQ(before, Pixels());
    RedrawAll();
    EXPECT_NE(before, Pixels());
}
