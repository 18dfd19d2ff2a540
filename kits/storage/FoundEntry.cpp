#include <FoundEntry.h>

#include <stddef.h>
#include <string.h>

namespace {

constexpr size_t kNameOffset = offsetof(struct dirent, d_name);

// Whole records, so that each one begins where its fields may lie.
size_t RecordSize(const FoundEntry& entry) {
    constexpr size_t kAlignment = alignof(struct dirent);
    size_t size = kNameOffset + entry.ref.leaf.size() + 1;
    return (size + kAlignment - 1) / kAlignment * kAlignment;
}

} // namespace

int32 FillDirents(struct dirent* buffer, size_t length, int32 count, const EntrySource& source,
                  std::unique_ptr<FoundEntry>& pending) {
    if (buffer == nullptr || count < 0)
        return B_BAD_VALUE;
    auto* bytes = reinterpret_cast<unsigned char*>(buffer);
    size_t used = 0;
    int32 filled = 0;
    while (filled < count) {
        FoundEntry entry;
        status_t status = source(entry);
        if (status == B_ENTRY_NOT_FOUND)
            break;
        if (status != B_OK)
            return filled > 0 ? filled : status;
        size_t size = RecordSize(entry);
        if (size > length - used) {
            pending = std::make_unique<FoundEntry>(std::move(entry));
            return filled > 0 ? filled : B_BAD_VALUE;
        }
        // The record may end before the structure's fixed-size name does.
        unsigned char* record = bytes + used;
        memset(record, 0, size);
        ino_t inode = entry.inode;
        auto recordLength = static_cast<unsigned short>(size);
        memcpy(record + offsetof(struct dirent, d_ino), &inode, sizeof(inode));
        memcpy(record + offsetof(struct dirent, d_reclen), &recordLength, sizeof(recordLength));
        memcpy(record + kNameOffset, entry.ref.leaf.data(), entry.ref.leaf.size());
        used += size;
        filled++;
    }
    return filled;
}
