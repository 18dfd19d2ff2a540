#include "host/sqlite/volume_indexes.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/index_query.h"
#include "host/sqlite/walk_query.h"
#include <cerrno>
#include <utility>

namespace host {

VolumeIndexes::~VolumeIndexes() {
    shut_down();
}

std::vector<std::shared_ptr<VolumeIndex>> VolumeIndexes::take_replaced_locked() {
    std::vector<std::shared_ptr<VolumeIndex>> replaced;
    const std::uint64_t generation = VolumeTable::instance().generation();
    if (generation == std::exchange(generation_, generation))
        return replaced;
    const auto volumes = VolumeTable::instance().current();
    for (auto index = indexes_.begin(); index != indexes_.end();) {
        const Volume* volume = volumes->find(index->first);
        if (volume != nullptr && volume->stable_key == index->second->stable_key()) {
            ++index;
            continue;
        }
        replaced.push_back(std::move(index->second));
        index = indexes_.erase(index);
    }
    return replaced;
}

std::shared_ptr<VolumeIndex> VolumeIndexes::of(DeviceId device) {
    // Their end waits for their threads: after the lock.
    std::vector<std::shared_ptr<VolumeIndex>> replaced;
    MutexLock lock(mutex_);
    replaced = take_replaced_locked();
    const auto found = indexes_.find(device);
    if (found != indexes_.end())
        return found->second;
    auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(device);
    if (volume == nullptr) {
        volumes = VolumeTable::instance().refresh();
        volume = volumes->find(device);
    }
    if (volume == nullptr || !volume->info.knows_attributes || !IndexFiles(volume->stable_key).can_be_kept())
        return nullptr;
    return indexes_[device] = std::make_shared<VolumeIndex>(device, volume->stable_key);
}

Status VolumeIndexes::create(DeviceId device, const std::string& attribute, std::uint32_t type) {
    const Result<VolumeInfo> info = VolumeTable::instance().info(device);
    if (!info)
        return ENODEV;
    if (info->read_only)
        return EROFS;
    const auto index = of(device);
    if (!index)
        return ENOTSUP;
    const Status created = index->create(attribute, type);
    if (created.ok() && following_)
        index->follow();
    return created;
}

Status VolumeIndexes::remove(DeviceId device, const std::string& attribute) {
    const auto index = of(device);
    return index ? index->remove(attribute) : Status(ENODEV);
}

Result<std::vector<IndexInfo>> VolumeIndexes::list(DeviceId device) {
    const auto index = of(device);
    if (!index)
        return Status(VolumeTable::instance().info(device) ? ENOTSUP : ENODEV);
    constexpr std::uint32_t text = 0x43535452;    // 'CSTR'
    constexpr std::uint32_t integer = 0x4c4c4e47; // 'LLNG'
    std::vector<IndexInfo> result(3);
    result[0].attribute = "name";
    result[0].type = text;
    result[1].attribute = "size";
    result[1].type = integer;
    result[2].attribute = "last_modified";
    result[2].type = integer;
    for (IndexInfo& info : index->list())
        result.push_back(std::move(info));
    return result;
}

Result<std::unique_ptr<RunningQuery>>
VolumeIndexes::query(DeviceId device, std::shared_ptr<const Predicate> predicate, QueryListener listener) {
    if (!predicate)
        return Status(EINVAL);
    const auto condition = Condition::compile(*predicate);
    if (!condition)
        return Status(EINVAL);
    if (VolumeTable::instance().refresh()->find(device) == nullptr) {
        volume_went(device);
        return Status(ENODEV);
    }
    const auto index = of(device);
    std::shared_ptr<LiveQuery> live;
    if (listener && index) {
        // What happened before the query began is no update.
        std::vector<RowNumber> rows;
        if (condition->bound())
            (void)index->search(*condition, rows);
        else
            (void)index->flush();
        live = std::make_shared<LiveQuery>(device, condition, std::move(listener));
        index->live_queries().add(live);
    }
    if (index && condition->bound()) {
        std::vector<RowNumber> rows;
        const Status found = index->search(*condition, rows);
        if (found.ok())
            return std::unique_ptr<RunningQuery>(
                std::make_unique<IndexQuery>(index, condition, live, std::move(rows)));
        if (found.error() != ENOTSUP)
            return found;
    }
    auto walker = TreeWalker::open(device);
    if (!walker)
        return walker.status();
    return std::unique_ptr<RunningQuery>(
        std::make_unique<WalkQuery>(device, condition, live, index, std::move(*walker)));
}

ChangeTicket VolumeIndexes::attributes_changed(const EntryRef& ref) {
    const auto index = of(ref.device);
    return index ? index->attributes_changed(ref) : ChangeTicket();
}

void VolumeIndexes::entry_changed(const EntryRef& ref) {
    if (const auto index = of(ref.device))
        index->entry_changed(ref);
}

void VolumeIndexes::follow_changes() {
    {
        MutexLock lock(mutex_);
        if (following_.exchange(true))
            return;
        mounts_ = std::make_unique<MountFollower>([this](Volumes::Change change, DeviceId device) {
            change == Volumes::Change::mounted ? volume_came(device) : volume_went(device);
        });
    }
    for (const DeviceId device : VolumeTable::instance().list())
        volume_came(device);
}

void VolumeIndexes::volume_came(DeviceId device) {
    if (const auto index = of(device); index && index->in_use())
        index->follow();
}

void VolumeIndexes::volume_went(DeviceId device) {
    std::shared_ptr<VolumeIndex> gone;
    MutexLock lock(mutex_);
    if (const auto found = indexes_.find(device); found != indexes_.end()) {
        gone = std::move(found->second);
        indexes_.erase(found);
    }
    // Its end waits for its threads.
    lock.unlock();
}

Status VolumeIndexes::reconcile(DeviceId device, Depth depth, const std::atomic<bool>* cancelled) {
    const auto index = of(device);
    return index ? index->reconcile(depth, cancelled) : Status(ENODEV);
}

Status VolumeIndexes::rebuild(DeviceId device, const std::function<bool(std::uint64_t)>& progress) {
    const auto index = of(device);
    return index ? index->rebuild(progress) : Status(ENODEV);
}

Status VolumeIndexes::flush(DeviceId device) {
    const auto index = of(device);
    return index ? index->flush() : Status();
}

void VolumeIndexes::shut_down() {
    std::map<DeviceId, std::shared_ptr<VolumeIndex>> closing;
    std::unique_ptr<MountFollower> mounts;
    MutexLock lock(mutex_);
    following_ = false;
    mounts = std::move(mounts_);
    lock.unlock();
    mounts.reset();
    lock.lock();
    closing.swap(indexes_);
    lock.unlock();
}

Indexes& indexes() {
    static VolumeIndexes all;
    return all;
}

} // namespace host
