#include "host/linux/volume_snapshot.h"

#include <algorithm>

namespace host {

bool is_at_or_below(std::string_view path, std::string_view directory) {
    if (directory == "/")
        return path.starts_with('/');
    return path.starts_with(directory) && (path.size() == directory.size() || path[directory.size()] == '/');
}

const Volume* VolumeSnapshot::find(DeviceId id) const {
    const auto found =
        std::ranges::find_if(volumes_, [&](const Volume& volume) { return volume.info.id == id; });
    return found == volumes_.end() ? nullptr : &*found;
}

const Volume* VolumeSnapshot::rooted_at(dev_t device, ino_t inode) const {
    const auto found = std::ranges::find_if(volumes_, [&](const Volume& volume) {
        return volume.info.root_inode == inode && volume.file_system_device == device;
    });
    return found == volumes_.end() ? nullptr : &*found;
}

const UnlistedMount* VolumeSnapshot::find_unlisted(DeviceId id) const {
    const auto found = std::ranges::find(unlisted_, id, &UnlistedMount::device);
    return found == unlisted_.end() ? nullptr : &*found;
}

bool VolumeSnapshot::is_border(const Volume& volume, dev_t device, ino_t inode) const {
    if (device != volume.file_system_device)
        return true;
    const Volume* rooted = rooted_at(device, inode);
    return rooted != nullptr && rooted->info.id != volume.info.id;
}

bool VolumeSnapshot::is_border(DeviceId volume, dev_t device, ino_t inode) const {
    if (const Volume* known = find(volume))
        return is_border(*known, device, inode);
    return device != volume || rooted_at(device, inode) != nullptr;
}

const Volume* VolumeSnapshot::above(std::string_view path, dev_t device) const {
    const Volume* deepest = nullptr;
    for (const Volume& volume : volumes_) {
        if (volume.file_system_device == device && is_at_or_below(path, volume.info.root) &&
            (deepest == nullptr || volume.info.root.size() > deepest->info.root.size()))
            deepest = &volume;
    }
    return deepest;
}

bool VolumeSnapshot::has_declared(dev_t device) const {
    return std::ranges::any_of(volumes_, [&](const Volume& volume) {
        return volume.info.declared && volume.file_system_device == device;
    });
}

dev_t VolumeSnapshot::file_system_device(DeviceId id) const {
    if (const Volume* volume = find(id))
        return volume->file_system_device;
    return find_unlisted(id) != nullptr ? static_cast<dev_t>(id) : 0;
}

} // namespace host
