// The order that an exchange sort makes, at the cost of a merge sort.
#pragma once

#include <SupportDefs.h>

#include <algorithm>
#include <utility>
#include <vector>

// Compares each item with each that follows it and swaps the two when the first is the greater. Items that
// compare equal do not keep their order: [2a, 2b, 1] becomes [1, 2b, 2a]. `compare(a, b)` is positive when a
// is to stand behind b; it need not be consistent.
template <typename Item, typename Compare>
void ExchangeSort(std::vector<Item>& items, Compare compare);

// The same result in O(n log n) comparisons when `compare` is a consistent ordering; when it is found not to
// be, ExchangeSort() itself is run. Small inputs always are.
template <typename Item, typename Compare>
void SortLikeExchange(std::vector<Item>& items, Compare compare);
