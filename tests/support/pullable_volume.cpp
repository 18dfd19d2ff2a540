#include "support/pullable_volume.h"

#include <cstdint>
#include <fcntl.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace test {
namespace {

// The kernel's headers do not export these.
constexpr unsigned long kShutDown = _IOR('X', 125, std::uint32_t);
constexpr std::uint32_t kWritingTheJournal = 1;

// Whoever looks over all mounted volumes at this moment holds one of them for an instant.
bool unmount_patiently(LoopVolume& volume) {
    for (int attempt = 0; attempt < 50; ++attempt) {
        if (volume.unmount())
            return true;
        ::usleep(100'000);
    }
    return false;
}

} // namespace

PullableVolume::PullableVolume(int megabytes)
    : device_("ext4", megabytes + megabytes / 2 + 16), volume_("ext4", megabytes, "", "", device_.path()) {}

bool PullableVolume::mount_afresh() {
    return unmount_patiently(volume_) && volume_.mount();
}

bool PullableVolume::pull() {
    const int root = ::open(device_.path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    std::uint32_t how = kWritingTheJournal;
    const bool done = root >= 0 && ::ioctl(root, kShutDown, &how) == 0;
    if (root >= 0)
        ::close(root);
    return done;
}

bool PullableVolume::put_back() {
    return unmount_patiently(volume_) && unmount_patiently(device_) && device_.mount() && volume_.mount();
}

} // namespace test
