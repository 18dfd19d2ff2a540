#pragma once

#include <string>

namespace test {

/// A file system in an image file, made and mounted for one test. Needs root, loop devices, the tools of that
/// file system and a kernel that knows it; where one is missing, mounted() is false and reason() says which,
/// for the test to skip with. Unmounted and deleted at the end.
class LoopVolume {
  public:
    /// `type` is "ext4", "btrfs", "vfat" ...; `options` go to its mkfs, `mount_options` to mount. The image
    /// lies in `image_directory` where one is given.
    LoopVolume(const std::string& type, int megabytes, const std::string& options = "",
               const std::string& mount_options = "", const std::string& image_directory = "");
    ~LoopVolume();
    LoopVolume(const LoopVolume&) = delete;
    LoopVolume& operator=(const LoopVolume&) = delete;

    bool mounted() const { return mounted_; }
    const std::string& reason() const { return reason_; }
    /// Mount point, absolute.
    const std::string& path() const { return path_; }
    const std::string& image() const { return image_; }

    /// False when the system refuses, as it does while a file on it is open.
    bool unmount();
    bool mount();
    bool remount_read_only();
    /// Mounts again, elsewhere (a bind mount); unmounted at the end too.
    bool bind_to(const std::string& other_path);
    /// Writes a file until not a byte is left; the file's name.
    std::string fill();

  private:
    bool run(const std::string& command);

    std::string directory_;
    std::string image_;
    std::string path_;
    std::string bound_;
    std::string mount_options_;
    std::string reason_;
    bool mounted_ = false;
};

} // namespace test
