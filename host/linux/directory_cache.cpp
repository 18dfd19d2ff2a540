#include "host/linux/directory_cache.h"

#include "host/api/directories.h"
#include "host/linux/attribute_store.h"
#include "host/linux/directory_stream.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include <algorithm>
#include <cerrno>
#include <chrono>
#include <deque>
#include <dirent.h>
#include <fcntl.h>

namespace host {

namespace {

constexpr std::int64_t kSecond = 1'000'000'000;
constexpr std::int64_t kIdleLimit = 2 * kSecond;
constexpr std::int64_t kMissingLasts = 2 * kSecond;
constexpr int kDeepestHint = 128;

std::int64_t steady_now() {
    return std::chrono::steady_clock::now().time_since_epoch() / std::chrono::nanoseconds(1);
}

dev_t device_of_path(const std::string& path) {
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 ? status.st_dev : 0;
}

// The file systems of "/" and of home are never unmounted while a program runs.
bool stays_mounted(dev_t device) {
    static const dev_t root = device_of_path("/");
    static const dev_t home = device_of_path(home_directory());
    return device == root || device == home;
}

} // namespace

std::size_t DirectoryCache::KeyHash::operator()(const Key& key) const noexcept {
    std::uint64_t mixed = key.inode * 0x9e3779b97f4a7c15u ^ key.device;
    mixed ^= mixed >> 32;
    return mixed * 0xbf58476d1ce4e5b9u;
}

DirectoryCache& DirectoryCache::instance() {
    // Never destroyed: threads that end late still use it.
    static DirectoryCache& cache = *new DirectoryCache;
    return cache;
}

DirectoryCache::DirectoryCache(std::size_t open_limit, std::size_t hint_limit)
    : open_limit_(std::max<std::size_t>(open_limit, 1)), hint_limit_(std::max<std::size_t>(hint_limit, 2)) {}

DirectoryCache::~DirectoryCache() {
    MutexLock lock(mutex_);
    ending_ = true;
    wake_.notify_all();
    std::thread janitor = std::move(janitor_);
    lock.unlock();
    if (janitor.joinable())
        janitor.join();
}

Result<DirectoryCache::Handle> DirectoryCache::find(DeviceId device, std::uint64_t inode, Search search) {
    const Key key{device, inode};
    if (Handle open = find_open(key))
        return open;
    Result<Handle> found = find_by_hint(key, 0);
    if (found.ok() || found.error() != ENOENT || search == Search::hints_only)
        return found;

    MutexLock searching(search_mutex_);
    if (Handle open = find_open(key))
        return open;
    {
        MutexLock lock(mutex_);
        const auto missing = missing_.find(key);
        if (missing != missing_.end() && steady_now() < missing->second)
            return Status(ENOENT);
    }
    found = find_in_hinted_parent(key);
    if (!found.ok())
        found = search_volume(key);
    if (found.ok() || found.error() != ENOENT)
        return found;
    MutexLock lock(mutex_);
    if (missing_.size() > 4096)
        missing_.clear();
    missing_[key] = steady_now() + kMissingLasts;
    return found;
}

DirectoryCache::Handle DirectoryCache::find_open(const Key& key) {
    MutexLock lock(mutex_);
    const auto found = open_.find(key);
    if (found == open_.end())
        return nullptr;
    recent_.splice(recent_.begin(), recent_, found->second);
    Slot& slot = recent_.front();
    if (slot.closes_when_idle)
        slot.last_use = steady_now();
    return slot.directory;
}

Result<DirectoryCache::Handle> DirectoryCache::find_root(const Key& key) {
    const auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(key.device);
    if (volume == nullptr && volumes->find_unlisted(key.device) == nullptr)
        return Status(ENODEV);
    if (volume != nullptr && volume->info.root_inode != key.inode)
        return Status(ENOENT);
    Result<Descriptor> root = VolumeTable::instance().open_root(key.device);
    if (!root.ok())
        return root.status();
    struct stat status = {};
    if (system_calls().fstat(root->get(), &status) != 0)
        return Status(errno);
    if (status.st_ino != key.inode)
        return Status(ENOENT);
    return adopt(*std::move(root), key.device, status);
}

Result<DirectoryCache::Handle> DirectoryCache::find_by_hint(const Key& key, int depth) {
    Result<Handle> root = find_root(key);
    if (root.ok() || root.error() != ENOENT)
        return root;
    Hint hint;
    {
        MutexLock lock(mutex_);
        const Hint* const found = find_hint(key);
        if (found == nullptr)
            return Status(ENOENT);
        hint = *found;
    }
    // Wrong hints may form a ring.
    if (depth >= kDeepestHint)
        return Status(ENOENT);
    const Key parent_key{key.device, hint.parent};
    Handle parent = find_open(parent_key);
    if (!parent) {
        Result<Handle> found = find_by_hint(parent_key, depth + 1);
        if (!found.ok())
            return found;
        parent = *found;
    }
    return open_wanted(key, parent->descriptor(), hint.leaf.c_str(), *VolumeTable::instance().current());
}

Result<DirectoryCache::Handle> DirectoryCache::find_in_hinted_parent(const Key& key) {
    std::uint64_t parent_inode = 0;
    {
        MutexLock lock(mutex_);
        const Hint* const hint = find_hint(key);
        if (hint == nullptr)
            return Status(ENOENT);
        parent_inode = hint->parent;
    }
    const Key parent_key{key.device, parent_inode};
    Handle parent = find_open(parent_key);
    if (!parent) {
        Result<Handle> found = find_by_hint(parent_key, 0);
        if (!found.ok())
            return found;
        parent = *found;
    }
    const Result<Descriptor> listing = reopen_directory(parent->descriptor());
    if (!listing.ok())
        return listing.status();
    const auto volumes = VolumeTable::instance().current();
    DirectoryStream stream(listing->get());
    for (DirectoryStream::Entry entry; stream.next(entry);) {
        if (entry.inode != key.inode || (entry.type != DT_DIR && entry.type != DT_UNKNOWN))
            continue;
        Result<Handle> found = open_wanted(key, listing->get(), entry.leaf.data(), *volumes);
        if (found.ok())
            return found;
    }
    return Status(ENOENT);
}

Result<DirectoryCache::Handle> DirectoryCache::search_volume(const Key& key) {
    const auto volumes = VolumeTable::instance().refresh();
    const Result<Descriptor> root = VolumeTable::instance().open_root(key.device);
    if (!root.ok())
        return root.status();
    const dev_t device = volumes->file_system_device(key.device);
    std::deque<std::string> waiting = {"."};
    while (!waiting.empty()) {
        const std::string path = std::move(waiting.front());
        waiting.pop_front();
        const Result<Descriptor> directory = open_directory(root->get(), path.c_str());
        struct stat status = {};
        if (!directory.ok() || system_calls().fstat(directory->get(), &status) != 0)
            continue;
        if (path != "." &&
            (status.st_dev != device || volumes->is_border(key.device, status.st_dev, status.st_ino)))
            continue;
        DirectoryStream stream(directory->get());
        for (DirectoryStream::Entry entry; stream.next(entry);) {
            if ((entry.type != DT_DIR && entry.type != DT_UNKNOWN) || entry.leaf == kBlobDirectoryName)
                continue;
            remember(key.device, entry.inode, status.st_ino, std::string(entry.leaf));
            if (entry.inode == key.inode) {
                Result<Handle> found = open_wanted(key, directory->get(), entry.leaf.data(), *volumes);
                if (found.ok())
                    return found;
            }
            waiting.push_back(path == "." ? std::string(entry.leaf) : path + "/" + std::string(entry.leaf));
        }
    }
    return Status(ENOENT);
}

Result<DirectoryCache::Handle> DirectoryCache::open_wanted(const Key& key, int base, const char* path,
                                                           const VolumeSnapshot& volumes) {
    Result<Descriptor> directory = open_directory(base, path);
    if (!directory.ok())
        return Status(directory.error() == ENOTDIR ? ENOENT : directory.error());
    struct stat status = {};
    if (system_calls().fstat(directory->get(), &status) != 0)
        return Status(errno);
    if (status.st_ino != key.inode || volumes.is_border(key.device, status.st_dev, status.st_ino))
        return Status(ENOENT);
    return adopt(*std::move(directory), key.device, status);
}

DirectoryCache::Handle DirectoryCache::adopt(Descriptor descriptor, DeviceId device,
                                             const struct stat& status) {
    const Key key{device, status.st_ino};
    if (Handle open = find_open(key))
        return open;
    const bool closes_when_idle = !stays_mounted(status.st_dev);
    auto directory = std::make_shared<const Directory>(std::move(descriptor), device, status);
    std::vector<Handle> closed;
    {
        MutexLock lock(mutex_);
        const auto [place, is_new] = open_.try_emplace(key);
        if (!is_new)
            return place->second->directory;
        recent_.push_front({key, directory, closes_when_idle ? steady_now() : 0, closes_when_idle});
        place->second = recent_.begin();
        missing_.erase(key);
        while (recent_.size() > open_limit_) {
            closed.push_back(std::move(recent_.back().directory));
            open_.erase(recent_.back().key);
            recent_.pop_back();
        }
        if (closes_when_idle)
            start_janitor();
    }
    remember_closed(closed);
    return directory;
}

Result<DirectoryCache::Handle> DirectoryCache::open_child(const Directory& parent, const char* leaf) {
    Result<Descriptor> child = open_directory(parent.descriptor(), leaf);
    if (!child.ok())
        return child.status();
    struct stat status = {};
    if (system_calls().fstat(child->get(), &status) != 0)
        return Status(errno);
    VolumeTable& table = VolumeTable::instance();
    const bool crosses = table.current()->is_border(parent.device(), status.st_dev, status.st_ino);
    const DeviceId device = crosses ? table.device_of_directory(child->get(), status) : parent.device();
    return adopt(*std::move(child), device, status);
}

Result<DirectoryCache::Handle> DirectoryCache::open_path(const char* path) {
    Result<Descriptor> directory = open_directory(AT_FDCWD, path, SymbolicLink::follow);
    if (!directory.ok())
        return directory.status();
    struct stat status = {};
    if (system_calls().fstat(directory->get(), &status) != 0)
        return Status(errno);
    const DeviceId device = VolumeTable::instance().device_of_directory(directory->get(), status);
    return adopt(*std::move(directory), device, status);
}

void DirectoryCache::remember(DeviceId device, std::uint64_t inode, std::uint64_t parent, std::string leaf) {
    const Key key{device, inode};
    MutexLock lock(mutex_);
    missing_.erase(key);
    put_hint(key, {parent, std::move(leaf)});
}

const DirectoryCache::Hint* DirectoryCache::find_hint(const Key& key) {
    if (const auto young = young_hints_.find(key); young != young_hints_.end())
        return &young->second;
    const auto old = old_hints_.find(key);
    if (old == old_hints_.end())
        return nullptr;
    put_hint(key, Hint(std::move(old->second)));
    return &young_hints_.find(key)->second;
}

void DirectoryCache::put_hint(const Key& key, Hint hint) {
    if (young_hints_.size() >= hint_limit_ / 2 && !young_hints_.contains(key)) {
        old_hints_ = std::move(young_hints_);
        young_hints_.clear();
    }
    young_hints_[key] = std::move(hint);
}

void DirectoryCache::remember_closed(const std::vector<Handle>& closed) {
    for (const Handle& directory : closed) {
        const Result<Directory::Place> place = directory->place();
        if (place.ok())
            remember(directory->device(), directory->inode(), place->parent_inode, place->leaf);
    }
}

void DirectoryCache::forget(DeviceId device) {
    std::vector<Handle> closed;
    MutexLock lock(mutex_);
    for (auto slot = recent_.begin(); slot != recent_.end();) {
        const auto next = std::next(slot);
        if (slot->key.device == device) {
            closed.push_back(std::move(slot->directory));
            open_.erase(slot->key);
            recent_.erase(slot);
        }
        slot = next;
    }
    for (Hints* hints : {&young_hints_, &old_hints_})
        std::erase_if(*hints, [&](const auto& hint) { return hint.first.device == device; });
    std::erase_if(missing_, [&](const auto& missing) { return missing.first.device == device; });
    lock.unlock();
}

void DirectoryCache::clear() {
    std::list<Slot> closed;
    MutexLock lock(mutex_);
    closed.swap(recent_);
    open_.clear();
    young_hints_.clear();
    old_hints_.clear();
    missing_.clear();
    lock.unlock();
}

std::size_t DirectoryCache::open_count() const {
    MutexLock lock(mutex_);
    return recent_.size();
}

void DirectoryCache::start_janitor() {
    if (janitor_runs_ || ending_)
        return;
    janitor_runs_ = true;
    janitor_ = std::thread([this] { run_janitor(); });
}

void DirectoryCache::run_janitor() {
    MutexLock lock(mutex_);
    for (;;) {
        wake_.wait_for(lock, std::chrono::nanoseconds(kIdleLimit / 2));
        std::vector<Handle> closed;
        bool more = false;
        const std::int64_t oldest = steady_now() - kIdleLimit;
        for (auto slot = recent_.begin(); slot != recent_.end() && !ending_;) {
            const auto next = std::next(slot);
            if (slot->closes_when_idle && slot->last_use < oldest) {
                closed.push_back(std::move(slot->directory));
                open_.erase(slot->key);
                recent_.erase(slot);
            } else {
                more |= slot->closes_when_idle;
            }
            slot = next;
        }
        if (ending_ || (!more && closed.empty())) {
            janitor_runs_ = false;
            // Nobody joins it then, unless the cache is ending and waits.
            if (janitor_.joinable())
                janitor_.detach();
            return;
        }
        lock.unlock();
        remember_closed(closed);
        closed.clear();
        lock.lock();
    }
}

} // namespace host
