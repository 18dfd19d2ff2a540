#pragma once

#include "host/api/file_system.h"
#include "host/api/index.h"
#include "host/linux/attribute_snapshot.h"
#include "host/linux/attribute_store.h"
#include "host/linux/descriptor.h"
#include "host/linux/seen_entry.h"
#include <optional>

namespace host {

/// A node of a mounted file system, by its open descriptor. Bare references (O_PATH: symbolic links, devices,
/// files that may not be read) can be looked at, but have no attributes and no content.
class FileNode final : public Node {
  public:
    /// `device` is the node's own volume, `ref` the entry by which it was opened, `kind` what it was found to
    /// be where that is known.
    FileNode(Descriptor descriptor, DeviceId device, const EntryRef& ref, std::optional<NodeKind> kind)
        : descriptor_(std::move(descriptor)), device_(device), ref_(ref), kind_(kind), recent_(device) {}
    /// Tells the index when the content has been changed.
    ~FileNode() override;

    /// Several attributes are going to be asked for, so they are listed before the first is read.
    void expect_questions() { recent_.note_miss(); }
    /// Believes what is known of the attributes where the open file is the one it is known of and has not
    /// been changed since. Does nothing otherwise.
    void believe(const KnownAttributes& attributes);

    Result<NodeStat> stat() override;
    Result<NodeKind> kind() override;
    Result<std::size_t> read_at(std::int64_t position, void* buffer, std::size_t size) override;
    Result<std::size_t> write_at(std::int64_t position, const void* data, std::size_t size) override;
    Status set_size(std::int64_t size) override;
    Status set_mode(std::uint32_t permissions) override;
    Status set_owner(std::uint32_t user, std::uint32_t group) override;
    Status set_times(std::int64_t access_time, std::int64_t modification_time) override;
    Status sync() override;
    Status lock() override;
    Status unlock() override;

    Result<std::vector<std::string>> attribute_names() override;
    Result<AttributeInfo> attribute_info(const std::string& name) override;
    Result<std::size_t> read_attribute(const char* name, std::int64_t offset, void* buffer,
                                       std::size_t size) override;
    Status write_attribute(const char* name, std::uint32_t type, std::int64_t offset, const void* data,
                           std::size_t size) override;
    Status remove_attribute(const char* name) override;
    Status rename_attribute(const std::string& from, const std::string& to) override;

  private:
    AttributeFile file() { return {descriptor_.get(), device_, &recent_}; }
    Status report(Status outcome);

    const Descriptor descriptor_;
    const DeviceId device_;
    const EntryRef ref_;
    std::optional<NodeKind> kind_;
    AttributeSnapshot recent_;
    ChangeTicket ticket_;
    bool content_changed_ = false;
};

} // namespace host
