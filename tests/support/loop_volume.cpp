#include "support/loop_volume.h"

#include "support/temporary_environment.h"
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace test {

LoopVolume::LoopVolume(const std::string& type, int megabytes, const std::string& options,
                       const std::string& mount_options, const std::string& image_directory)
    : directory_(make_directory_with_attributes()),
      image_((image_directory.empty() ? directory_ : image_directory) + "/image"),
      path_(directory_ + "/mounted"), mount_options_(mount_options) {
    if (::geteuid() != 0) {
        reason_ = "mounting needs root";
        return;
    }
    ::mkdir(path_.c_str(), 0755);
    const int image = ::open(image_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    if (image < 0 || ::ftruncate(image, off_t{megabytes} * 1024 * 1024) != 0) {
        reason_ = std::string("no image file: ") + std::strerror(errno);
        if (image >= 0)
            ::close(image);
        return;
    }
    ::close(image);
    const std::string quiet = type == "vfat" ? "" : (type.starts_with("ext") ? "-q -F " : "-q ");
    if (!run("mkfs." + type + " " + quiet + options + " " + image_))
        return;
    mount();
}

LoopVolume::~LoopVolume() {
    if (!bound_.empty())
        run("umount " + bound_);
    // Lazily, so that a test that leaks a descriptor leaves no mount behind.
    if (mounted_ && !unmount())
        run("umount -l " + path_);
    remove_tree(directory_);
}

bool LoopVolume::run(const std::string& command) {
    const std::string log = directory_ + "/log";
    if (std::system((command + " >" + log + " 2>&1").c_str()) == 0)
        return true;
    reason_ = command.substr(0, command.find(' ')) + ": " + read_file(log);
    return false;
}

bool LoopVolume::mount() {
    const std::string more = mount_options_.empty() ? "" : "," + mount_options_;
    mounted_ = run("mount -o loop" + more + " " + image_ + " " + path_);
    return mounted_;
}

bool LoopVolume::unmount() {
    if (!run("umount " + path_))
        return false;
    mounted_ = false;
    return true;
}

bool LoopVolume::remount_read_only() {
    return run("mount -o remount,ro " + path_);
}

bool LoopVolume::bind_to(const std::string& other_path) {
    if (!run("mount --bind " + path_ + " " + other_path))
        return false;
    bound_ = other_path;
    return true;
}

std::string LoopVolume::fill() {
    const std::string name = path_ + "/filler";
    const int file = ::open(name.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600);
    std::vector<char> block(1 << 20, 'f');
    for (std::size_t size = block.size(); size > 0;) {
        if (::write(file, block.data(), size) < 0)
            size /= 2;
    }
    ::fsync(file);
    ::close(file);
    return name;
}

} // namespace test
