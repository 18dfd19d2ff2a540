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

} // namespace

PullableVolume::PullableVolume(int megabytes)
    : device_("ext4", megabytes + megabytes / 2 + 16), volume_("ext4", megabytes, "", "", device_.path()) {}

bool PullableVolume::mount_afresh() {
    return volume_.unmount() && volume_.mount();
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
    return volume_.unmount() && device_.unmount() && device_.mount() && volume_.mount();
}

} // namespace test
