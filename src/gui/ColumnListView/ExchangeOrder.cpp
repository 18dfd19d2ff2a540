#include "gui/ColumnListView/ExchangeOrder.h"

#include <algorithm>
#include <bit>
#include <cstddef>

namespace {

// Which of the places from 0 on are marked, and how many up to each: a binary indexed tree.
class Marks {
  public:
    explicit Marks(size_t places) : mSums(places + 1) {}

    void MarkAll() {
        for (size_t i = 1; i < mSums.size(); ++i) {
            mSums[i] = static_cast<int32>(i & (~i + 1));
        }
    }
    void Add(size_t place, int32 difference) {
        for (size_t i = place + 1; i < mSums.size(); i += i & (~i + 1)) {
            mSums[i] += difference;
        }
    }
    int32 CountBefore(size_t place) const {
        int32 count = 0;
        for (size_t i = place; i > 0; i -= i & (~i + 1)) {
            count += mSums[i];
        }
        return count;
    }
    // The marked place that has so many before it.
    size_t Find(int32 before) const {
        size_t place = 0;
        for (size_t step = std::bit_floor(mSums.size()); step > 0; step /= 2) {
            if (place + step < mSums.size() && mSums[place + step] <= before) {
                place += step;
                before -= mSums[place];
            }
        }
        return place;
    }

  private:
    std::vector<int32> mSums;
};

// `items`: those of one class. `passing[i]`: how many smaller ones come by after item i has joined the queue,
// before the next does. Goes backwards from the full queue: each item was the last one when it joined.
std::vector<int32> QueueAtEnd(const std::vector<int32>& items, const std::vector<int32>& passing) {
    std::vector<int32> queue(items.size());
    Marks waiting(items.size());
    waiting.MarkAll();
    int32 front = 0;
    for (size_t i = items.size(); i-- > 0;) {
        const auto length = static_cast<int32>(i + 1);
        front = (front + length - passing[i] % length) % length;
        const int32 last = (front + length - 1) % length;
        const size_t place = waiting.Find(last);
        queue[place] = items[i];
        waiting.Add(place, -1);
        front -= last < front ? 1 : 0;
    }
    return queue;
}

} // namespace

void OrderEqualsLikeExchange(std::vector<int32>& order, const std::vector<int32>& classes) {
    if (classes.size() == order.size()) {
        return;
    }
    Marks smaller(order.size());
    for (size_t i = 0; i < classes.size(); ++i) {
        const auto from = order.begin() + classes[i];
        const auto to = i + 1 < classes.size() ? order.begin() + classes[i + 1] : order.end();
        const std::vector<int32> items(from, to);
        if (items.size() > 1) {
            std::vector<int32> passing(items.size());
            for (size_t j = 0; j < items.size(); ++j) {
                const size_t next = j + 1 < items.size() ? static_cast<size_t>(items[j + 1]) : order.size();
                passing[j] = smaller.CountBefore(next) - smaller.CountBefore(static_cast<size_t>(items[j]));
            }
            std::copy_n(QueueAtEnd(items, passing).begin(), items.size(), from);
        }
        for (const int32 place : items) {
            smaller.Add(static_cast<size_t>(place), 1);
        }
    }
}
