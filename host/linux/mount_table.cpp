#include "host/linux/mount_table.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>
#include <fstream>
#include <iterator>
#include <linux/magic.h>
#include <optional>
#include <sys/stat.h>
#include <sys/statfs.h>
#include <sys/statvfs.h>
#include <sys/sysmacros.h>

namespace host {

namespace {

bool is_octal(char c) {
    return c >= '0' && c <= '7';
}

// Blank, tab, newline and backslash are written as three octal digits.
std::string undo_escapes(std::string_view text) {
    std::string result;
    result.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\\' && i + 3 < text.size() && is_octal(text[i + 1]) && is_octal(text[i + 2]) &&
            is_octal(text[i + 3])) {
            const int value = (text[i + 1] - '0') * 64 + (text[i + 2] - '0') * 8 + (text[i + 3] - '0');
            result += static_cast<char>(value);
            i += 3;
        } else {
            result += text[i];
        }
    }
    return result;
}

std::vector<std::string_view> split(std::string_view text, char separator) {
    std::vector<std::string_view> parts;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find(separator), text.size());
        if (end > 0)
            parts.push_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return parts;
}

bool has_option(std::string_view options, std::string_view wanted) {
    const auto parts = split(options, ',');
    return std::ranges::find(parts, wanted) != parts.end();
}

std::optional<dev_t> parse_device(std::string_view text) {
    unsigned major_number = 0;
    unsigned minor_number = 0;
    const std::size_t colon = text.find(':');
    if (colon == std::string_view::npos)
        return std::nullopt;
    const char* end = text.data() + text.size();
    const auto first = std::from_chars(text.data(), text.data() + colon, major_number);
    const auto second = std::from_chars(text.data() + colon + 1, end, minor_number);
    if (first.ec != std::errc() || second.ec != std::errc() || second.ptr != end)
        return std::nullopt;
    return makedev(major_number, minor_number);
}

// Fields: id, parent, device, root, mount point, options, any number of tags, "-", type, source, options.
std::optional<MountEntry> parse_line(std::string_view line) {
    const auto fields = split(line, ' ');
    const auto dash = std::find(fields.begin() + std::min<std::ptrdiff_t>(6, std::ssize(fields)),
                                fields.end(), std::string_view("-"));
    if (fields.size() < 9 || fields.end() - dash < 3)
        return std::nullopt;
    const std::optional<dev_t> device = parse_device(fields[2]);
    if (!device)
        return std::nullopt;
    MountEntry entry;
    entry.device = *device;
    entry.root = undo_escapes(fields[3]);
    entry.mount_point = undo_escapes(fields[4]);
    entry.file_system = undo_escapes(dash[1]);
    entry.source = undo_escapes(dash[2]);
    const std::string_view super_options = fields.end() - dash > 3 ? dash[3] : std::string_view();
    entry.read_only = has_option(fields[5], "ro") || has_option(super_options, "ro");
    return entry;
}

std::string_view name_of_type(unsigned long magic) {
    switch (magic) {
    case EXT4_SUPER_MAGIC:
        return "ext4";
    case BTRFS_SUPER_MAGIC:
        return "btrfs";
    case XFS_SUPER_MAGIC:
        return "xfs";
    case TMPFS_MAGIC:
        return "tmpfs";
    case RAMFS_MAGIC:
        return "ramfs";
    case OVERLAYFS_SUPER_MAGIC:
        return "overlay";
    case NFS_SUPER_MAGIC:
        return "nfs";
    default:
        return "unknown";
    }
}

MountEntry make_root_entry(const std::vector<MountEntry>& others) {
    MountEntry root;
    root.root = "/";
    root.mount_point = "/";
    struct stat status = {};
    struct statfs file_system = {};
    if (::stat("/", &status) == 0)
        root.device = status.st_dev;
    if (::statfs("/", &file_system) == 0) {
        root.file_system = name_of_type(static_cast<unsigned long>(file_system.f_type));
        root.read_only = (file_system.f_flags & ST_RDONLY) != 0;
    }
    // A part of the same file system may be mounted where it is seen.
    const auto same = std::ranges::find(others, root.device, &MountEntry::device);
    if (same != others.end()) {
        root.file_system = same->file_system;
        root.source = same->source;
    }
    return root;
}

template <std::size_t size>
bool contains(const std::array<std::string_view, size>& names, std::string_view name) {
    return std::ranges::find(names, name) != names.end();
}

constexpr std::array<std::string_view, 15> kNetworkFileSystems = {
    "nfs",  "nfs4",  "cifs",       "smb3",        "smbfs",          "ceph",      "afs",       "9p",
    "coda", "ncpfs", "fuse.sshfs", "fuse.rclone", "fuse.glusterfs", "fuse.s3fs", "fuse.davfs"};

// Not on a block device of this machine, yet storage.
constexpr std::array<std::string_view, 10> kOtherStorage = {
    "virtiofs", "vboxsf",         "fuse.vmhgfs-fuse", "zfs",           "bcachefs",
    "ecryptfs", "fuse.gocryptfs", "fuse.encfs",       "fuse.mergerfs", "fuse.ntfs-3g"};

bool is_below(std::string_view path, std::string_view directory) {
    return path.starts_with(directory) && (path.size() == directory.size() || path[directory.size()] == '/');
}

} // namespace

std::vector<MountEntry> parse_mount_table(std::string_view text) {
    std::vector<MountEntry> entries;
    for (const std::string_view line : split(text, '\n')) {
        if (auto entry = parse_line(line))
            entries.push_back(std::move(*entry));
    }
    return entries;
}

std::vector<MountEntry> read_mount_table() {
    std::ifstream file("/proc/self/mountinfo", std::ios::binary);
    return mounts_with_root(std::string(std::istreambuf_iterator<char>(file), {}));
}

std::vector<MountEntry> mounts_with_root(std::string_view text) {
    std::vector<MountEntry> entries = parse_mount_table(text);
    const bool has_root = std::ranges::find(entries, "/", &MountEntry::mount_point) != entries.end();
    // First, so that of several mounts of its file system it is the one that stands for it.
    if (!has_root)
        entries.insert(entries.begin(), make_root_entry(entries));
    return entries;
}

bool is_memory_file_system(std::string_view type) {
    return type == "tmpfs" || type == "ramfs" || type == "rootfs";
}

bool is_network_file_system(std::string_view type) {
    return contains(kNetworkFileSystems, type);
}

bool is_storage(const MountEntry& entry) {
    if (entry.mount_point == "/")
        return true;
    if (entry.file_system == "squashfs" || entry.file_system == "overlay" ||
        is_below(entry.mount_point, "/snap") || is_below(entry.mount_point, "/var/lib/snapd"))
        return false;
    if (is_network_file_system(entry.file_system) || contains(kOtherStorage, entry.file_system))
        return true;
    // devtmpfs and its like have a source that is no device.
    return is_below(entry.source, "/dev") && entry.source.size() > 5 && entry.file_system != "devtmpfs";
}

std::vector<MountEntry> select_storage_mounts(const std::vector<MountEntry>& entries,
                                              dev_t (*device_of)(const MountEntry& entry)) {
    struct Choice {
        dev_t device = 0;
        MountEntry entry;
    };
    std::vector<Choice> choices;
    for (const MountEntry& entry : entries) {
        if (!is_storage(entry))
            continue;
        const dev_t device = device_of(entry);
        // Another mount at the same place hides it: only on btrfs may the two numbers differ rightly.
        if (device == 0 || (device != entry.device && entry.file_system != "btrfs"))
            continue;
        const auto same = std::ranges::find(choices, device, &Choice::device);
        if (same == choices.end())
            choices.push_back({device, entry});
        else if (entry.root.size() < same->entry.root.size())
            same->entry = entry;
    }
    std::vector<MountEntry> selected;
    for (Choice& choice : choices) {
        choice.entry.device = choice.device;
        selected.push_back(std::move(choice.entry));
    }
    return selected;
}

} // namespace host
