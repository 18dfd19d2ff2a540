// Thousands of random changes to an outline, done to a plain model of it as well.
#include "ListsForTests.h"

#include "gui/ColumnListView/ExchangeSort.h"
#include "support/random_seed.h"

#include <algorithm>
#include <random>

namespace {

// Every row in order; whether it is visible is worked out anew by each operation that changes it.
class Model {
  public:
    struct Entry {
        NumberedRow* row;
        bool visible;
    };

    int32 Count() const { return static_cast<int32>(entries.size()); }
    Entry& At(int32 index) { return entries[static_cast<size_t>(index)]; }
    uint32 LevelAt(int32 index) { return At(index).row->OutlineLevel(); }
    int32 IndexOf(const NumberedRow* row) const {
        const auto found = std::find_if(entries.begin(), entries.end(),
                                        [row](const Entry& entry) { return entry.row == row; });
        return static_cast<int32>(found - entries.begin());
    }
    int32 SuperOf(int32 index, uint32 level) {
        do {
            --index;
        } while (index >= 0 && LevelAt(index) >= level);
        return index;
    }
    int32 EndBelow(int32 index) {
        int32 end = index + 1;
        while (end < Count() && LevelAt(end) > LevelAt(index)) {
            ++end;
        }
        return end;
    }
    void Insert(int32 index, NumberedRow* row) {
        const int32 super = SuperOf(index, row->OutlineLevel());
        const bool visible = super < 0 || (At(super).visible && At(super).row->IsExpanded());
        entries.insert(entries.begin() + index, {row, visible});
    }
    void Remove(int32 index, int32 count) {
        uint32 shallowest = LevelAt(index);
        for (int32 i = index; i < index + count; ++i) {
            shallowest = std::min(shallowest, LevelAt(i));
        }
        int32 end = index + count;
        while (end < Count() && LevelAt(end) > shallowest) {
            ++end;
        }
        entries.erase(entries.begin() + index, entries.begin() + end);
    }
    // The row's expanded state has been changed.
    void ShowBelow(int32 index) {
        if (!At(index).visible) {
            return;
        }
        const int32 end = EndBelow(index);
        for (int32 i = index + 1; i < end; ++i) {
            const int32 super = SuperOf(i, LevelAt(i));
            At(i).visible = At(super).visible && At(super).row->IsExpanded();
        }
    }
    template <typename Compare>
    std::vector<Entry> Sorted(int32 from, int32 to, Compare compare) {
        std::vector<Entry> sorted;
        while (from < to) {
            std::vector<int32> siblings;
            const uint32 level = LevelAt(from);
            for (; from < to && LevelAt(from) == level; from = EndBelow(from)) {
                siblings.push_back(from);
            }
            ExchangeSort(siblings, [&](int32 a, int32 b) { return compare(At(a).row, At(b).row); });
            for (const int32 sibling : siblings) {
                sorted.push_back(At(sibling));
                const std::vector<Entry> below = Sorted(sibling + 1, EndBelow(sibling), compare);
                sorted.insert(sorted.end(), below.begin(), below.end());
            }
        }
        return sorted;
    }

    std::vector<Entry> entries;
};

class RandomColumnList : public ColumnLists {
  protected:
    int32 Below(int32 limit) { return std::uniform_int_distribution<int32>(0, limit - 1)(mRandom); }
    int32 AnyIndex() { return Below(mModel.Count()); }
    NumberedRow* NewRandom() {
        return New(static_cast<uint32>(Below(4)), Below(2) == 0, {Below(4), Below(4), Below(4)});
    }

    void Insert() {
        NumberedRow* const row = NewRandom();
        const int32 index = Below(2) == 0 ? mModel.Count() : Below(mModel.Count() + 1);
        ASSERT_TRUE(index == mModel.Count() ? mList->AddItem(row) : mList->AddItem(row, index));
        mModel.Insert(index, row);
    }
    void InsertList() {
        BList list;
        int32 index = Below(mModel.Count() + 1);
        const int32 at = index;
        for (int32 count = Below(40); count > 0; --count) {
            NumberedRow* const row = NewRandom();
            list.AddItem(static_cast<BListItem*>(row));
            mModel.Insert(index++, row);
        }
        ASSERT_TRUE(mList->AddList(&list, at));
    }
    void InsertUnder() {
        const int32 super = AnyIndex();
        NumberedRow* const row = NewRandom();
        ASSERT_TRUE(mList->AddUnder(row, mModel.At(super).row));
        mModel.Insert(mModel.EndBelow(super), row);
    }
    void Remove() {
        const int32 index = AnyIndex();
        if (Below(2) == 0) {
            ASSERT_TRUE(mList->RemoveItem(mModel.At(index).row));
            mModel.Remove(index, 1);
            return;
        }
        const int32 count = 1 + Below(std::min(6, mModel.Count() - index));
        ASSERT_TRUE(mList->RemoveItems(index, count));
        mModel.Remove(index, count);
    }
    void ExpandOrCollapse(bool expand) {
        const int32 index = AnyIndex();
        NumberedRow* const row = mModel.At(index).row;
        const bool changes = row->IsExpanded() != expand;
        if (expand) {
            mList->Expand(row);
        } else {
            mList->Collapse(row);
        }
        ASSERT_TRUE(row->IsSuperItem());
        ASSERT_EQ(row->IsExpanded(), expand);
        if (changes) {
            mModel.ShowBelow(index);
        }
    }
    int Compare(const NumberedRow* a, const NumberedRow* b) const {
        for (const int32 key : mKeys) {
            const auto column = static_cast<size_t>(key);
            const int result = a->keys[column] - b->keys[column];
            if (result != 0) {
                return mModes[column] == CLV_SORT_DESCENDING ? -result : result;
            }
        }
        return 0;
    }
    void SortModel() {
        mModel.entries = mModel.Sorted(
            0, mModel.Count(), [this](const NumberedRow* a, const NumberedRow* b) { return Compare(a, b); });
    }
    void Sort() {
        const int32 column = Below(3);
        CLVSortMode& mode = mModes[static_cast<size_t>(column)];
        const bool isKey = std::find(mKeys.begin(), mKeys.end(), column) != mKeys.end();
        const int what = Below(4);
        if (what == 0) {
            mList->SetSortKey(column);
            if (mKeys.empty() || mKeys[0] != column) {
                mKeys = {column};
                mode = mode == CLV_SORT_NONE ? CLV_SORT_ASCENDING : mode;
                SortModel();
            }
        } else if (what == 1) {
            mList->AddSortKey(column);
            if (!isKey) {
                mKeys.push_back(column);
                mode = mode == CLV_SORT_NONE ? CLV_SORT_ASCENDING : mode;
                SortModel();
            }
        } else if (what == 2) {
            mList->ReverseSortMode(column);
            if (mode == CLV_SORT_DESCENDING) {
                std::erase(mKeys, column);
            }
            mode = static_cast<CLVSortMode>((mode + 1) % 3);
            SortModel();
        } else {
            mList->SortItems();
            SortModel();
        }
    }
    void Check() {
        Numbers full;
        Numbers visible;
        for (const Model::Entry& entry : mModel.entries) {
            full.push_back(entry.row->number);
            if (entry.visible) {
                visible.push_back(entry.row->number);
                ASSERT_EQ(mList->VisibleIndexOf(entry.row), static_cast<int32>(visible.size()) - 1);
            } else {
                ASSERT_FALSE(entry.row->IsSelected());
                ASSERT_EQ(mList->VisibleIndexOf(entry.row), -1);
            }
        }
        ASSERT_EQ(Full(), full);
        ASSERT_EQ(Visible(), visible);
        ASSERT_EQ(mContainer->GetDataRect().bottom,
                  std::max(0.0F, 20.0F * static_cast<float>(visible.size()) - 1));
        for (int probe = 0; probe < 3 && mModel.Count() > 0; ++probe) {
            const int32 index = AnyIndex();
            const NumberedRow* const row = mModel.At(index).row;
            const int32 super = mModel.SuperOf(index, row->OutlineLevel());
            ASSERT_EQ(mList->Superitem(row), super < 0 ? nullptr : mModel.At(super).row);
            ASSERT_EQ(mList->FullListNumberOfSubitems(row), mModel.EndBelow(index) - index - 1);
            ASSERT_EQ(mList->FullListIndexOf(row), index);
        }
    }

    std::mt19937 mRandom{RandomSeed()};
    Model mModel;
    std::vector<int32> mKeys;
    std::vector<CLVSortMode> mModes{CLV_SORT_NONE, CLV_SORT_NONE, CLV_SORT_NONE};
};

TEST_F(RandomColumnList, AgreesWithAPlainModelAfterEachOfFiveThousandChanges) {
    Make(true);
    for (int column = 0; column < 3; ++column) {
        AddColumn(CLV_COLUMN_SORTABLE);
    }
    mList->SetSortFunction(CompareKeys);
    for (int step = 0; step < 5000; ++step) {
        const int32 what = mModel.Count() == 0 ? 0 : Below(20);
        if (what < 4) {
            Insert();
        } else if (what < 5) {
            InsertList();
        } else if (what < 7) {
            InsertUnder();
        } else if (what < 11 || mModel.Count() > 300) {
            Remove();
        } else if (what < 14) {
            ExpandOrCollapse(true);
        } else if (what < 17) {
            ExpandOrCollapse(false);
        } else if (what < 18) {
            Sort();
        } else {
            mList->Select(Below(mList->CountItems()), Below(mList->CountItems()), Below(2) == 0);
        }
        Check();
        ASSERT_FALSE(HasFatalFailure()) << "step " << step;
    }
}

} // namespace
