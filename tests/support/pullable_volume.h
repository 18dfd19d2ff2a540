#pragma once

#include "support/loop_volume.h"
#include <string>

namespace test {

/// A mounted ext4 file system whose device can be pulled out: from then on every access to it is an I/O
/// error, while what the kernel has in its cache still reads. It lies in an image on another mounted image
/// that is shut down for the purpose. Needs what LoopVolume needs; where something is missing, mounted() is
/// false and reason() says what.
class PullableVolume {
  public:
    explicit PullableVolume(int megabytes);

    bool mounted() const { return device_.mounted() && volume_.mounted(); }
    const std::string& reason() const { return device_.mounted() ? volume_.reason() : device_.reason(); }
    /// Mount point, absolute.
    const std::string& path() const { return volume_.path(); }

    /// Unmounts and mounts, so that nothing is left in the kernel's cache. False while a file on it is open.
    bool mount_afresh();
    /// False when the kernel knows no way.
    bool pull();
    /// The device is back with what had reached it, and mounted again. Nobody may have a file on it open.
    bool put_back();

  private:
    LoopVolume device_;
    LoopVolume volume_;
};

} // namespace test
