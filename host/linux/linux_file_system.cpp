#include "host/linux/linux_file_system.h"

#include "host/api/index.h"
#include "host/linux/directory_path.h"
#include "host/linux/entry_reader.h"
#include "host/linux/file_node.h"
#include "host/linux/node_stat.h"
#include "host/linux/opening.h"
#include "host/linux/seen_entry.h"
#include "host/linux/system_calls.h"
#include <cerrno>
#include <climits>
#include <cstdio>
#include <fcntl.h>

namespace host {

namespace {

constexpr int kMostLinks = 40;

// The path in parts: "/a/b" is "/a" and "b". Without trailing slashes, except for "/" itself.
struct SplitPath {
    std::string directory;
    std::string leaf;
};

SplitPath split_path(std::string path) {
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    const std::size_t slash = path.rfind('/');
    std::string leaf = path.substr(slash + 1);
    path.resize(slash == 0 ? 1 : slash);
    return {std::move(path), std::move(leaf)};
}

Result<std::string> read_link(int directory, const char* leaf) {
    std::string target(PATH_MAX, '\0');
    const ssize_t length = system_calls().readlinkat(directory, leaf, target.data(), target.size());
    if (length < 0)
        return Status(errno);
    target.resize(static_cast<std::size_t>(length));
    return target;
}

int to_open_flags(const OpenOptions& options) {
    int flags = O_NONBLOCK | O_NOFOLLOW | O_NOCTTY | O_CLOEXEC;
    switch (options.access) {
    case Access::none:
    case Access::read:
        flags |= O_RDONLY;
        break;
    case Access::write:
        flags |= O_WRONLY;
        break;
    case Access::read_write:
        flags |= O_RDWR;
        break;
    }
    if (options.truncate == Truncate::yes)
        flags |= O_TRUNC;
    return flags;
}

// Without /proc, or where it does not tell a path of this length, the way up is climbed.
Result<std::string> path_of_directory(const Directory& directory) {
    Result<std::string> path = directory.path();
    return path.ok() ? path : path_by_climbing(directory.descriptor());
}

Result<Directory::Place> place_of_directory(const Directory& directory) {
    Result<Directory::Place> place = directory.place();
    if (place.ok())
        return place;
    const Result<std::string> path = path_by_climbing(directory.descriptor());
    struct stat above = {};
    if (!path.ok())
        return path.status();
    if (system_calls().fstatat(directory.descriptor(), "..", &above, 0) != 0)
        return Status(errno);
    return Directory::Place{*path == "/" ? "." : path->substr(path->rfind('/') + 1), above.st_dev,
                            above.st_ino};
}

bool only_looks(const OpenOptions& options) {
    return (options.access == Access::read || options.access == Access::none) &&
           options.missing == Missing::fail && options.truncate == Truncate::no;
}

} // namespace

FileSystem& file_system() {
    static LinuxFileSystem& instance = *new LinuxFileSystem;
    return instance;
}

Result<LinuxFileSystem::Handle> LinuxFileSystem::directory_of(const EntryRef& ref) {
    if (ref.leaf.empty() || ref.leaf == ".." || ref.leaf.find('/') != std::string::npos)
        return Status(EINVAL);
    if (ref.leaf.size() > NAME_MAX)
        return Status(ENAMETOOLONG);
    return cache_.find(ref.device, ref.directory);
}

DeviceId LinuxFileSystem::device_of_node(const Directory& directory, dev_t device, ino_t inode,
                                         unsigned mode) {
    if (!S_ISDIR(mode) || (device == directory.file_system_device() && inode == directory.inode()))
        return directory.device();
    if (const Volume* rooted = volumes_.current()->rooted_at(device, inode))
        return rooted->info.id;
    return device == directory.file_system_device() ? directory.device() : DeviceId{device};
}

Result<std::unique_ptr<Node>> LinuxFileSystem::open(const EntryRef& ref, const OpenOptions& options) {
    if (options.follow == Follow::yes) {
        const Result<EntryRef> resolved = resolve(ref);
        if (!resolved.ok())
            return resolved.status();
        OpenOptions unfollowed = options;
        unfollowed.follow = Follow::no;
        return open(*resolved, unfollowed);
    }
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    if (only_looks(options) && was_seen_as_file(ref)) {
        Result<Descriptor> seen = open_file_for_reading((*directory)->descriptor(), ref.leaf.c_str());
        if (seen.ok()) {
            auto node =
                std::make_unique<FileNode>(*std::move(seen), (*directory)->device(), ref, NodeKind::file);
            node->expect_questions();
            node->believe(attributes_of_seen_file());
            return std::unique_ptr<Node>(std::move(node));
        }
    }
    struct stat status = {};
    Result<Descriptor> descriptor = open_descriptor(**directory, ref, options, status);
    if (!descriptor.ok())
        return descriptor.status();
    const DeviceId device = device_of_node(**directory, status.st_dev, status.st_ino, status.st_mode);
    const auto kind = status.st_mode != 0 ? std::optional(to_node_kind(status.st_mode)) : std::nullopt;
    return std::unique_ptr<Node>(std::make_unique<FileNode>(*std::move(descriptor), device, ref, kind));
}

Result<Descriptor> LinuxFileSystem::open_descriptor(const Directory& directory, const EntryRef& ref,
                                                    const OpenOptions& options, struct stat& status) {
    if (!only_looks(options))
        return open_for_change(directory, ref, options);
    Result<Descriptor> descriptor = open_for_reading(directory.descriptor(), ref.leaf.c_str(), &status);
    if (descriptor.ok() || descriptor.error() != EACCES || options.access != Access::none)
        return descriptor;
    const int bare =
        system_calls().openat(directory.descriptor(), ref.leaf.c_str(), O_PATH | O_NOFOLLOW | O_CLOEXEC, 0);
    if (bare < 0)
        return Status(errno);
    return Descriptor(bare);
}

Result<Descriptor> LinuxFileSystem::open_for_change(const Directory& directory, const EntryRef& ref,
                                                    const OpenOptions& options) {
    const int flags = to_open_flags(options);
    const char* leaf = ref.leaf.c_str();
    for (;;) {
        if (options.missing != Missing::create_only) {
            const int descriptor = system_calls().openat(directory.descriptor(), leaf, flags, 0);
            if (descriptor >= 0)
                return Descriptor(descriptor);
            if (errno == EINTR)
                continue;
            if (errno != ENOENT || options.missing == Missing::fail)
                return Status(errno);
        }
        // Made in a step of its own, so that it is known whether the index has to hear of a new entry.
        const int descriptor = system_calls().openat(directory.descriptor(), leaf, flags | O_CREAT | O_EXCL,
                                                     options.creation_mode & 07777);
        if (descriptor >= 0) {
            indexes().entry_changed(ref);
            return Descriptor(descriptor);
        }
        if (errno != EINTR && (errno != EEXIST || options.missing == Missing::create_only))
            return Status(errno);
    }
}

Result<EntryRef> LinuxFileSystem::resolve(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    struct stat status = {};
    const bool is_link = system_calls().fstatat((*directory)->descriptor(), ref.leaf.c_str(), &status,
                                                AT_SYMLINK_NOFOLLOW) == 0 &&
                         S_ISLNK(status.st_mode);
    if (!is_link)
        return ref;
    const Result<std::string> path = path_of(ref);
    if (!path.ok())
        return path.status();
    return entry_of(*path, Follow::yes);
}

Result<EntryRef> LinuxFileSystem::entry_of(const std::string& path, Follow follow) {
    if (path.empty() || path[0] != '/' || path.find('\0') != std::string::npos)
        return Status(EINVAL);
    std::string remaining = path;
    for (int links = 0; links <= kMostLinks; ++links) {
        const SplitPath parts = split_path(remaining);
        if (parts.leaf == "." || parts.leaf == "..") {
            const Result<Handle> directory = cache_.open_path(remaining.c_str());
            if (!directory.ok())
                return directory.status();
            return entry_of_directory((*directory)->id());
        }
        if (parts.leaf.size() > NAME_MAX)
            return Status(ENAMETOOLONG);
        const Result<Handle> directory = cache_.open_path(parts.directory.c_str());
        if (!directory.ok())
            return directory.status();
        const Directory& base = **directory;
        EntryRef ref{base.device(), base.inode(), parts.leaf.empty() ? "." : parts.leaf};
        struct stat status = {};
        if (follow == Follow::no ||
            system_calls().fstatat(base.descriptor(), ref.leaf.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0 ||
            !S_ISLNK(status.st_mode))
            return ref;
        const Result<std::string> target = read_link(base.descriptor(), ref.leaf.c_str());
        if (!target.ok())
            return target.status();
        if (target->empty())
            return Status(ENOENT);
        remaining = target->front() == '/' ? *target : parts.directory + "/" + *target;
    }
    return Status(ELOOP);
}

Result<std::string> LinuxFileSystem::path_of(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    Result<std::string> path = path_of_directory(**directory);
    if (!path.ok() || ref.leaf == ".")
        return path;
    return (*path == "/" ? *path : *path + "/") + ref.leaf;
}

Result<EntryRef> LinuxFileSystem::entry_of_directory(const NodeId& id) {
    const Result<Handle> found = cache_.find(id.device, id.inode);
    if (!found.ok())
        return found.status();
    const Directory& directory = **found;
    Result<Directory::Place> place = place_of_directory(directory);
    if (!place.ok())
        return place.status();
    if (place->leaf == ".")
        return EntryRef{id.device, id.inode, std::move(place->leaf)};
    if (place->parent_device == directory.file_system_device() &&
        volumes_.current()->rooted_at(directory.file_system_device(), directory.inode()) == nullptr)
        return EntryRef{id.device, place->parent_inode, std::move(place->leaf)};
    // The way up leads out of the volume.
    Result<Descriptor> parent = open_directory(directory.descriptor(), "..");
    if (!parent.ok())
        return parent.status();
    struct stat status = {};
    if (system_calls().fstat(parent->get(), &status) != 0)
        return Status(errno);
    const DeviceId device = volumes_.device_of_directory(parent->get(), status);
    return EntryRef{device, cache_.adopt(*std::move(parent), device, status)->inode(),
                    std::move(place->leaf)};
}

Status LinuxFileSystem::check_directory(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    return directory.ok() ? (*directory)->check_exists(ref.leaf.c_str()) : directory.status();
}

Result<NodeId> LinuxFileSystem::root_of(DeviceId volume) {
    const Result<Descriptor> root = volumes_.open_root(volume);
    struct stat status = {};
    if (!root.ok())
        return root.status();
    if (system_calls().fstat(root->get(), &status) != 0)
        return Status(errno);
    return NodeId{volume, status.st_ino};
}

Result<NodeStat> LinuxFileSystem::stat(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    struct statx status = {};
    if (system_calls().statx((*directory)->descriptor(), ref.leaf.c_str(),
                             AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT, kNodeStatMask, &status) != 0)
        return Status(errno);
    return to_node_stat(status,
                        device_of_node(**directory, to_device(status), status.stx_ino, status.stx_mode));
}

Result<std::unique_ptr<DirectoryReader>> LinuxFileSystem::read_directory(const NodeId& id) {
    const Result<Handle> directory = cache_.find(id.device, id.inode);
    if (!directory.ok())
        return directory.status();
    Result<Descriptor> listing = reopen_directory((*directory)->descriptor());
    if (!listing.ok())
        return listing.status();
    return std::unique_ptr<DirectoryReader>(std::make_unique<EntryReader>(*std::move(listing)));
}

Status LinuxFileSystem::make_directory(const EntryRef& ref, std::uint32_t mode) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    if (system_calls().mkdirat((*directory)->descriptor(), ref.leaf.c_str(), mode & 07777) != 0)
        return errno;
    indexes().entry_changed(ref);
    return {};
}

Status LinuxFileSystem::make_symbolic_link(const EntryRef& ref, const std::string& target) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    if (system_calls().symlinkat(target.c_str(), (*directory)->descriptor(), ref.leaf.c_str()) != 0)
        return errno;
    indexes().entry_changed(ref);
    return {};
}

Result<std::string> LinuxFileSystem::read_symbolic_link(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    return read_link((*directory)->descriptor(), ref.leaf.c_str());
}

Status LinuxFileSystem::check_movable(const Directory& directory, const std::string& leaf) {
    struct stat status = {};
    if (system_calls().fstatat(directory.descriptor(), leaf.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0)
        return errno;
    const bool is_root =
        S_ISDIR(status.st_mode) && volumes_.current()->rooted_at(status.st_dev, status.st_ino) != nullptr;
    return is_root ? EBUSY : 0;
}

Status LinuxFileSystem::rename(const EntryRef& from, const EntryRef& to, Replace replace) {
    // A declared volume is a border like a mount point, though the file system would move across it.
    if (from.device != to.device)
        return EXDEV;
    const Result<Handle> old_directory = directory_of(from);
    if (!old_directory.ok())
        return old_directory.status();
    const Result<Handle> new_directory = directory_of(to);
    if (!new_directory.ok())
        return new_directory.status();
    if (const Status movable = check_movable(**old_directory, from.leaf); !movable.ok())
        return movable;

    const int old_base = (*old_directory)->descriptor();
    const int new_base = (*new_directory)->descriptor();
    const unsigned flags = replace == Replace::no ? RENAME_NOREPLACE : 0;
    int result = system_calls().renameat2(old_base, from.leaf.c_str(), new_base, to.leaf.c_str(), flags);
    if (result != 0 && errno == EINVAL && flags != 0) {
        // A file system that cannot refuse by itself; a directory moved into itself fails again with EINVAL.
        struct stat status = {};
        if (system_calls().fstatat(new_base, to.leaf.c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0)
            return EEXIST;
        result = system_calls().renameat2(old_base, from.leaf.c_str(), new_base, to.leaf.c_str(), 0);
    }
    if (result != 0)
        return errno;
    indexes().entry_changed(from);
    indexes().entry_changed(to);
    return {};
}

Status LinuxFileSystem::remove(const EntryRef& ref) {
    const Result<Handle> directory = directory_of(ref);
    if (!directory.ok())
        return directory.status();
    if (const Status movable = check_movable(**directory, ref.leaf); !movable.ok())
        return movable;
    const int base = (*directory)->descriptor();
    if (system_calls().unlinkat(base, ref.leaf.c_str(), 0) != 0) {
        if (errno != EISDIR || system_calls().unlinkat(base, ref.leaf.c_str(), AT_REMOVEDIR) != 0)
            return errno;
    }
    indexes().entry_changed(ref);
    return {};
}

} // namespace host
