// The order that an exchange sort makes, at the cost of a merge sort.
#pragma once

#include "gui/ColumnListView/ExchangeOrder.h"

#include <SupportDefs.h>

#include <algorithm>
#include <cstddef>
#include <numeric>
#include <utility>
#include <vector>

// Up to here the exchange sort itself costs about what the detour does.
constexpr size_t kFewToExchange = 32;

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

// The items from `begin` to `end`, by way of `merged`, which is as long as they all are.
template <typename Item, typename Compare>
void MergeSortPart(std::vector<Item>& items, std::vector<Item>& merged, size_t begin, size_t end,
                   Compare& compare) {
    if (end - begin < 2) {
        return;
    }
    const size_t middle = begin + (end - begin) / 2;
    MergeSortPart(items, merged, begin, middle, compare);
    MergeSortPart(items, merged, middle, end, compare);
    size_t left = begin;
    size_t right = middle;
    for (size_t to = begin; to < end; ++to) {
        const bool takeRight = left == middle || (right < end && compare(items[left], items[right]) > 0);
        merged[to] = items[takeRight ? right++ : left++];
    }
    std::copy(merged.begin() + static_cast<ptrdiff_t>(begin), merged.begin() + static_cast<ptrdiff_t>(end),
              items.begin() + static_cast<ptrdiff_t>(begin));
}

// Keeps the order of items that compare equal. Safe, if meaningless, with a comparison that contradicts
// itself. Part by part, so that what is compared stays in the processor's caches.
template <typename Item, typename Compare>
void MergeSort(std::vector<Item>& items, Compare compare) {
    std::vector<Item> merged(items.size());
    MergeSortPart(items, merged, 0, items.size(), compare);
}

// False when `items`, each not greater than the next by `compare`, show that it contradicts itself. Looks at
// pairs that stand far from each other, no more than some thousand.
template <typename Item, typename Compare>
bool FarPairsAgree(const std::vector<Item>& items, Compare compare) {
    constexpr size_t kPairsForEachDistance = 256;
    for (size_t distance = items.size() - 1; distance > 1; distance /= 2) {
        const size_t pairs = items.size() - distance;
        const size_t step = std::max<size_t>(1, pairs / kPairsForEachDistance);
        for (size_t i = 0; i < pairs; i += step) {
            if (compare(items[i], items[i + distance]) > 0) {
                return false;
            }
        }
    }
    return true;
}

template <typename Item, typename Compare>
bool IsInOrder(const std::vector<Item>& items, Compare compare) {
    for (size_t i = 0; i + 1 < items.size(); ++i) {
        if (compare(items[i], items[i + 1]) > 0) {
            return false;
        }
    }
    return FarPairsAgree(items, compare);
}

// The same result as ExchangeSort() in O(n log n) comparisons when `compare` is a consistent ordering. When
// it is found not to be (it is looked at in passing, not proved), and for few items, ExchangeSort() itself is
// run, which takes O(n * n).
template <typename Item, typename Compare>
void SortLikeExchange(std::vector<Item>& items, Compare compare) {
    if (items.size() <= kFewToExchange) {
        ExchangeSort(items, compare);
        return;
    }
    // What is sorted stays as it is: nothing would be swapped.
    if (IsInOrder(items, compare)) {
        return;
    }
    const auto compareAt = [&](int32 a, int32 b) {
        return compare(items[static_cast<size_t>(a)], items[static_cast<size_t>(b)]);
    };
    std::vector<int32> order(items.size());
    std::iota(order.begin(), order.end(), 0);
    MergeSort(order, compareAt);
    bool consistent = FarPairsAgree(order, compareAt);
    // Where each class of equal items begins.
    std::vector<int32> classes{0};
    for (size_t i = 1; consistent && i < order.size(); ++i) {
        const auto first = static_cast<size_t>(classes.back());
        const int toFirst = compareAt(order[first], order[i]);
        const int toNeighbour = first + 1 == i ? toFirst : compareAt(order[i - 1], order[i]);
        consistent = toFirst <= 0 && (toFirst == 0 ? toNeighbour == 0 : toNeighbour < 0);
        if (toFirst < 0) {
            classes.push_back(static_cast<int32>(i));
        }
    }
    if (!consistent) {
        ExchangeSort(items, compare);
        return;
    }
    OrderEqualsLikeExchange(order, classes);
    std::vector<Item> sorted;
    sorted.reserve(items.size());
    for (const int32 index : order) {
        sorted.push_back(std::move(items[static_cast<size_t>(index)]));
    }
    items = std::move(sorted);
}
