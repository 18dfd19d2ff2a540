#pragma once

#include "host/api/result.h"
#include "host/linux/attribute_marker.h"
#include "host/linux/attribute_store.h"
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace host {

/// The bytes of an extended attribute of ours, taken apart: either a plain value or a marker. The bytes lie
/// in this object, in the snapshot that they were asked through, or in a buffer of the calling thread that
/// the next RawAttribute of the thread reuses.
class RawAttribute {
  public:
    /// Reads it. ENOENT when there is none or it is malformed (under four bytes, or a broken marker).
    Status load(int descriptor, const char* extended_name);
    /// The same, by way of what has been read of the file just now (see AttributeSnapshot).
    Status load(const AttributeFile& file, const char* extended_name);

    bool spilled() const { return marker_.has_value(); }
    const AttributeMarker& marker() const { return *marker_; }
    std::uint32_t type() const { return spilled() ? marker_->type : load_big_endian(bytes_.data()); }
    /// Size of the value, without its type.
    std::int64_t size() const;
    /// A plain value's data, without its type.
    std::span<const std::byte> data() const { return bytes_.subspan(4); }
    /// Everything as it lies in the extended attribute.
    std::span<const std::byte> stored() const { return bytes_; }

  private:
    Status take_apart();

    // Most attributes are short texts. A larger buffer would cost the kernel a larger one of its own.
    static constexpr std::size_t kShort = 1024;
    std::byte short_[kShort];
    std::span<const std::byte> bytes_;
    std::optional<AttributeMarker> marker_;
};

/// ENOENT for what Linux calls ENODATA, else the error itself.
Status attribute_error(int error);

} // namespace host
