#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/linux/attribute_marker.h"
#include "host/linux/descriptor.h"
#include <cstddef>
#include <span>

namespace host {

/// Attribute values that were too large for their file system, each in a file named by the SHA-256 of its
/// bytes, under `.be-attributes/` at a volume's root or else under the user's data directory. A blob is never
/// changed and never deleted: several files may refer to it. Any thread, any process.
namespace blob_store {

/// Keeps the bytes, durably, where a file on `device` finds them. The disk is flushed before this returns.
/// ENOSPC, EIO ... leave nothing behind.
Result<Sha256> store(DeviceId device, std::span<const std::byte> bytes);

/// The blob's file, open for reading at any position, of the right size and with the right bytes. `referrer`
/// is a descriptor of the file that refers to it. ENOENT when it is missing or damaged.
Result<Descriptor> open(DeviceId device, int referrer, const AttributeMarker& marker);

} // namespace blob_store

/// Fills the buffer from `position`; EIO when the file ends before.
Status read_fully(int descriptor, std::byte* buffer, std::size_t size, std::int64_t position);

} // namespace host
