#pragma once

#include "host/linux/attribute_marker.h"
#include "host/linux/attribute_name.h"
#include "host/linux/attribute_store.h"
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace host {

/// Puts whole values on a file, spilling what the file system does not hold. An extended attribute changes in
/// one system call, so a reader finds the old value or the new one. One thread.
///
/// A file system that has no room for an attribute says ENOSPC whether the file's attributes are full or the
/// disk is. So the largest value is spilled and the attribute tried again; on a full disk the blob cannot be
/// written either, and that is the error that the caller gets.
class AttributeWriter {
  public:
    explicit AttributeWriter(const AttributeFile& file) : file_(file) {}

    Status write(const AttributeName& name, std::uint32_t type, std::span<const std::byte> data);
    /// Writes bytes as another extended attribute holds them: type and data, or a marker.
    Status write_stored(const AttributeName& name, std::span<const std::byte> stored);

  private:
    struct Candidate {
        std::string extended_name;
        std::size_t size = 0;
    };

    Status set(const AttributeName& name, std::span<const std::byte> stored);
    Status set_spilled(const AttributeName& name, std::uint32_t type, std::span<const std::byte> data);
    /// Sets the attribute and, as long as there is no room, spills the largest other plain value.
    Status set_making_room(const AttributeName& name, std::span<const std::byte> stored);
    /// The largest plain value on the file other than `name` that would shrink by being spilled.
    std::optional<Candidate> largest_other(const AttributeName& name) const;
    Status spill(const Candidate& candidate);
    bool already_holds(const AttributeName& name, std::span<const std::byte> stored) const;

    const AttributeFile file_;
};

} // namespace host
