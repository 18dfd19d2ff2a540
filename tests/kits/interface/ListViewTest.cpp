#include "ListStage.h"

#include <ScrollBar.h>

namespace {

TEST_F(Lists, RowsLearnOfAFontThatIsAnotherOneOnly) {
    Fill(2);
    mStage.Locked([&] {
        const int before = mRows[0]->updated;
        mList->SetFontSize(30);
        EXPECT_EQ(mRows[0]->updated, before + 1);
        mList->SetFontSize(30);
        EXPECT_EQ(mRows[0]->updated, before + 1);
    });
}

TEST_F(Lists, RowsLieBelowEachOther) {
    Fill(3);
    mStage.Locked([&] {
        EXPECT_EQ(mList->ItemFrame(0), BRect(0, 0, 99, 9));
        EXPECT_EQ(mList->ItemFrame(2), BRect(0, 20, 99, 29));
        EXPECT_FALSE(mList->ItemFrame(3).IsValid());
        EXPECT_FALSE(mList->ItemFrame(-1).IsValid());
        EXPECT_EQ(mList->IndexOf(BPoint(5, 0)), 0);
        EXPECT_EQ(mList->IndexOf(BPoint(-500, 29)), 2);
        EXPECT_EQ(mList->IndexOf(BPoint(5, 30)), -1);
        EXPECT_EQ(mList->IndexOf(BPoint(5, -1)), -1);
        EXPECT_EQ(mList->IndexOf(mRows[1].get()), 1);
        EXPECT_TRUE(mList->HasItem(mRows[2].get()));
        EXPECT_EQ(mList->FirstItem(), mRows[0].get());
        EXPECT_EQ(mList->LastItem(), mRows[2].get());
        EXPECT_EQ(mList->Items()[1], mRows[1].get());
        mRows[0]->SetHeight(19.5F);
        EXPECT_EQ(mList->ItemFrame(0), BRect(0, 0, 99, 20)) << "a row may change its height by itself";
        EXPECT_EQ(mList->ItemFrame(2), BRect(0, 31, 99, 40));
        mList->ScrollTo(BPoint(7, 3));
        EXPECT_EQ(mList->ItemFrame(0), BRect(0, 0, 106, 20));
    });
}

TEST_F(Lists, RowsComeAndGo) {
    Fill(4);
    TestRow extra(100);
    TestRow other(101);
    mStage.Locked([&] {
        EXPECT_TRUE(mList->AddItem(&extra, 1));
        EXPECT_FALSE(mList->AddItem(&other, 6));
        EXPECT_FALSE(mList->AddItem(nullptr));
    });
    EXPECT_EQ(Order(), (Numbers{0, 100, 1, 2, 3}));
    mStage.Locked([&] {
        EXPECT_EQ(mList->RemoveItem(int32{0}), mRows[0].get());
        EXPECT_EQ(mList->RemoveItem(int32{9}), nullptr);
        EXPECT_TRUE(mList->RemoveItem(&extra));
        EXPECT_FALSE(mList->RemoveItem(&extra));
    });
    EXPECT_EQ(Order(), (Numbers{1, 2, 3}));
    BList more;
    more.AddItem(&extra);
    more.AddItem(&other);
    mStage.Locked([&] {
        EXPECT_TRUE(mList->AddList(&more, 2));
        EXPECT_FALSE(mList->AddList(nullptr));
    });
    EXPECT_EQ(Order(), (Numbers{1, 2, 100, 101, 3}));
    mStage.Locked([&] {
        EXPECT_TRUE(mList->RemoveItems(3, 100));
        EXPECT_FALSE(mList->RemoveItems(3, 1));
        EXPECT_TRUE(mList->MoveItem(0, 2));
        EXPECT_FALSE(mList->MoveItem(0, 3));
    });
    EXPECT_EQ(Order(), (Numbers{2, 100, 1}));
    mStage.Locked([&] {
        EXPECT_TRUE(mList->SwapItems(0, 1));
        EXPECT_TRUE(mList->ReplaceItem(2, &other));
        EXPECT_FALSE(mList->ReplaceItem(3, &other));
    });
    EXPECT_EQ(Order(), (Numbers{100, 2, 101}));
    mStage.Locked([&] {
        mList->MakeEmpty();
        EXPECT_TRUE(mList->IsEmpty());
        EXPECT_EQ(mList->Items(), nullptr);
        EXPECT_EQ(mList->FirstItem(), nullptr);
    });
}

TEST_F(Lists, RowsOfDifferentHeightsKeepThemThroughEveryChange) {
    Fill(0);
    for (int i = 0; i < 5; ++i) {
        mRows.push_back(std::make_unique<TestRow>(i, static_cast<float>(10 * i + 9)));
        mStage.Locked([&] { mList->AddItem(mRows.back().get()); });
    }
    mStage.Locked([&] {
        EXPECT_EQ(mList->ItemFrame(4), BRect(0, 100, 99, 149));
        mList->MoveItem(4, 0);
        EXPECT_EQ(mList->ItemFrame(0), BRect(0, 0, 99, 49));
        EXPECT_EQ(mList->ItemFrame(1), BRect(0, 50, 99, 59));
        mList->SwapItems(0, 1);
        EXPECT_EQ(mList->ItemFrame(1), BRect(0, 10, 99, 59));
        mList->SortItems([](const void* a, const void* b) {
            const auto number = [](const void* slot) {
                return static_cast<const TestRow*>(*static_cast<BListItem* const*>(slot))->Number();
            };
            return number(b) - number(a);
        });
        EXPECT_EQ(mList->ItemFrame(4), BRect(0, 140, 99, 149));
        EXPECT_EQ(mList->ItemFrame(1), BRect(0, 50, 99, 89));
    });
    EXPECT_EQ(Order(), (Numbers{4, 3, 2, 1, 0}));
}

TEST_F(Lists, EachChangeOfTheSelectionIsTold) {
    Fill(5);
    mStage.Locked([&] { mList->Select(1, 3); });
    std::vector<BMessage> sent = mCatcher.Take();
    ASSERT_EQ(sent.size(), 1U);
    EXPECT_EQ(sent[0].what, 'sele');
    int32 index = -1;
    EXPECT_EQ(sent[0].FindInt32("index", 2, &index), B_OK);
    EXPECT_EQ(index, 3);
    EXPECT_NE(sent[0].FindInt32("index", 3, &index), B_OK);
    void* source = nullptr;
    EXPECT_EQ(sent[0].FindPointer("source", &source), B_OK);
    EXPECT_EQ(source, static_cast<BListView*>(mList));
    mStage.Locked([&] {
        mList->Select(1, 3);
        mList->Select(2, true);
        mList->Deselect(4);
        mList->DeselectExcept(0, 4);
        EXPECT_EQ(mList->changes, 1) << "none of these changes anything";
        mList->Deselect(2);
        EXPECT_EQ(mList->changes, 2);
        mList->DeselectExcept(2, 4);
        EXPECT_EQ(mList->changes, 3);
        mList->RemoveItem(int32{3});
        EXPECT_EQ(mList->changes, 4) << "a selected row was removed";
        mList->RemoveItem(int32{3});
        mList->DeselectAll();
        EXPECT_EQ(mList->changes, 4);
    });
    EXPECT_EQ(mCatcher.Count(), 3U);
    EXPECT_EQ(Selection(), (Numbers{}));
    EXPECT_FALSE(mRows[3]->IsSelected());
}

TEST_F(Lists, TheScrollBarKnowsTheRows) {
    Fill(20);
    mStage.Locked([&] {
        BScrollBar* const bar = mList->ScrollBar(B_VERTICAL);
        float min = -1;
        float max = -1;
        bar->GetRange(&min, &max);
        EXPECT_EQ(min, 0);
        EXPECT_EQ(max, 140);
        EXPECT_FLOAT_EQ(bar->Proportion(), 0.3F);
        mList->ScrollTo(BPoint(0, 140));
        mList->RemoveItems(0, 12);
        EXPECT_EQ(mList->Bounds().top, 20) << "nothing shows below the last row";
        mList->MakeEmpty();
        bar->GetRange(&min, &max);
        EXPECT_EQ(max, 0);
        EXPECT_EQ(mList->Bounds().top, 0);
    });
}

TEST_F(Lists, OnlyWhatShowsIsDrawnOnAClearedBackground) {
    Fill(20);
    EXPECT_EQ(Drawn(), 6);
    EXPECT_FALSE(mRows[0]->drawnComplete);
    EXPECT_EQ(mStage.At(50, 30), 0xFFFFFFU);
    ForgetDrawn();
    mStage.Locked([&] { mList->Select(2); });
    mStage.Redraw();
    EXPECT_EQ(Drawn(), 1);
    EXPECT_EQ(mRows[2]->drawn, 1);
    EXPECT_EQ(mStage.CountOf(0xB2B2B2, BRect(2, 22, 101, 31)), 1000) << "the row is redrawn whole";
    ForgetDrawn();
    mStage.Locked([&] { mList->Select(4); });
    mStage.Redraw();
    EXPECT_EQ(mStage.CountOf(0xB2B2B2, BRect(2, 22, 101, 31)), 0);
    EXPECT_EQ(mStage.CountOf(0xB2B2B2, BRect(2, 42, 101, 51)), 1000);
    ForgetDrawn();
    mStage.Locked([&] { mList->InvalidateItem(15); });
    mStage.Redraw();
    EXPECT_EQ(Drawn(), 0) << "it does not show";
    mStage.Locked([&] { mList->RemoveItem(int32{3}); });
    mStage.Redraw();
    EXPECT_EQ(mRows[2]->drawn, 0) << "rows above have not moved";
    EXPECT_EQ(mRows[6]->drawn, 1);
}

TEST_F(Lists, SelectionFollowsItsRows) {
    Fill(6);
    TestRow extra(100);
    mStage.Locked([&] {
        mList->Select(1);
        mList->Select(4, true);
        mList->AddItem(&extra, 2);
    });
    EXPECT_EQ(Selection(), (Numbers{1, 5}));
    mStage.Locked([&] { mList->MoveItem(5, 0); });
    EXPECT_EQ(Selection(), (Numbers{0, 2}));
    mStage.Locked([&] { mList->SwapItems(2, 6); });
    EXPECT_EQ(Selection(), (Numbers{0, 6}));
    mStage.Locked([&] { mList->RemoveItem(&extra); });
    EXPECT_EQ(Selection(), (Numbers{0, 5}));
    TestRow selected(101);
    selected.Select();
    mStage.Locked([&] { mList->AddItem(&selected); });
    EXPECT_EQ(Selection(), (Numbers{0, 5, 6}));
    mStage.Locked([&] { mList->MakeEmpty(); });
}

TEST_F(Lists, RowsMayBeGoneBeforeTheListIsEmptied) {
    Fill(5);
    mStage.Locked([&] {
        mList->Select(0, 4);
        mRows.clear();
        mList->MakeEmpty();
        EXPECT_EQ(mList->CurrentSelection(), -1);
    });
    auto list = std::make_unique<BListView>(BRect(0, 0, 9, 9), "list");
    auto row = std::make_unique<TestRow>(0);
    list->AddItem(row.get());
    list->Select(0);
    row.reset();
    list.reset();
}

TEST_F(Lists, SelectAllSelectsEveryRow) {
    Fill(4);
    BMessage all(B_SELECT_ALL);
    mStage.Send(mList, all);
    EXPECT_EQ(Selection(), (Numbers{0, 1, 2, 3}));
    mStage.Locked([&] { mList->Select(0, 100); });
    EXPECT_EQ(Selection(), (Numbers{0, 1, 2, 3}));
    EXPECT_EQ(mList->changes, 1);
}

// What appending and walking through a selection cost is seen in how often rows are asked.
TEST_F(Lists, HundredThousandRows) {
    Fill(0);
    constexpr int kMany = 100000;
    mRows.reserve(kMany);
    mStage.Locked([&] {
        for (int i = 0; i < kMany; ++i) {
            mRows.push_back(std::make_unique<TestRow>(i, i % 2 == 0 ? 9.0F : 19.0F));
            mList->AddItem(mRows.back().get());
        }
        EXPECT_EQ(mList->ItemFrame(kMany - 1), BRect(0, 1499980, 99, 1499999));
        EXPECT_EQ(mList->IndexOf(BPoint(0, 1499985)), kMany - 1);
        EXPECT_EQ(mList->IndexOf(mRows[kMany / 2].get()), kMany / 2);
    });
    for (const auto& row : mRows) {
        ASSERT_EQ(row->updated, 1);
    }
    mStage.Redraw();
    EXPECT_EQ(Drawn(), 4) << "60 pixels of rows of 10 and 20";
    BMessage all(B_SELECT_ALL);
    mStage.Send(mList, all);
    EXPECT_EQ(Selection().size(), size_t{kMany});
    mStage.Locked([&] {
        mList->SetSelectionMessage(nullptr);
        for (int32 i = kMany - 1; i >= 0; --i) {
            mList->RemoveItem(i);
        }
        EXPECT_TRUE(mList->IsEmpty());
        EXPECT_EQ(mList->CurrentSelection(), -1);
    });
}

TEST(ListView, ArchivesAndComesBack) {
    BListView list(BRect(0, 0, 99, 59), "list", B_MULTIPLE_SELECTION_LIST);
    BStringItem one("one");
    BStringItem two("two");
    list.AddItem(&one);
    list.AddItem(&two);
    list.Select(1);
    list.SetInvocationMessage(new BMessage('invo'));
    list.SetSelectionMessage(new BMessage('sele'));
    BMessage archive;
    ASSERT_EQ(list.Archive(&archive), B_OK);
    BListView back(&archive);
    EXPECT_EQ(back.ListType(), B_MULTIPLE_SELECTION_LIST);
    EXPECT_EQ(back.InvocationCommand(), 'invo');
    EXPECT_EQ(back.SelectionCommand(), 'sele');
    ASSERT_EQ(back.CountItems(), 2);
    EXPECT_EQ(back.CurrentSelection(), 1);
    EXPECT_STREQ(static_cast<BStringItem*>(back.ItemAt(1))->Text(), "two");
    for (int32 i = 0; i < 2; ++i) {
        delete back.ItemAt(i);
    }
}

} // namespace
