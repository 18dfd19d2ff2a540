#include "host/sqlite/live_queries.h"

namespace host {

std::string LiveQuery::key_of(std::uint64_t directory, const std::string& leaf) {
    return std::to_string(directory) + "/" + leaf;
}

bool LiveQuery::hand_out(const EntryRef& ref, std::uint64_t inode) {
    const std::string key = key_of(ref.directory, ref.leaf);
    MutexLock lock(mutex_);
    if (told_by_update_.contains(key))
        return false;
    members_[key] = inode;
    return true;
}

void LiveQuery::rewind() {
    MutexLock lock(mutex_);
    told_by_update_.clear();
}

void LiveQuery::entry_looked_at(std::uint64_t directory, const std::string& leaf, std::uint64_t inode,
                                bool was, bool is) {
    const std::string key = key_of(directory, leaf);
    MutexLock lock(mutex_);
    if (!listener_)
        return;
    const auto member = members_.find(key);
    const bool told = member != members_.end();
    QueryUpdate update;
    update.ref = {device_, directory, leaf};
    update.inode = inode;
    const bool replaced = told && is && member->second != inode;
    if ((told || was) && (!is || replaced)) {
        update.change = QueryUpdate::Change::left;
        if (told) {
            update.inode = member->second;
            members_.erase(member);
        }
        told_by_update_.erase(key);
        listener_(update);
    }
    if (is && (replaced || (!told && !was))) {
        update.change = QueryUpdate::Change::entered;
        update.inode = inode;
        members_[key] = inode;
        told_by_update_.insert(key);
        listener_(update);
    }
}

void LiveQuery::end() {
    MutexLock lock(mutex_);
    listener_ = nullptr;
}

void LiveQueries::add(const std::shared_ptr<LiveQuery>& query) {
    MutexLock lock(mutex_);
    queries_.push_back(query);
    count_ = queries_.size();
}

std::vector<std::shared_ptr<LiveQuery>> LiveQueries::all() {
    std::vector<std::shared_ptr<LiveQuery>> result;
    MutexLock lock(mutex_);
    for (const std::weak_ptr<LiveQuery>& weak : queries_) {
        if (auto query = weak.lock())
            result.push_back(std::move(query));
    }
    std::erase_if(queries_, [](const auto& weak) { return weak.expired(); });
    count_ = queries_.size();
    return result;
}

} // namespace host
