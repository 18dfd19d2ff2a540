#include "host/sqlite/known_directory.h"

namespace host {

Result<DirectoryCache::Handle> find_known_directory(IndexStore& store, DeviceId device, std::uint64_t inode) {
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
    return found ? found : cache.find(device, inode, DirectoryCache::Search::whole_volume);
}

} // namespace host
