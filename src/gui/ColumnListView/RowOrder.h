// RowOrder: which of two rows comes first, by one sort key after the other.
#pragma once

#include "gui/ColumnListView/CLVColumn.h"

#include <SupportDefs.h>

#include <vector>

class CLVListItem;

// Negative, zero or positive, as strcmp().
typedef int (*CLVCompareFuncPtr)(const CLVListItem* a, const CLVListItem* b, long column_index);

// Callable as a comparison of rows: -1, 0 or 1.
class RowOrder {
  public:
    // Null for none: then all rows compare equal.
    explicit RowOrder(CLVCompareFuncPtr function) : mFunction(function) {}

    // As the last key.
    void AddKey(int32 column_index, CLVSortMode mode) {
        mKeys.push_back({column_index, mode == CLV_SORT_DESCENDING});
    }
    bool OrdersAnything() const { return mFunction != nullptr && !mKeys.empty(); }

    int operator()(const CLVListItem* a, const CLVListItem* b) const {
        for (const Key& key : mKeys) {
            const int result = mFunction == nullptr ? 0 : mFunction(a, b, key.columnIndex);
            if (result != 0) {
                return (result > 0) == key.descending ? -1 : 1;
            }
        }
        return 0;
    }

  private:
    struct Key {
        long columnIndex;
        bool descending;
    };

    CLVCompareFuncPtr mFunction;
    std::vector<Key> mKeys;
};
