#include "host/linux/volume_table.h"

#include "host/api/directories.h"
#include "host/linux/declared_volumes.h"
#include "host/linux/directory_cache.h"
#include "host/linux/directory_path.h"
#include "host/linux/mount_table.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_probe.h"
#include "host/linux/volume_watcher.h"
#include "host/sqlite/index_files.h"
#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <sys/statvfs.h>

namespace host {

namespace {

struct Identity {
    dev_t device = 0;
    ino_t inode = 0;
    bool operator==(const Identity&) const = default;
};

std::string variable(const char* name) {
    const char* value = std::getenv(name);
    return value == nullptr ? std::string() : value;
}

// Ends a walk up a path: "/a/b" to "/a", "/a" to "/".
std::string parent_path(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    return slash == 0 || slash == std::string::npos ? "/" : path.substr(0, slash);
}

} // namespace

/// What the snapshot was made from.
struct VolumeTable::Sources {
    std::string volumes_variable;
    std::string config_variable;
    std::string home_variable;
    std::string data_directory;
    DeclaredVolumes declared;
    std::vector<Identity> declared_identities;
    /// The system flags this descriptor when the mounts have changed since it was last polled.
    Descriptor mounts;

    bool environment_is_current() const {
        return variable("BEKITS_VOLUMES") == volumes_variable &&
               variable("XDG_CONFIG_HOME") == config_variable && variable("HOME") == home_variable;
    }

    /// Whether anything differs from what was seen last; remembers what is seen now.
    bool look_again() {
        bool changed = !environment_is_current();
        volumes_variable = variable("BEKITS_VOLUMES");
        config_variable = variable("XDG_CONFIG_HOME");
        home_variable = variable("HOME");
        changed |= std::exchange(data_directory, host::data_directory()) != data_directory;
        if (changed)
            make_volumes_file();

        const DeclaredVolumes old_declared = std::exchange(declared, read_declared_volumes());
        const std::vector<Identity> old_identities = std::exchange(declared_identities, {});
        for (const std::string& path : declared.paths)
            declared_identities.push_back(identity_of(path));
        changed |= old_declared != declared || old_identities != declared_identities;
        const bool mounted = mounts_changed();
        mounts_moved = false;
        return mounted || changed;
    }

    /// Whether what was seen last still holds for this volume. Others are not looked at.
    bool holds_for(const Volume& volume) {
        if (!environment_is_current() || host::data_directory() != data_directory ||
            read_declared_volumes() != declared || mounts_changed())
            return false;
        const Identity wanted = {volume.file_system_device, static_cast<ino_t>(volume.info.root_inode)};
        const auto found = std::ranges::find(declared_identities, wanted);
        // What is mounted is told by the mounts.
        if (found == declared_identities.end())
            return true;
        const auto place = static_cast<std::size_t>(found - declared_identities.begin());
        return identity_of(declared.paths[place]) == wanted;
    }

  private:
    static Identity identity_of(const std::string& path) {
        struct stat status = {};
        return system_calls().fstatat(AT_FDCWD, path.c_str(), &status, 0) == 0
                   ? Identity{status.st_dev, status.st_ino}
                   : Identity{};
    }
    /// The system says it once, so it stands until everything has been looked at again.
    bool mounts_changed() {
        if (!mounts.valid()) {
            mounts = Descriptor(::open("/proc/self/mountinfo", O_RDONLY | O_CLOEXEC));
            mounts_moved |= mounts.valid();
            return mounts_moved;
        }
        struct pollfd watched = {mounts.get(), POLLPRI, 0};
        mounts_moved |= ::poll(&watched, 1, 0) > 0;
        return mounts_moved;
    }

    bool mounts_moved = false;
};

namespace {

std::vector<Volume> find_volumes(const DeclaredVolumes& declared, const std::vector<MountEntry>& mounts) {
    std::vector<Volume> volumes;
    const auto add = [&](std::optional<Volume> volume) {
        if (!volume)
            return;
        const bool known = std::ranges::any_of(volumes, [&](const Volume& other) {
            return other.file_system_device == volume->file_system_device &&
                   other.info.root_inode == volume->info.root_inode;
        });
        if (!known)
            volumes.push_back(std::move(*volume));
    };
    for (const std::string& path : declared.paths)
        add(probe_declared_volume(path, mounts));
    if (!declared.exclusive) {
        for (const MountEntry& mount : select_storage_mounts(mounts, mount_point_device))
            add(probe_mounted_volume(mount));
    }
    return volumes;
}

// For each file system that is no volume a place where it is mounted, the whole of it where there is one.
std::vector<UnlistedMount> find_unlisted(const std::vector<Volume>& volumes,
                                         const std::vector<MountEntry>& mounts) {
    std::vector<UnlistedMount> unlisted;
    std::vector<MountEntry> ordered = mounts;
    std::ranges::stable_sort(ordered, {}, [](const MountEntry& mount) { return mount.root.size(); });
    for (const MountEntry& mount : ordered) {
        const dev_t device = mount.file_system == "btrfs" ? mount_point_device(mount) : mount.device;
        const bool listed = std::ranges::any_of(
            volumes, [&](const Volume& volume) { return volume.info.id == static_cast<DeviceId>(device); });
        const bool known = std::ranges::find(unlisted, device, &UnlistedMount::device) != unlisted.end();
        if (device != 0 && !listed && !known)
            unlisted.push_back({device, mount.mount_point});
    }
    return unlisted;
}

} // namespace

VolumeTable& VolumeTable::instance() {
    // Never destroyed: threads that end late still ask it.
    static VolumeTable& table = *new VolumeTable;
    return table;
}

VolumeTable::VolumeTable()
    : sources_(std::make_unique<Sources>()), snapshot_(std::make_shared<const VolumeSnapshot>()),
      watcher_(std::make_unique<VolumeWatcher>(*this)) {}

VolumeTable::~VolumeTable() = default;

std::shared_ptr<const VolumeSnapshot> VolumeTable::current() {
    MutexLock lock(mutex_);
    if (sources_->mounts.valid() && sources_->environment_is_current())
        return snapshot_;
    lock.unlock();
    return refresh();
}

std::shared_ptr<const VolumeSnapshot> VolumeTable::refresh() {
    std::shared_ptr<const VolumeSnapshot> before;
    std::shared_ptr<const VolumeSnapshot> after;
    {
        MutexLock lock(mutex_);
        before = snapshot_;
        if (sources_->look_again()) {
            const std::vector<MountEntry> mounts = read_mount_table();
            std::vector<Volume> volumes = find_volumes(sources_->declared, mounts);
            std::vector<UnlistedMount> unlisted = find_unlisted(volumes, mounts);
            snapshot_ = std::make_shared<const VolumeSnapshot>(std::move(volumes), std::move(unlisted));
            generation_.fetch_add(1, std::memory_order_release);
        }
        after = snapshot_;
    }
    if (after != before) {
        for (const Volume& volume : before->volumes()) {
            const Volume* now = after->find(volume.info.id);
            if (now == nullptr || now->stable_key != volume.stable_key)
                DirectoryCache::instance().forget(volume.info.id);
        }
    }
    return after;
}

std::vector<DeviceId> VolumeTable::list() {
    std::vector<DeviceId> ids;
    for (const Volume& volume : refresh()->volumes())
        ids.push_back(volume.info.id);
    return ids;
}

std::shared_ptr<const VolumeSnapshot> VolumeTable::refresh_for(DeviceId id) {
    {
        MutexLock lock(mutex_);
        const Volume* volume = snapshot_->find(id);
        if (volume != nullptr && sources_->holds_for(*volume))
            return snapshot_;
    }
    return refresh();
}

Result<VolumeInfo> VolumeTable::info(DeviceId id) {
    const auto snapshot = refresh_for(id);
    const Volume* volume = snapshot->find(id);
    if (volume == nullptr)
        return Status(ENODEV);
    VolumeInfo info = volume->info;
    info.knows_queries = info.knows_attributes && IndexFiles(volume->stable_key).can_be_kept();
    struct statvfs status = {};
    if (::statvfs(info.root.c_str(), &status) == 0) {
        const auto unit = static_cast<std::int64_t>(status.f_frsize);
        info.capacity = static_cast<std::int64_t>(status.f_blocks) * unit;
        info.free_bytes = static_cast<std::int64_t>(status.f_bavail) * unit;
        info.block_size = static_cast<std::int64_t>(status.f_bsize);
        info.read_only = (status.f_flag & ST_RDONLY) != 0;
    }
    return info;
}

Result<DeviceId> VolumeTable::volume_of(const std::string& path) {
    if (path.empty() || path[0] != '/')
        return Status(EINVAL);
    const auto snapshot = refresh();
    std::string existing = path;
    for (;;) {
        const Descriptor found(system_calls().openat(AT_FDCWD, existing.c_str(), O_PATH | O_CLOEXEC, 0));
        struct stat status = {};
        if (found.valid() && system_calls().fstat(found.get(), &status) == 0 && S_ISDIR(status.st_mode)) {
            const DeviceId id = device_of_directory(found.get(), status);
            if (snapshot->find(id) == nullptr)
                return Status(ENODEV);
            return id;
        }
        if (existing == "/")
            return Status(ENODEV);
        existing = parent_path(existing);
    }
}

DeviceId VolumeTable::boot_volume() {
    const auto snapshot = refresh();
    for (const Volume& volume : snapshot->volumes()) {
        if (volume.info.root == "/")
            return volume.info.id;
    }
    return snapshot->volumes().empty() ? 0 : snapshot->volumes().front().info.id;
}

std::shared_ptr<void> VolumeTable::listen(Listener listener) {
    return watcher_->listen(std::move(listener));
}

Result<Descriptor> VolumeTable::open_root(DeviceId id) {
    const auto snapshot = current();
    const Volume* volume = snapshot->find(id);
    const UnlistedMount* unlisted = volume == nullptr ? snapshot->find_unlisted(id) : nullptr;
    if (volume == nullptr && unlisted == nullptr)
        return Status(ENODEV);
    const std::string& path = volume != nullptr ? volume->info.root : unlisted->root;
    Result<Descriptor> root = open_directory(AT_FDCWD, path.c_str());
    struct stat status = {};
    if (!root.ok() || system_calls().fstat(root->get(), &status) != 0)
        return Status(root.error() == EMFILE || root.error() == ENFILE ? root.error() : ENODEV);
    const bool is_root = volume != nullptr ? status.st_dev == volume->file_system_device &&
                                                 status.st_ino == volume->info.root_inode
                                           : status.st_dev == unlisted->device;
    if (!is_root)
        return Status(ENODEV);
    return root;
}

DeviceId VolumeTable::device_of_directory(int descriptor, const struct stat& status) {
    const auto snapshot = current();
    if (const Volume* rooted = snapshot->rooted_at(status.st_dev, status.st_ino))
        return rooted->info.id;
    if (!snapshot->has_declared(status.st_dev))
        return status.st_dev;
    std::string path(4096, '\0');
    const std::string link = "/proc/self/fd/" + std::to_string(descriptor);
    const ssize_t length = system_calls().readlinkat(AT_FDCWD, link.c_str(), path.data(), path.size());
    if (length > 0) {
        path.resize(static_cast<std::size_t>(length));
    } else {
        Result<std::string> climbed = path_by_climbing(descriptor);
        if (!climbed.ok())
            return status.st_dev;
        path = *std::move(climbed);
    }
    const Volume* volume = snapshot->above(path, status.st_dev);
    return volume != nullptr ? volume->info.id : status.st_dev;
}

dev_t VolumeTable::file_system_device(DeviceId id) {
    return current()->file_system_device(id);
}

DeviceId declared_device_id(dev_t device, ino_t inode) {
    // Mixed so that neighbouring directories get numbers far apart.
    std::uint64_t mixed = inode * 0x9e3779b97f4a7c15u ^ device * 0xc2b2ae3d27d4eb4fu;
    mixed ^= mixed >> 29;
    mixed *= 0xbf58476d1ce4e5b9u;
    mixed ^= mixed >> 32;
    return mixed | std::uint64_t{1} << 63;
}

Volumes& volumes() {
    return VolumeTable::instance();
}

} // namespace host
