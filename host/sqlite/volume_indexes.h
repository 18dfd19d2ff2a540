#pragma once

#include "host/api/index.h"
#include "host/api/thread_safety.h"
#include "host/sqlite/mount_follower.h"
#include "host/sqlite/volume_index.h"
#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <vector>

namespace host {

/// The indexes of all volumes. Any thread.
class VolumeIndexes final : public Indexes {
  public:
    ~VolumeIndexes() override;

    Status create(DeviceId volume, const std::string& attribute, std::uint32_t type) override;
    Status remove(DeviceId volume, const std::string& attribute) override;
    Result<std::vector<IndexInfo>> list(DeviceId volume) override;
    Result<std::unique_ptr<RunningQuery>> query(DeviceId volume, std::shared_ptr<const Predicate> predicate,
                                                QueryListener listener) override;
    ChangeTicket attributes_changed(const EntryRef& ref) override;
    void entry_changed(const EntryRef& ref) override;
    void follow_changes() override;
    Status reconcile(DeviceId volume, Depth depth, const std::atomic<bool>* cancelled) override;
    Status rebuild(DeviceId volume, const std::function<bool(std::uint64_t)>& progress) override;
    Status flush(DeviceId volume) override;
    void shut_down() override;

    /// Null when there is no such volume, or it cannot have an index.
    std::shared_ptr<VolumeIndex> of(DeviceId volume);

  private:
    /// Takes out the indexes of volumes that have gone, or whose number is another volume's by now.
    std::vector<std::shared_ptr<VolumeIndex>> take_replaced_locked() REQUIRES(mutex_);
    void volume_came(DeviceId volume);
    void volume_went(DeviceId volume);

    std::atomic<bool> following_{false};
    Mutex mutex_;
    std::map<DeviceId, std::shared_ptr<VolumeIndex>> indexes_ GUARDED_BY(mutex_);
    /// VolumeTable::generation() that indexes_ was compared with last.
    std::uint64_t generation_ GUARDED_BY(mutex_) = 0;
    std::unique_ptr<MountFollower> mounts_ GUARDED_BY(mutex_);
};

} // namespace host
