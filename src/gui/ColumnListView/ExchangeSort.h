// The order that an exchange sort makes.
#pragma once

#include <SupportDefs.h>

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

// Compares each item with each that follows it and swaps the two when the first is the greater. Items that
// compare equal do not keep their order: [2a, 2b, 1] becomes [1, 2b, 2a]. `compare(a, b)` is positive when a
// is to stand behind b; it need not be consistent.
template <typename Item, typename Compare>
void ExchangeSort(std::vector<Item>& items, Compare compare) {
    for (size_t i = 0; i + 1 < items.size(); ++i) {
        for (size_t j = i + 1; j < items.size(); ++j) {
            if (compare(items[i], items[j]) > 0) {
                std::swap(items[i], items[j]);
            }
        }
    }
}
