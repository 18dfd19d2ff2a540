#include "host/sqlite/reader_pool.h"

namespace host {
namespace {

constexpr std::size_t kKept = 4;

} // namespace

std::unique_ptr<IndexStore> ReaderPool::borrow() {
    MutexLock lock(mutex_);
    if (!idle_.empty()) {
        auto reader = std::move(idle_.back());
        idle_.pop_back();
        lent_.insert(reader.get());
        return reader;
    }
    const std::uint64_t replacements = replacements_;
    lock.unlock();
    auto reader = std::make_unique<IndexStore>();
    if (!succeeded(reader->open(database_, Connection::Mode::existing)))
        return nullptr;
    lock.lock();
    // What was opened while the file was replaced may be either.
    if (replacements == replacements_)
        lent_.insert(reader.get());
    return reader;
}

void ReaderPool::give_back(std::unique_ptr<IndexStore> reader) {
    MutexLock lock(mutex_);
    if (lent_.erase(reader.get()) != 0 && idle_.size() < kKept)
        idle_.push_back(std::move(reader));
}

void ReaderPool::clear() {
    std::vector<std::unique_ptr<IndexStore>> closing;
    MutexLock lock(mutex_);
    closing.swap(idle_);
    lent_.clear();
    ++replacements_;
    lock.unlock();
}

} // namespace host
