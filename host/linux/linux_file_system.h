#pragma once

#include "host/api/file_system.h"
#include "host/linux/directory_cache.h"
#include "host/linux/volume_table.h"

namespace host {

/// The directory tree of the mounted file systems. Every change is told to the index.
class LinuxFileSystem final : public FileSystem {
  public:
    Result<std::unique_ptr<Node>> open(const EntryRef& ref, const OpenOptions& options) override;

    Result<EntryRef> entry_of(const std::string& path, Follow follow) override;
    Result<std::string> path_of(const EntryRef& ref) override;
    Result<EntryRef> entry_of_directory(const NodeId& directory) override;
    Status check_directory(const EntryRef& ref) override;
    Result<NodeId> root_of(DeviceId volume) override;

    Result<NodeStat> stat(const EntryRef& ref) override;
    Result<std::unique_ptr<DirectoryReader>> read_directory(const NodeId& directory) override;

    Status make_directory(const EntryRef& ref, std::uint32_t mode) override;
    Status make_symbolic_link(const EntryRef& ref, const std::string& target) override;
    Result<std::string> read_symbolic_link(const EntryRef& ref) override;
    Status rename(const EntryRef& from, const EntryRef& to, Replace replace) override;
    Status remove(const EntryRef& ref) override;

  private:
    using Handle = DirectoryCache::Handle;

    /// The directory of a reference; EINVAL or ENAMETOOLONG for what can be no entry's name.
    Result<Handle> directory_of(const EntryRef& ref);
    /// The reference that symbolic links at the end of `ref` lead to.
    Result<EntryRef> resolve(const EntryRef& ref);
    Result<Descriptor> open_descriptor(const Directory& directory, const EntryRef& ref,
                                       const OpenOptions& options, struct stat& status);
    Result<Descriptor> open_for_change(const Directory& directory, const EntryRef& ref,
                                       const OpenOptions& options);
    /// The volume that a node in `directory` belongs to: another one when it is that one's root.
    DeviceId device_of_node(const Directory& directory, dev_t device, ino_t inode, unsigned mode);
    /// EBUSY for the root of a declared volume, as for a mount point.
    Status check_movable(const Directory& directory, const std::string& leaf);

    DirectoryCache& cache_ = DirectoryCache::instance();
    VolumeTable& volumes_ = VolumeTable::instance();
};

} // namespace host
