#pragma once

#include "host/linux/directory_cache.h"
#include "host/sqlite/index_store.h"

namespace host {

/// Opens a directory of which the index holds rows: by the hints of the DirectoryCache; where they do not
/// suffice by what `store` knows of it and of the directories above it; at last by a search of the whole
/// volume. Fails as DirectoryCache::find() does. For the thread that `store` belongs to.
///
/// A search in vain has remembered every directory that there is: `searched_in_vain` is set by it, and spares
/// the searches for all others that are gone, as long as the caller keeps it, through one query or one group
/// of notes.
Result<DirectoryCache::Handle> find_known_directory(IndexStore& store, DeviceId device, std::uint64_t inode,
                                                    bool& searched_in_vain);

/// Opens the directory above, on the same volume, into the cache. ENOENT for the volume's root, and where
/// there is no such one.
Result<DirectoryCache::Handle> open_parent(const Directory& child);

} // namespace host
