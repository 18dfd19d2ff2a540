#include "host/sqlite/known_directory.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include <cerrno>
#include <sys/stat.h>

namespace host {

Result<DirectoryCache::Handle> find_known_directory(IndexStore& store, DeviceId device, std::uint64_t inode,
                                                    bool& searched_in_vain) {
    DirectoryCache& cache = DirectoryCache::instance();
    Result<DirectoryCache::Handle> found = cache.find(device, inode, DirectoryCache::Search::hints_only);
    // Upwards, until one of them is found; no farther than paths are deep.
    std::uint64_t at = inode;
    for (int depth = 0; !found && depth < 128; ++depth) {
        IndexStore::KnownDirectory known;
        if (store.directory(at, known) != DatabaseResult::row)
            break;
        cache.remember(device, known.inode, known.parent, known.name);
        found = cache.find(device, inode, DirectoryCache::Search::hints_only);
        if (known.parent == at)
            break;
        at = known.parent;
    }
    if (found || found.error() != ENOENT || searched_in_vain)
        return found;
    found = cache.find(device, inode, DirectoryCache::Search::whole_volume);
    searched_in_vain = !found && found.error() == ENOENT;
    return found;
}

Result<DirectoryCache::Handle> open_parent(const Directory& child) {
    const auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(child.device());
    if (volume == nullptr || volume->info.root_inode == child.inode())
        return Status(ENOENT);
    Result<Descriptor> parent = open_directory(child.descriptor(), "..");
    if (!parent.ok())
        return parent.status();
    struct stat status = {};
    if (system_calls().fstat(parent->get(), &status) != 0)
        return Status(errno);
    if (status.st_dev != child.file_system_device())
        return Status(ENOENT);
    return DirectoryCache::instance().adopt(*std::move(parent), child.device(), status);
}

} // namespace host
