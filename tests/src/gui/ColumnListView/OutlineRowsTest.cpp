#include "gui/ColumnListView/OutlineRows.h"

#include "RowsForTests.h"
#include "support/random_seed.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <random>

namespace {

typedef std::vector<int> Numbers;

class OutlineRowsTest : public ::testing::Test {
  protected:
    NumberedRow* New(uint32 level, bool expanded = true) {
        mMade.push_back(std::make_unique<NumberedRow>(static_cast<int>(mMade.size()), level, expanded));
        return mMade.back().get();
    }
    // Levels of rows that are appended, all visible.
    void Fill(const std::vector<uint32>& levels) {
        for (const uint32 level : levels) {
            mRows.Insert(mRows.CountRows(), New(level), true);
        }
    }
    Numbers Order() const { return NumbersOf(mRows.Rows(0, mRows.CountRows())); }

    std::vector<std::unique_ptr<NumberedRow>> mMade;
    OutlineRows mRows;
};

TEST_F(OutlineRowsTest, AreEmptyAtFirst) {
    EXPECT_EQ(mRows.CountRows(), 0);
    EXPECT_EQ(mRows.CountVisible(), 0);
    EXPECT_EQ(mRows.IndexOf(New(0)), -1);
    EXPECT_EQ(mRows.IndexOf(nullptr), -1);
    EXPECT_FALSE(mRows.Has(New(0)));
    EXPECT_FALSE(mRows.IsVisible(New(0)));
    EXPECT_EQ(mRows.CountVisibleBefore(0), 0);
    EXPECT_EQ(mRows.FindSuper(0, 3), -1);
    EXPECT_EQ(mRows.Rows(0, 0), std::vector<CLVListItem*>());
}

TEST_F(OutlineRowsTest, FindSuperRowsAndEndsOfSubtrees) {
    Fill({0, 1, 2, 2, 1, 0, 3, 2});
    const struct {
        int32 index;
        uint32 level;
        int32 super;
        int32 end;
    } cases[] = {{0, 0, -1, 5}, {1, 1, 0, 4},  {2, 2, 1, 3}, {3, 2, 1, 4},
                 {4, 1, 0, 5},  {5, 0, -1, 8}, {6, 3, 5, 7}, {7, 2, 5, 8}};
    for (const auto& [index, level, super, end] : cases) {
        EXPECT_EQ(mRows.FindSuper(index, level), super) << index;
        EXPECT_EQ(mRows.FindEndBelow(index, level), end) << index;
    }
    // Of rows that would be appended.
    EXPECT_EQ(mRows.FindSuper(8, 0), -1);
    EXPECT_EQ(mRows.FindSuper(8, 1), 5);
    EXPECT_EQ(mRows.FindSuper(8, 2), 5);
    EXPECT_EQ(mRows.FindSuper(8, 3), 7);
    EXPECT_EQ(mRows.SmallestLevel(1, 4), 1U);
    EXPECT_EQ(mRows.SmallestLevel(6, 2), 2U);
    EXPECT_EQ(mRows.SmallestLevel(0, 8), 0U);
}

TEST_F(OutlineRowsTest, ShowLeavesOutWhatIsBelowCollapsedRows) {
    // 0 > (1 collapsed > 2 > 3), 4
    mRows.Insert(0, New(0), true);
    mRows.Insert(1, New(1, false), false);
    mRows.Insert(2, New(2), false);
    mRows.Insert(3, New(3), false);
    mRows.Insert(4, New(1), false);
    EXPECT_EQ(NumbersOf(mRows.Show(1, 5)), Numbers({1, 4}));
    EXPECT_EQ(mRows.CountVisible(), 3);
    EXPECT_FALSE(mRows.IsVisible(mRows.RowAt(2)));
    EXPECT_EQ(mRows.IndexOfVisible(2), 4);
    EXPECT_EQ(mRows.CountVisibleBefore(4), 2);
    EXPECT_EQ(mRows.Hide(1, 5), 2);
    EXPECT_EQ(mRows.CountVisible(), 1);
}

TEST_F(OutlineRowsTest, ClearDoesNotTouchRowsThatAreGone) {
    Fill({0, 1, 1});
    NumberedRow* const kept = mMade[2].release();
    mMade.clear();
    mRows.Clear();
    EXPECT_FALSE(mRows.Has(kept));
    kept->SetOutlineLevel(4);
    mRows.Insert(0, kept, true);
    EXPECT_EQ(mRows.IndexOf(kept), 0);
    EXPECT_EQ(mRows.SmallestLevel(0, 1), 4U);
    mRows.Clear();
    delete kept;
}

TEST_F(OutlineRowsTest, RowsOfAListThatIsGoneAreInNone) {
    NumberedRow* const row = New(0);
    {
        OutlineRows gone;
        gone.Insert(0, row, true);
    }
    row->SetOutlineLevel(1);
    EXPECT_FALSE(mRows.Has(row));
    EXPECT_TRUE(row->PlaceInOutline().block.expired());
}

TEST_F(OutlineRowsTest, ACopyOfARowsPlaceIsInNoList) {
    Fill({0});
    const OutlinePlace copy = mMade[0]->PlaceInOutline();
    EXPECT_TRUE(copy.block.expired());
    EXPECT_TRUE(mRows.Has(mMade[0].get()));
}

TEST_F(OutlineRowsTest, ALevelThatChangesInTheListCounts) {
    Fill({0, 1, 1});
    mMade[1]->SetOutlineLevel(0);
    EXPECT_EQ(mRows.FindSuper(3, 1), 1);
    EXPECT_EQ(mRows.FindEndBelow(0, 0), 1);
    mMade[0]->SetOutlineLevel(1);
    EXPECT_EQ(mRows.SmallestLevel(0, 1), 1U);
    EXPECT_EQ(mRows.FindSuper(1, 1), -1);
}

TEST_F(OutlineRowsTest, ReorderKeepsWhatIsVisible) {
    mRows.Insert(0, New(0), true);
    mRows.Insert(1, New(0), false);
    mRows.Insert(2, New(0), true);
    mRows.Reorder({mMade[1].get(), mMade[2].get(), mMade[0].get()});
    EXPECT_EQ(Order(), Numbers({1, 2, 0}));
    EXPECT_FALSE(mRows.IsVisible(mMade[1].get()));
    EXPECT_EQ(mRows.IndexOfVisible(0), 1);
    EXPECT_EQ(mMade[0]->PlaceInOutline().rank, 2);
}

// The same rows in a plain array.
class PlainRows {
  public:
    struct Entry {
        NumberedRow* row;
        bool visible;
    };
    int32 Count() const { return static_cast<int32>(entries.size()); }
    const Entry& At(int32 index) const { return entries[static_cast<size_t>(index)]; }
    uint32 LevelAt(int32 index) const { return At(index).row->OutlineLevel(); }
    int32 FindSuper(int32 index, uint32 level) const {
        while (--index >= 0 && LevelAt(index) >= level) {
        }
        return index;
    }
    int32 FindEndBelow(int32 index, uint32 level) const {
        while (++index < Count() && LevelAt(index) > level) {
        }
        return std::min(index, Count());
    }

    std::vector<Entry> entries;
};

class RandomOutline : public OutlineRowsTest {
  protected:
    int32 Below(int32 limit) { return std::uniform_int_distribution<int32>(0, limit - 1)(mRandom); }
    NumberedRow* NewRandom() { return New(static_cast<uint32>(Below(5)), Below(3) > 0); }

    void Insert() {
        // Runs of all lengths, now and then longer than a block.
        const int32 count = Below(20) == 0 ? 1 + Below(3000) : 1 + Below(20);
        const int32 index = Below(4) == 0 ? mPlain.Count() : Below(mPlain.Count() + 1);
        std::vector<OutlineRows::NewRow> added;
        std::vector<PlainRows::Entry> plain;
        for (int32 i = 0; i < count; ++i) {
            const bool visible = Below(2) == 0;
            added.push_back({NewRandom(), visible});
            plain.push_back({mMade.back().get(), visible});
        }
        mPlain.entries.insert(mPlain.entries.begin() + index, plain.begin(), plain.end());
        if (Below(2) == 0) {
            mRows.Insert(index, added);
            return;
        }
        for (int32 i = 0; i < count; ++i) {
            mRows.Insert(index + i, added[static_cast<size_t>(i)].row, added[static_cast<size_t>(i)].visible);
        }
    }
    std::pair<int32, int32> Run() {
        const int32 from = Below(mPlain.Count());
        return {from,
                from + 1 +
                    Below(Below(10) == 0 ? mPlain.Count() - from : std::min(30, mPlain.Count() - from))};
    }
    void Remove() {
        const auto [from, to] = Run();
        mRows.Remove(from, to - from);
        mPlain.entries.erase(mPlain.entries.begin() + from, mPlain.entries.begin() + to);
    }
    void Hide() {
        const auto [from, to] = Run();
        int32 hidden = 0;
        for (int32 i = from; i < to; ++i) {
            hidden += mPlain.At(i).visible ? 1 : 0;
            mPlain.entries[static_cast<size_t>(i)].visible = false;
        }
        EXPECT_EQ(mRows.Hide(from, to), hidden);
    }
    void Show() {
        const auto [from, to] = Run();
        std::vector<CLVListItem*> shown;
        for (int32 i = from; i < to;) {
            mPlain.entries[static_cast<size_t>(i)].visible = true;
            shown.push_back(mPlain.At(i).row);
            i = mPlain.At(i).row->IsExpanded() ? i + 1 : mPlain.FindEndBelow(i, mPlain.LevelAt(i));
        }
        EXPECT_EQ(mRows.Show(from, to), shown);
    }
    void Shuffle() {
        std::shuffle(mPlain.entries.begin(), mPlain.entries.end(), mRandom);
        std::vector<CLVListItem*> rows;
        for (const auto& entry : mPlain.entries) {
            rows.push_back(entry.row);
        }
        mRows.Reorder(rows);
    }
    void Check() {
        ASSERT_EQ(mRows.CountRows(), mPlain.Count());
        int32 visible = 0;
        for (int32 i = 0; i < mPlain.Count(); ++i) {
            const auto& entry = mPlain.At(i);
            ASSERT_EQ(mRows.RowAt(i), entry.row);
            ASSERT_EQ(mRows.CountVisibleBefore(i), visible);
            ASSERT_EQ(mRows.IsVisible(entry.row), entry.visible);
            if (entry.visible) {
                ASSERT_EQ(mRows.IndexOfVisible(visible), i);
            }
            visible += entry.visible ? 1 : 0;
        }
        ASSERT_EQ(mRows.CountVisible(), visible);
        ASSERT_EQ(mRows.CountVisibleBefore(mPlain.Count()), visible);
        for (int probe = 0; probe < 30 && mPlain.Count() > 0; ++probe) {
            const int32 index = Below(mPlain.Count());
            const auto level = static_cast<uint32>(Below(6));
            ASSERT_EQ(mRows.IndexOf(mPlain.At(index).row), index);
            ASSERT_EQ(mRows.FindSuper(index, level), mPlain.FindSuper(index, level));
            ASSERT_EQ(mRows.FindSuper(mPlain.Count(), level), mPlain.FindSuper(mPlain.Count(), level));
            ASSERT_EQ(mRows.FindEndBelow(index, level), mPlain.FindEndBelow(index, level));
            const auto [from, to] = Run();
            uint32 smallest = 100;
            for (int32 i = from; i < to; ++i) {
                smallest = std::min(smallest, mPlain.LevelAt(i));
            }
            ASSERT_EQ(mRows.SmallestLevel(from, to - from), smallest);
        }
    }

    std::mt19937 mRandom{RandomSeed()};
    PlainRows mPlain;
};

TEST_F(RandomOutline, AgreesWithAPlainArray) {
    for (int step = 0; step < 600; ++step) {
        const int32 what = mPlain.Count() == 0 ? 0 : Below(12);
        if (what < 4) {
            Insert();
        } else if (what < 7) {
            Remove();
        } else if (what < 9) {
            Show();
        } else if (what < 10) {
            Hide();
        } else if (what < 11) {
            mPlain.At(Below(mPlain.Count())).row->SetOutlineLevel(static_cast<uint32>(Below(5)));
        } else if (Below(10) == 0) {
            Shuffle();
        }
        if (step % 5 == 0) {
            Check();
            ASSERT_FALSE(HasFatalFailure()) << "step " << step;
        }
    }
    Check();
}

} // namespace
