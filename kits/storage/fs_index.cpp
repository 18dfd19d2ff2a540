#include <fs_index.h>

#include <HostConversions.h>

#include "host/api/index.h"

#include <CopyText.h>

#include <errno.h>
#include <memory>
#include <string.h>

namespace {

// What a handle of fs_open_index_dir() points to. It is a DIR by name only: no other call takes it.
struct IndexListing {
    std::vector<host::IndexInfo> indices;
    size_t next = 0;
    struct dirent record = {};
};

constexpr std::int64_t kNanosecondsPerSecond = 1'000'000'000;

int Answer(host::Status status) {
    if (status)
        return B_OK;
    errno = status.error();
    // A number that is no volume's is a wrong argument.
    return status.error() == ENODEV ? B_BAD_VALUE : StatusOf(status);
}

bool IsName(const char* name) {
    return name != nullptr && name[0] != '\0';
}

} // namespace

int fs_create_index(dev_t device, const char* name, uint32 type, uint32 flags) {
    if (!IsName(name) || flags != 0)
        return Answer(EINVAL);
    return Answer(host::indexes().create(device, name, type));
}

int fs_remove_index(dev_t device, const char* name) {
    return Answer(IsName(name) ? host::indexes().remove(device, name) : host::Status(EINVAL));
}

int fs_stat_index(dev_t device, const char* name, struct index_info* info) {
    if (!IsName(name) || info == nullptr)
        return Answer(EINVAL);
    host::Result<std::vector<host::IndexInfo>> indices = host::indexes().list(device);
    if (!indices)
        return Answer(indices.status());
    for (const host::IndexInfo& index : *indices) {
        if (index.attribute != name)
            continue;
        info->type = index.type;
        info->size = index.size;
        info->creation_time = static_cast<time_t>(index.creation_time / kNanosecondsPerSecond);
        info->modification_time = static_cast<time_t>(index.modification_time / kNanosecondsPerSecond);
        info->uid = index.user;
        info->gid = index.group;
        return B_OK;
    }
    return Answer(ENOENT);
}

DIR* fs_open_index_dir(dev_t device) {
    host::Result<std::vector<host::IndexInfo>> indices = host::indexes().list(device);
    if (!indices) {
        Answer(indices.status());
        return nullptr;
    }
    auto listing = std::make_unique<IndexListing>();
    listing->indices = *std::move(indices);
    // The caller owns it until fs_close_index_dir().
    return reinterpret_cast<DIR*>(listing.release());
}

struct dirent* fs_read_index_dir(DIR* handle) {
    auto* listing = reinterpret_cast<IndexListing*>(handle);
    if (listing == nullptr || listing->next >= listing->indices.size())
        return nullptr;
    listing->record = {};
    listing->record.d_ino = listing->next + 1;
    listing->record.d_reclen = sizeof(listing->record);
    CopyText(listing->record.d_name, listing->indices[listing->next++].attribute.c_str());
    return &listing->record;
}

int fs_close_index_dir(DIR* handle) {
    if (handle == nullptr)
        return Answer(EINVAL);
    delete reinterpret_cast<IndexListing*>(handle);
    return B_OK;
}
