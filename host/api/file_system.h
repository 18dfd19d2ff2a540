#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace host {

struct AttributeInfo {
    std::uint32_t type = 0; ///< four-character code
    std::int64_t size = 0;  ///< bytes of data, without the code
};

enum class Access { none, read, write, read_write };
enum class Missing { fail, create, create_only };
enum class Truncate { no, yes };
enum class Follow { no, yes };

struct OpenOptions {
    Access access = Access::read;
    Missing missing = Missing::fail;
    Truncate truncate = Truncate::no;
    Follow follow = Follow::no;
    std::uint32_t creation_mode = 0644;
};

/// An open node: file, directory or (never followed) symbolic link. Closed when destroyed. One thread at a
/// time.
///
/// Attributes: see docs/attributes.md. Reading never needs write access and never looks at file content.
/// Every change of an attribute is told to the volume's index after it is on the file. A change by this
/// process is read at once, one by another program at most a tenth of a millisecond late.
class Node {
  public:
    virtual ~Node() = default;

    virtual Result<NodeStat> stat() = 0;
    /// As stat() says it, mostly without asking the system.
    virtual Result<NodeKind> kind() = 0;
    virtual Result<std::size_t> read_at(std::int64_t position, void* buffer, std::size_t size) = 0;
    virtual Result<std::size_t> write_at(std::int64_t position, const void* data, std::size_t size) = 0;
    virtual Status set_size(std::int64_t size) = 0;
    virtual Status set_mode(std::uint32_t permissions) = 0;
    virtual Status set_owner(std::uint32_t user, std::uint32_t group) = 0;
    /// Nanoseconds since 1970; a negative value leaves that time alone.
    virtual Status set_times(std::int64_t access_time, std::int64_t modification_time) = 0;
    virtual Status sync() = 0;
    /// Advisory lock against other openers that lock too; EWOULDBLOCK when held elsewhere.
    virtual Status lock() = 0;
    virtual Status unlock() = 0;

    /// Names of the attributes in the file system's order, spilled ones included. Cheap: one system call.
    virtual Result<std::vector<std::string>> attribute_names() = 0;
    /// ENOENT when there is no such attribute, or its spilled bytes are missing or damaged.
    virtual Result<AttributeInfo> attribute_info(const std::string& name) = 0;
    /// Copies at most `size` bytes from `offset` of the value, whatever its type. The count copied; 0 at or
    /// past the end.
    virtual Result<std::size_t> read_attribute(const char* name, std::int64_t offset, void* buffer,
                                               std::size_t size) = 0;
    /// Replaces the value from `offset` on and cuts it there: offset 0 replaces the whole value. An offset
    /// past the end fills the gap with zero bytes. ENOSPC, EROFS, ENOTSUP, EACCES as the file system says;
    /// the old value then stands.
    virtual Status write_attribute(const char* name, std::uint32_t type, std::int64_t offset,
                                   const void* data, std::size_t size) = 0;
    virtual Status remove_attribute(const char* name) = 0;
    virtual Status rename_attribute(const std::string& from, const std::string& to) = 0;
};

/// Reads the entries of one directory, "." and ".." left out, roots of other volumes included. One thread at
/// a time.
class DirectoryReader {
  public:
    struct Entry {
        std::string leaf;
        std::uint64_t inode = 0;
        NodeKind kind = NodeKind::other; ///< from the directory itself where it says, else looked up
    };

    virtual ~DirectoryReader() = default;
    /// ENOENT at the end.
    virtual Status next(Entry& entry) = 0;
    virtual Status rewind() = 0;
};

/// The directory tree, by entry references. All calls from any thread. ENOENT: the entry, or the directory
/// that the reference names, is gone. A reference whose directory was renamed or moved still finds it.
class FileSystem {
  public:
    virtual ~FileSystem() = default;

    virtual Result<std::unique_ptr<Node>> open(const EntryRef& ref, const OpenOptions& options) = 0;

    /// The entry that an absolute path names; the leaf itself need not exist, its directory must. With
    /// `Follow::yes` a symbolic link at the end is resolved to what it names (ELOOP after 40).
    virtual Result<EntryRef> entry_of(const std::string& path, Follow follow) = 0;
    /// Absolute path of an entry as it stands now.
    virtual Result<std::string> path_of(const EntryRef& ref) = 0;
    /// The entry by which a directory is known in its parent. For a volume's root: its entry in the directory
    /// above, or leaf "." in itself for "/".
    virtual Result<EntryRef> entry_of_directory(const NodeId& directory) = 0;
    /// Whether the directory of the reference is there; the leaf need not be.
    virtual Status check_directory(const EntryRef& ref) = 0;
    virtual Result<NodeId> root_of(DeviceId volume) = 0;

    virtual Result<NodeStat> stat(const EntryRef& ref) = 0;
    virtual Result<std::unique_ptr<DirectoryReader>> read_directory(const NodeId& directory) = 0;

    virtual Status make_directory(const EntryRef& ref, std::uint32_t mode) = 0;
    virtual Status make_symbolic_link(const EntryRef& ref, const std::string& target) = 0;
    virtual Result<std::string> read_symbolic_link(const EntryRef& ref) = 0;
    /// Both on one volume's file system, else EXDEV. EEXIST when the goal exists and `replace` is not asked
    /// for.
    enum class Replace { no, yes };
    virtual Status rename(const EntryRef& from, const EntryRef& to, Replace replace) = 0;
    /// Files and links are unlinked; directories must be empty (ENOTEMPTY).
    virtual Status remove(const EntryRef& ref) = 0;
};

FileSystem& file_system();

} // namespace host
