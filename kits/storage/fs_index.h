// The attribute indices of a volume.
#pragma once

#include <SupportDefs.h>

#include <dirent.h>
#include <time.h>

struct index_info {
    uint32 type = 0; // of the attribute, see <TypeConstants.h>
    off_t size = 0;  // bytes
    time_t modification_time = 0;
    time_t creation_time = 0;
    uid_t uid = 0;
    gid_t gid = 0;
};

// All answer 0 or a negative status code and set errno as well: B_BAD_VALUE (no such volume, null or empty
// name), B_FILE_EXISTS when there is such an index already, of whatever type, B_ENTRY_NOT_FOUND when there is
// none, B_READ_ONLY_DEVICE, B_UNSUPPORTED when the volume cannot have any. `flags` is 0. Any thread.
int fs_create_index(dev_t device, const char* name, uint32 type, uint32 flags);
int fs_remove_index(dev_t device, const char* name);
int fs_stat_index(dev_t device, const char* name, struct index_info* info);

// Walks the indices that there are when the walk begins. The handle is only for the two calls below and must
// be closed; null with errno set when it cannot be opened. A record is valid until the next call on the
// handle; null at the end.
DIR* fs_open_index_dir(dev_t device);
struct dirent* fs_read_index_dir(DIR* handle);
int fs_close_index_dir(DIR* handle);
