#pragma once

#include "host/api/thread_safety.h"
#include "host/linux/change_watcher.h"
#include "host/linux/directory_cache.h"
#include "host/sqlite/change_queue.h"
#include <chrono>
#include <cstdint>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace host {

/// Spares this process the events of its own changes while it changes the attributes of file after file of
/// one volume. The directory that it works in is then watched without attribute changes, and looked over once
/// it has left: whatever other programs did there meanwhile is found by its change time.
///
/// That nothing is missed rests on the order. A directory is watched fully again first, then looked over; the
/// files of the group that the writer has in hand it reads after that, so these need no look. Any thread.
class OwnWork {
  public:
    struct Limits {
        /// Changes that come closer upon each other than this, a good many of them, are a piece of work.
        std::chrono::milliseconds pause = std::chrono::milliseconds(200);
        /// Others' changes are found so late at most, if the writer keeps up.
        std::chrono::milliseconds longest_visit = std::chrono::seconds(1);
        /// In bytes. A directory that is larger, about a thousand files, takes longer to look over than its
        /// events would.
        std::int64_t largest_directory = 65536;
        /// A change gets its time first and is told later, when it is on the device: on a slow one that is
        /// mounted for synchronous writing a good while later.
        std::chrono::nanoseconds telling_time = std::chrono::seconds(60);
    };

    explicit OwnWork(DeviceId device) : OwnWork(device, Limits()) {}
    OwnWork(DeviceId device, const Limits& limits) : device_(device), limits_(limits) {}

    /// Whose watches are meant from now on. It must live until another is given; null: none.
    void follow(ChangeWatcher* watcher);

    /// This process has changed attributes in this directory and is about to put the note of it, after
    /// `reported` others. As long as that happens seldom nothing is done.
    void changed_in(std::uint64_t directory, std::uint64_t reported);

    /// For the writer, with a group that it has taken and not yet begun to read; `position` is the group's,
    /// `reported` how many notes there have been by now. Adds notes of what others may have changed in the
    /// directories that this process has left up to there. Where no more notes wait it has left them all.
    /// False: a directory could not be looked at, so changes may have been missed.
    [[nodiscard]] bool look_over(std::vector<ChangeNote>& group, std::uint64_t position,
                                 std::uint64_t reported);

  private:
    using Clock = std::chrono::steady_clock;
    struct Visit {
        std::uint64_t directory = 0;
        /// What was changed later by others has to be looked for. Nanoseconds since 1970.
        std::int64_t since = 0;
        Clock::time_point began;
        /// The last note of our own in this directory.
        std::uint64_t position = 0;
    };
    using Leaves = std::unordered_set<std::string_view>;

    void leave_locked(std::uint64_t position) REQUIRES(mutex_);
    std::vector<Visit> take_left(std::uint64_t position, std::uint64_t reported, bool& all);
    bool look_into(const Visit& visit, const Leaves& in_hand, std::vector<ChangeNote>& found);

    const DeviceId device_;
    const Limits limits_;
    Mutex mutex_;
    ChangeWatcher* watcher_ GUARDED_BY(mutex_) = nullptr;
    Clock::time_point last_change_ GUARDED_BY(mutex_);
    /// How many changes came close upon each other.
    int in_a_row_ GUARDED_BY(mutex_) = 0;
    /// The directory that is watched without attribute changes, open as long as it is; null: none.
    DirectoryCache::Handle narrowed_ GUARDED_BY(mutex_);
    Visit visit_ GUARDED_BY(mutex_);
    /// Watched fully again, not yet looked over; positions ascend.
    std::vector<Visit> left_ GUARDED_BY(mutex_);
    bool watch_lost_ GUARDED_BY(mutex_) = false;
};

} // namespace host
