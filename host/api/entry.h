#pragma once

#include <cstdint>
#include <string>

namespace host {

/// A volume's number. For a mounted file system it is the system's device number; for a declared directory it
/// is made from the device number and the inode of that directory, with the top bit set, so that every
/// process finds the same number for the same directory.
using DeviceId = std::uint64_t;

/// Where a directory entry stands: volume, inode of the directory that holds it, and its name as bytes (no
/// slash, not necessarily valid UTF-8). Survives renaming and moving of the directories above it.
struct EntryRef {
    DeviceId device = 0;
    std::uint64_t directory = 0;
    std::string leaf;

    bool operator==(const EntryRef&) const = default;
};

/// Identity of a file itself, whatever it is called.
struct NodeId {
    DeviceId device = 0;
    std::uint64_t inode = 0;

    bool operator==(const NodeId&) const = default;
};

enum class NodeKind { file, directory, symbolic_link, other };

/// Times are nanoseconds since 1970-01-01 UTC; sizes are bytes; mode holds permission bits and type as POSIX
/// has them.
struct NodeStat {
    NodeId id;
    NodeKind kind = NodeKind::other;
    std::uint32_t mode = 0;
    std::uint32_t user = 0;
    std::uint32_t group = 0;
    std::uint32_t links = 0;
    std::int64_t size = 0;
    std::int64_t blocks = 0;
    std::int64_t access_time = 0;
    std::int64_t modification_time = 0;
    /// Moves with every change of content, attributes, name count or permissions.
    std::int64_t change_time = 0;
    /// 0 where the file system does not record it.
    std::int64_t creation_time = 0;
};

} // namespace host
