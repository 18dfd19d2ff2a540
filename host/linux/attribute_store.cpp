#include "host/linux/attribute_store.h"

#include "host/api/thread_safety.h"
#include "host/linux/attribute_name.h"
#include "host/linux/attribute_snapshot.h"
#include "host/linux/attribute_writer.h"
#include "host/linux/blob_store.h"
#include "host/linux/raw_attribute.h"
#include "host/linux/system_calls.h"
#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <linux/limits.h>
#include <sys/stat.h>

namespace host {

namespace {

// Writing from an offset reads the old value and writes the whole new one; two threads doing so to one file
// must not lose each other's part.
Mutex& update_mutex(int descriptor) {
    static std::array<Mutex, 16> mutexes;
    struct stat status = {};
    (void)system_calls().fstat(descriptor, &status);
    return mutexes[(status.st_ino ^ status.st_dev) % mutexes.size()];
}

// The value's first `size` bytes, filled up with zero bytes.
Status read_start(const AttributeFile& file, const AttributeName& name, std::span<std::byte> start) {
    std::fill(start.begin(), start.end(), std::byte{0});
    RawAttribute raw;
    if (const Status loaded = raw.load(file.descriptor, name.text()); !loaded.ok())
        return loaded.error() == ENOENT ? Status() : loaded;
    if (!raw.spilled()) {
        std::copy_n(raw.data().begin(), std::min(start.size(), raw.data().size()), start.begin());
        return {};
    }
    Result<Descriptor> blob = blob_store::open(file.device, file.descriptor, raw.marker());
    if (!blob.ok())
        return {};
    const std::size_t count = std::min(start.size(), static_cast<std::size_t>(raw.size()));
    return read_fully(blob->get(), start.data(), count, 0);
}

// Whatever came of it: an attempt that failed may have moved other values.
class ChangeOfVolume {
  public:
    explicit ChangeOfVolume(DeviceId device) : device_(device) {}
    ~ChangeOfVolume() { AttributeSnapshot::volume_changed(device_); }
    ChangeOfVolume(const ChangeOfVolume&) = delete;
    ChangeOfVolume& operator=(const ChangeOfVolume&) = delete;

  private:
    const DeviceId device_;
};

Status list_names(int descriptor, std::vector<char>& list) {
    for (std::size_t capacity = std::max<std::size_t>(list.capacity(), 1024);; capacity = XATTR_LIST_MAX) {
        list.resize(capacity);
        const ssize_t size = system_calls().flistxattr(descriptor, list.data(), capacity);
        if (size >= 0) {
            list.resize(static_cast<std::size_t>(size));
            return {};
        }
        if (errno != ERANGE || capacity >= XATTR_LIST_MAX)
            return errno;
    }
}

} // namespace

Result<AttributeInfo> attribute_info(const AttributeFile& file, const char* name) {
    const AttributeName extended(name);
    if (extended.error() != 0)
        return Status(extended.error());
    RawAttribute raw;
    if (const Status loaded = raw.load(file, extended.text()); !loaded.ok())
        return loaded;
    if (raw.spilled()) {
        const Result<Descriptor> blob = blob_store::open(file.device, file.descriptor, raw.marker());
        if (!blob.ok())
            return blob.status();
    }
    return AttributeInfo{raw.type(), raw.size()};
}

Result<std::size_t> read_attribute(const AttributeFile& file, const char* name, std::int64_t offset,
                                   void* buffer, std::size_t size) {
    const AttributeName extended(name);
    if (extended.error() != 0 || offset < 0)
        return Status(extended.error() != 0 ? extended.error() : EINVAL);
    RawAttribute raw;
    if (const Status loaded = raw.load(file, extended.text()); !loaded.ok())
        return loaded;

    const std::size_t left = offset < raw.size() ? static_cast<std::size_t>(raw.size() - offset) : 0;
    const std::size_t count = std::min(size, left);
    if (raw.spilled()) {
        const Result<Descriptor> blob = blob_store::open(file.device, file.descriptor, raw.marker());
        if (!blob.ok())
            return blob.status();
        if (!read_fully(blob->get(), static_cast<std::byte*>(buffer), count, offset).ok())
            return Status(ENOENT);
    } else if (count > 0) {
        std::memcpy(buffer, raw.data().data() + offset, count);
    }
    return count;
}

Status write_attribute(const AttributeFile& file, const char* name, std::uint32_t type, std::int64_t offset,
                       const void* data, std::size_t size) {
    const ChangeOfVolume change(file.device);
    const AttributeName extended(name);
    if (extended.error() != 0 || offset < 0)
        return extended.error() != 0 ? extended.error() : EINVAL;
    constexpr auto kLargest = static_cast<std::uint64_t>(kLargestAttribute);
    if (size > kLargest || static_cast<std::uint64_t>(offset) > kLargest - size)
        return EFBIG;
    AttributeWriter writer(file);
    if (offset == 0)
        return writer.write(extended, type, {static_cast<const std::byte*>(data), size});

    MutexLock lock(update_mutex(file.descriptor));
    const auto start = static_cast<std::size_t>(offset);
    std::vector<std::byte> whole(start + size);
    if (const Status read = read_start(file, extended, {whole.data(), start}); !read.ok())
        return read;
    if (size > 0)
        std::memcpy(whole.data() + start, data, size);
    return writer.write(extended, type, whole);
}

Status remove_attribute(const AttributeFile& file, const char* name) {
    const ChangeOfVolume change(file.device);
    const AttributeName extended(name);
    if (extended.error() != 0)
        return extended.error();
    if (system_calls().fremovexattr(file.descriptor, extended.text()) != 0)
        return attribute_error(errno);
    return {};
}

Status rename_attribute(const AttributeFile& file, const char* from, const char* to) {
    const ChangeOfVolume change(file.device);
    const AttributeName old_name(from);
    const AttributeName new_name(to);
    if (old_name.error() != 0 || new_name.error() != 0)
        return old_name.error() != 0 ? old_name.error() : new_name.error();
    RawAttribute raw;
    if (const Status loaded = raw.load(file.descriptor, old_name.text()); !loaded.ok())
        return loaded;
    if (std::strcmp(from, to) == 0)
        return {};
    // The bytes must outlive what the writer reads when it makes room.
    const std::vector<std::byte> stored(raw.stored().begin(), raw.stored().end());
    AttributeWriter writer(file);
    if (const Status written = writer.write_stored(new_name, stored); !written.ok())
        return written;
    if (system_calls().fremovexattr(file.descriptor, old_name.text()) != 0)
        return attribute_error(errno);
    return {};
}

Result<std::vector<std::string>> attribute_names(const AttributeFile& file) {
    std::vector<std::string> names;
    const auto add = [&](const char*, std::string_view name) { names.emplace_back(name); };
    if (file.recent != nullptr && (file.recent->is_fresh() || file.recent->take(file.descriptor).ok())) {
        for_each_attribute(file.recent->list().data(), file.recent->list().size(), add);
        return names;
    }
    std::vector<char> list;
    if (const Status listed = list_names(file.descriptor, list); !listed.ok())
        return listed;
    for_each_attribute(list.data(), list.size(), add);
    return names;
}

} // namespace host
