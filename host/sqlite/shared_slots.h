#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <string>

namespace host {

/// What one process tells the others about its queue; lies in shared memory. Zero when free.
struct alignas(64) ProcessSlot {
    std::atomic<std::uint64_t> reported{0};
    std::atomic<std::uint64_t> committed{0};
    std::atomic<std::uint32_t> hurry{0};  ///< another process waits for this one's commit
    std::atomic<std::uint32_t> signal{0}; ///< futex, moves at every commit
    std::atomic<std::uint32_t> owned{0};  ///< from taking the slot to giving it back in good order
};
static_assert(std::atomic<std::uint64_t>::is_always_lock_free);

/// The slots by which the processes that use one volume's index know of each other (docs/index.md). A slot is
/// owned by a lock that the kernel drops when its process ends, so nothing needs to be cleaned up after a
/// crash. Any thread, after open().
class SharedSlots {
  public:
    static constexpr std::size_t kSlots = 64;

    SharedSlots() = default;
    ~SharedSlots();
    SharedSlots(const SharedSlots&) = delete;
    SharedSlots& operator=(const SharedSlots&) = delete;

    /// Maps the file and takes a slot. False when there is none to be had: this process is then not seen by
    /// others.
    bool open(const std::string& path);
    /// Null before open(), or without a slot.
    ProcessSlot* own() const { return own_; }
    /// Gives the slot back in good order.
    void close();

    /// Waits until every other living process has committed what it has reported so far.
    void wait_for_others() const;
    bool others_alive() const;
    /// Frees the slots of processes that ended without giving theirs back. True when there were any.
    bool take_over_dead();

    /// Tells waiting processes that `slot` has moved.
    static void wake(ProcessSlot& slot);

  private:
    bool is_alive(std::size_t index) const;
    bool lock_slot(std::size_t index) const;
    void unlock_slot(std::size_t index) const;

    int descriptor_ = -1;
    ProcessSlot* slots_ = nullptr;
    ProcessSlot* own_ = nullptr;
};

} // namespace host
