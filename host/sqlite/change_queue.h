#pragma once

#include "host/api/entry.h"
#include "host/api/index.h"
#include "host/api/thread_safety.h"
#include "host/sqlite/shared_slots.h"
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace host {

/// "Look at this entry again": what the index is told of a change, by whomever it was made.
struct ChangeNote {
    enum class Source {
        own,      ///< reported through the kits: read the file in any case
        observed, ///< a watcher's event: nothing to do when the row's change time is the file's
        vanished, ///< a walk of the whole volume did not meet it: look only where it was
    };
    std::uint64_t directory = 0;
    std::string leaf;
    Source source = Source::own;
};

/// The notes of one volume that wait for its writer. Bounded: see put(). Any thread.
class ChangeQueue {
  public:
    static constexpr std::size_t kCapacity = 32768;
    static constexpr std::size_t kGroup = 4096;
    static constexpr std::chrono::milliseconds kGroupTime{50};

    /// From now on other processes see how far this queue is. Null: no more. The slot must live until then.
    void show_in(ProcessSlot* slot);

    /// Appends a note. When the queue is full the caller waits up to a second for room; then the note is
    /// dropped, and overflowed() tells so.
    ChangeTicket put(std::uint64_t directory, const std::string& leaf, ChangeNote::Source source);

    /// For the writer: waits until there is a group's worth, or what there is has waited long enough, or
    /// somebody hurries, or stop(). False after stop() when nothing is left.
    bool take(std::vector<ChangeNote>& group, std::uint64_t& position);
    /// All notes up to this position are in the database (or given up).
    void set_committed(std::uint64_t position);

    std::uint64_t reported() const { return reported_.load(std::memory_order_seq_cst); }
    std::uint64_t committed() const { return committed_.load(std::memory_order_seq_cst); }
    /// Wakes the writer at once and waits until it has committed up to this position, or stop().
    void wait_for(std::uint64_t position);
    /// Wakes the writer without waiting.
    void hurry();
    void stop();

    /// True once after notes were dropped.
    bool overflowed() { return overflowed_.exchange(false); }

  private:
    std::atomic<std::uint64_t> reported_{0};
    std::atomic<std::uint64_t> committed_{0};
    std::atomic<std::uint64_t> taken_{0};
    std::atomic<bool> overflowed_{false};
    Mutex mutex_;
    std::condition_variable_any filled_;
    std::condition_variable_any drained_;
    std::condition_variable_any moved_;
    std::vector<ChangeNote> notes_ GUARDED_BY(mutex_);
    bool hurried_ GUARDED_BY(mutex_) = false;
    bool stopped_ GUARDED_BY(mutex_) = false;
    bool writer_waits_ GUARDED_BY(mutex_) = false;
    ProcessSlot* slot_ GUARDED_BY(mutex_) = nullptr;
};

} // namespace host
