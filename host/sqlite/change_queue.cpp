#include "host/sqlite/change_queue.h"
#include <algorithm>

namespace host {
namespace {

constexpr std::chrono::milliseconds kLookTime{5};

} // namespace

ChangeTicket ChangeQueue::put(std::uint64_t directory, const std::string& leaf, ChangeNote::Source source) {
    MutexLock lock(mutex_);
    if (notes_.size() >= kCapacity) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(1);
        hurried_ = true;
        filled_.notify_one();
        while (notes_.size() >= kCapacity && !stopped_) {
            if (drained_.wait_until(lock, deadline) == std::cv_status::timeout)
                break;
        }
        if (notes_.size() >= kCapacity || stopped_) {
            overflowed_ = true;
            return {};
        }
    }
    const bool repeats = !notes_.empty() && notes_.back().directory == directory &&
                         notes_.back().leaf == leaf && notes_.back().source == source;
    if (!repeats) {
        notes_.push_back({directory, leaf, source});
        reported_.fetch_add(1, std::memory_order_seq_cst);
        if (slot_ != nullptr)
            slot_->reported.store(reported_.load(), std::memory_order_seq_cst);
    }
    const std::uint64_t position = reported_.load(std::memory_order_seq_cst);
    // The writer looks by itself every few milliseconds once it has begun a group.
    if (writer_waits_ || notes_.size() == kGroup)
        filled_.notify_one();
    return {position, &taken_};
}

bool ChangeQueue::take(std::vector<ChangeNote>& group, std::uint64_t& position) {
    MutexLock lock(mutex_);
    group.clear();
    while (notes_.empty() && !stopped_) {
        writer_waits_ = true;
        hurried_ = false;
        filled_.wait(lock);
        writer_waits_ = false;
    }
    if (notes_.empty())
        return false;
    const auto deadline = std::chrono::steady_clock::now() + kGroupTime;
    while (notes_.size() < kGroup && !hurried_ && !stopped_) {
        const auto time = std::chrono::steady_clock::now();
        if (time >= deadline || (slot_ != nullptr && slot_->hurry.exchange(0) != 0))
            break;
        // Other processes can only leave a flag.
        filled_.wait_until(lock, std::min(deadline, time + kLookTime));
    }
    if (notes_.size() <= kGroup) {
        group.swap(notes_);
        hurried_ = false;
    } else {
        const auto end = notes_.begin() + kGroup;
        group.assign(std::make_move_iterator(notes_.begin()), std::make_move_iterator(end));
        notes_.erase(notes_.begin(), end);
    }
    position = reported_.load(std::memory_order_seq_cst) - notes_.size();
    taken_.store(position, std::memory_order_seq_cst);
    drained_.notify_all();
    return true;
}

void ChangeQueue::set_committed(std::uint64_t position) {
    MutexLock lock(mutex_);
    committed_.store(position, std::memory_order_seq_cst);
    if (slot_ != nullptr) {
        slot_->committed.store(position, std::memory_order_seq_cst);
        SharedSlots::wake(*slot_);
    }
    moved_.notify_all();
}

void ChangeQueue::show_in(ProcessSlot* slot) {
    MutexLock lock(mutex_);
    slot_ = slot;
    if (slot_ != nullptr) {
        slot_->committed.store(committed_.load());
        slot_->reported.store(reported_.load());
    }
}

void ChangeQueue::wait_for(std::uint64_t position) {
    if (committed() >= position)
        return;
    MutexLock lock(mutex_);
    while (committed() < position && !stopped_) {
        hurried_ = true;
        filled_.notify_one();
        moved_.wait(lock);
    }
}

void ChangeQueue::hurry() {
    MutexLock lock(mutex_);
    hurried_ = true;
    filled_.notify_one();
}

void ChangeQueue::stop() {
    MutexLock lock(mutex_);
    stopped_ = true;
    filled_.notify_all();
    drained_.notify_all();
    moved_.notify_all();
}

} // namespace host
