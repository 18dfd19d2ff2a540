#include "host/linux/volume_probe.h"

#include "host/linux/descriptor.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/index_files.h"
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <linux/fs.h>
#include <sys/ioctl.h>
#include <sys/sysmacros.h>
#include <unistd.h>

namespace host {

namespace {

std::string label_by_ioctl(int root) {
    char label[FSLABEL_MAX + 1] = {};
    if (::ioctl(root, FS_IOC_GETFSLABEL, label) != 0)
        return {};
    return label;
}

int hexadecimal_digit(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

// The links under by-label have "\x20" for a blank, and so on.
std::string undo_hexadecimal_escapes(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (i + 3 < text.size() && text[i] == '\\' && text[i + 1] == 'x') {
            const int high = hexadecimal_digit(text[i + 2]);
            const int low = hexadecimal_digit(text[i + 3]);
            if (high >= 0 && low >= 0) {
                result += static_cast<char>(high * 16 + low);
                i += 3;
                continue;
            }
        }
        result += text[i];
    }
    return result;
}

std::string label_by_links(const std::string& device_path) {
    struct stat wanted = {};
    if (device_path.empty() || ::stat(device_path.c_str(), &wanted) != 0)
        return {};
    std::error_code ignored;
    for (const auto& link : std::filesystem::directory_iterator("/dev/disk/by-label", ignored)) {
        struct stat status = {};
        if (::stat(link.path().c_str(), &status) == 0 && status.st_rdev == wanted.st_rdev)
            return undo_hexadecimal_escapes(link.path().filename().string());
    }
    return {};
}

std::string leaf_of(const std::string& path) {
    return path == "/" ? path : path.substr(path.rfind('/') + 1);
}

bool is_removable(const std::string& device_path) {
    struct stat status = {};
    if (device_path.empty() || ::stat(device_path.c_str(), &status) != 0 || !S_ISBLK(status.st_mode))
        return false;
    const std::string device = "/sys/dev/block/" + std::to_string(major(status.st_rdev)) + ":" +
                               std::to_string(minor(status.st_rdev));
    // A partition's own directory lies inside its disk's, which has the answer.
    for (const char* file : {"/removable", "/../removable"}) {
        char answer = '0';
        if (std::ifstream(device + file).get(answer))
            return answer == '1';
    }
    return false;
}

std::string make_stable_key(int root, const struct stat& status) {
    struct statfs file_system = {};
    std::uint64_t identity = 0;
    if (system_calls().fstatfs(root, &file_system) == 0)
        std::memcpy(&identity, &file_system.f_fsid, sizeof(identity));
    if (identity == 0)
        identity = status.st_dev;
    char text[40];
    std::snprintf(text, sizeof(text), "%016llx-%llx", static_cast<unsigned long long>(identity),
                  static_cast<unsigned long long>(status.st_ino));
    return text;
}

std::optional<Volume> probe(const std::string& root_path, const MountEntry& mount) {
    const Result<Descriptor> root = open_directory(AT_FDCWD, root_path.c_str());
    struct stat status = {};
    if (!root.ok() || system_calls().fstat(root->get(), &status) != 0)
        return std::nullopt;
    Volume volume;
    volume.file_system_device = status.st_dev;
    volume.stable_key = make_stable_key(root->get(), status);
    VolumeInfo& info = volume.info;
    info.id = status.st_dev;
    info.root = root_path;
    info.root_inode = status.st_ino;
    info.file_system = mount.file_system;
    if (mount.source.starts_with("/dev/"))
        info.device_path = mount.source;
    info.read_only = mount.read_only;
    info.removable = is_removable(info.device_path);
    info.persistent = !is_memory_file_system(mount.file_system);
    info.shared = is_network_file_system(mount.file_system);
    info.knows_attributes = knows_attributes(root->get());
    info.knows_queries = info.knows_attributes && IndexFiles(volume.stable_key).can_be_kept();
    info.name = label_by_ioctl(root->get());
    if (info.name.empty())
        info.name = label_by_links(info.device_path);
    if (info.name.empty())
        info.name = leaf_of(root_path);
    return volume;
}

// The mount that a path lies on: the deepest, and of several at one place the last.
MountEntry mount_above(const std::string& path, const std::vector<MountEntry>& mounts) {
    MountEntry deepest;
    for (const MountEntry& mount : mounts) {
        if (is_at_or_below(path, mount.mount_point) && mount.mount_point.size() >= deepest.mount_point.size())
            deepest = mount;
    }
    return deepest;
}

} // namespace

std::optional<Volume> probe_declared_volume(const std::string& path, const std::vector<MountEntry>& mounts) {
    char* resolved = ::realpath(path.c_str(), nullptr);
    if (resolved == nullptr)
        return std::nullopt;
    const std::string root(resolved);
    std::free(resolved);
    std::optional<Volume> volume = probe(root, mount_above(root, mounts));
    if (!volume)
        return std::nullopt;
    volume->info.id = declared_device_id(volume->file_system_device, volume->info.root_inode);
    volume->info.name = leaf_of(root);
    volume->info.declared = true;
    volume->info.persistent = true;
    return volume;
}

std::optional<Volume> probe_mounted_volume(const MountEntry& mount) {
    return probe(mount.mount_point, mount);
}

dev_t mount_point_device(const MountEntry& mount) {
    struct stat status = {};
    if (system_calls().fstatat(AT_FDCWD, mount.mount_point.c_str(), &status, AT_NO_AUTOMOUNT) != 0 ||
        !S_ISDIR(status.st_mode))
        return 0;
    return status.st_dev;
}

bool knows_attributes(int root) {
    // No attribute of ours, so that nobody sees it should the program be killed in between.
    constexpr const char* kProbe = "user.bekits.probe";
    char answer = 0;
    if (system_calls().fgetxattr(root, kProbe, &answer, 1) < 0 && errno != ENODATA && errno != ERANGE)
        return false;
    if (system_calls().fsetxattr(root, kProbe, "1", 1, 0) != 0)
        return errno == EACCES || errno == EPERM || errno == EROFS || errno == ENOSPC || errno == EDQUOT;
    const bool given_back = system_calls().fgetxattr(root, kProbe, &answer, 1) == 1
                                ? answer == '1'
                                : errno == ENODATA; // removed by another program's probe
    (void)system_calls().fremovexattr(root, kProbe);
    return given_back;
}

} // namespace host
