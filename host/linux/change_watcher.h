#pragma once

#include "host/api/entry.h"
#include "host/linux/descriptor.h"
#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <limits>
#include <string>
#include <thread>
#include <unordered_map>

namespace host {

/// Watches every directory of one volume for changes that any program makes, in a thread of its own at idle
/// priority. Watches do not keep the volume from being unmounted.
class ChangeWatcher {
  public:
    /// Called on the watcher's thread. May block.
    struct Sink {
        /// Something about this entry may have changed: it came, went, or its attributes or content did.
        std::function<void(std::uint64_t directory, const std::string& leaf)> entry_changed;
        /// Changes may have been missed: all directories are watched only now, events were lost, or there are
        /// more directories than the system watches (then every ten minutes).
        std::function<void()> changes_missed;
    };

    struct Limits {
        /// As many directories are watched, and no more than the system allows.
        std::size_t directories = std::numeric_limits<std::size_t>::max();
        /// How often changes may have been missed while not all directories are watched.
        std::chrono::milliseconds interval = std::chrono::minutes(10);
    };

    ChangeWatcher(DeviceId device, Sink sink) : ChangeWatcher(device, std::move(sink), Limits()) {}
    ChangeWatcher(DeviceId device, Sink sink, const Limits& limits);
    /// Waits for the thread.
    ~ChangeWatcher();
    ChangeWatcher(const ChangeWatcher&) = delete;
    ChangeWatcher& operator=(const ChangeWatcher&) = delete;

    /// All directories were reached, watched or not.
    bool is_complete() const { return complete_.load(); }

    /// What the watch of a directory tells from now on. Any thread; the directory lies on the volume and is
    /// open. False: its watch is as it was; `all_but_attributes` is refused while not all directories are
    /// watched.
    enum class Scope { everything, all_but_attributes };
    [[nodiscard]] bool watch_directory(int directory, Scope scope);

  private:
    void run();
    void add_all();
    bool read_events();
    void watch(int directory, std::uint64_t inode);
    void watch_tree(int directory, std::uint64_t inode, int depth);
    void directory_came(std::uint64_t parent, const std::string& leaf);
    void say_limit_once();

    const DeviceId device_;
    const Sink sink_;
    const Limits limits_;
    Descriptor notifications_;
    Descriptor wake_;
    std::atomic<bool> stopping_{false};
    std::atomic<bool> complete_{false};
    std::atomic<bool> limited_{false};
    /// Watch to inode of its directory.
    std::unordered_map<int, std::uint64_t> directories_;
    std::thread thread_;
};

} // namespace host
