#include "host/linux/raw_attribute.h"

#include "host/linux/system_calls.h"
#include <cerrno>
#include <linux/limits.h>
#include <memory>

namespace host {

Status attribute_error(int error) {
    return error == ENODATA ? ENOENT : error;
}

Status RawAttribute::load(int descriptor, const char* extended_name) {
    marker_.reset();
    ssize_t size = system_calls().fgetxattr(descriptor, extended_name, short_, sizeof(short_));
    const std::byte* bytes = short_;
    if (size < 0 && errno == ERANGE) {
        static thread_local std::unique_ptr<std::byte[]> large;
        if (!large)
            large.reset(new std::byte[XATTR_SIZE_MAX]);
        size = system_calls().fgetxattr(descriptor, extended_name, large.get(), XATTR_SIZE_MAX);
        bytes = large.get();
    }
    if (size < 0)
        return attribute_error(errno);
    if (size < 4)
        return ENOENT;
    bytes_ = {bytes, static_cast<std::size_t>(size)};
    if (load_big_endian(bytes) == AttributeMarker::kReservedType) {
        marker_ = AttributeMarker::decode(bytes_);
        if (!marker_)
            return ENOENT;
    }
    return {};
}

std::int64_t RawAttribute::size() const {
    return spilled() ? static_cast<std::int64_t>(marker_->size)
                     : static_cast<std::int64_t>(bytes_.size() - 4);
}

} // namespace host
