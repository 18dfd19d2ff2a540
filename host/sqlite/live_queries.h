#pragma once

#include "host/api/index.h"
#include "host/api/thread_safety.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/entry_state.h"
#include <atomic>
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace host {

/// One query that stays live. Knows which entries its listener has been told of. Any thread.
class LiveQuery {
  public:
    LiveQuery(DeviceId device, std::shared_ptr<const Condition> condition, QueryListener listener)
        : device_(device), condition_(std::move(condition)), listener_(std::move(listener)) {}

    const Condition& condition() const { return *condition_; }

    /// The query is about to hand out this hit. False when an update has told of it already.
    bool hand_out(const EntryRef& ref, std::uint64_t inode);
    /// From now on all hits are handed out again.
    void rewind();
    /// An entry was looked at. `was` is what the index knew of it before, `is` whether it satisfies now.
    void entry_looked_at(std::uint64_t directory, const std::string& leaf, std::uint64_t inode, bool was,
                         bool is);
    /// No listener is called any more once this returns.
    void end();

  private:
    static std::string key_of(std::uint64_t directory, const std::string& leaf);

    const DeviceId device_;
    const std::shared_ptr<const Condition> condition_;
    Mutex mutex_;
    QueryListener listener_ GUARDED_BY(mutex_);
    /// Entry to inode.
    std::unordered_map<std::string, std::uint64_t> members_ GUARDED_BY(mutex_);
    std::unordered_set<std::string> told_by_update_ GUARDED_BY(mutex_);
};

/// The live queries of one volume. Any thread.
class LiveQueries {
  public:
    void add(const std::shared_ptr<LiveQuery>& query);
    bool any() const { return count_.load(std::memory_order_relaxed) != 0; }
    std::vector<std::shared_ptr<LiveQuery>> all();

  private:
    Mutex mutex_;
    std::vector<std::weak_ptr<LiveQuery>> queries_ GUARDED_BY(mutex_);
    std::atomic<std::size_t> count_{0};
};

} // namespace host
