#include "host/linux/system_calls.h"

#include <cstdio>
#include <fcntl.h>
#include <sys/syscall.h>
#include <sys/vfs.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace host {

namespace {

// Never destroyed: threads that end late still use it.
union RealSystemCalls {
    constexpr RealSystemCalls() : calls() {}
    ~RealSystemCalls() {}
    SystemCalls calls;
};

constinit RealSystemCalls real_system_calls;

} // namespace

namespace internal {
std::atomic<SystemCalls*> installed_system_calls{&real_system_calls.calls};
}

int SystemCalls::openat(int directory, const char* path, int flags, mode_t mode) {
    return ::openat(directory, path, flags, mode);
}

int SystemCalls::fstat(int descriptor, struct stat* result) {
    return ::fstat(descriptor, result);
}

int SystemCalls::fstatat(int directory, const char* path, struct stat* result, int flags) {
    return ::fstatat(directory, path, result, flags);
}

int SystemCalls::statx(int directory, const char* path, int flags, unsigned mask, struct statx* result) {
    return ::statx(directory, path, flags, mask, result);
}

int SystemCalls::fstatfs(int descriptor, struct statfs* result) {
    return ::fstatfs(descriptor, result);
}

ssize_t SystemCalls::getdents(int descriptor, void* buffer, std::size_t size) {
    return ::syscall(SYS_getdents64, descriptor, buffer, size);
}

ssize_t SystemCalls::pread(int descriptor, void* buffer, std::size_t size, off_t position) {
    return ::pread(descriptor, buffer, size, position);
}

ssize_t SystemCalls::pwrite(int descriptor, const void* data, std::size_t size, off_t position) {
    return ::pwrite(descriptor, data, size, position);
}

ssize_t SystemCalls::write(int descriptor, const void* data, std::size_t size) {
    return ::write(descriptor, data, size);
}

int SystemCalls::ftruncate(int descriptor, off_t size) {
    return ::ftruncate(descriptor, size);
}

int SystemCalls::fchmod(int descriptor, mode_t mode) {
    return ::fchmod(descriptor, mode);
}

int SystemCalls::fchown(int descriptor, uid_t user, gid_t group) {
    return ::fchown(descriptor, user, group);
}

int SystemCalls::futimens(int descriptor, const struct timespec times[2]) {
    return ::futimens(descriptor, times);
}

int SystemCalls::fsync(int descriptor) {
    return ::fsync(descriptor);
}

ssize_t SystemCalls::fgetxattr(int descriptor, const char* name, void* buffer, std::size_t size) {
    return ::fgetxattr(descriptor, name, buffer, size);
}

ssize_t SystemCalls::flistxattr(int descriptor, char* buffer, std::size_t size) {
    return ::flistxattr(descriptor, buffer, size);
}

int SystemCalls::fsetxattr(int descriptor, const char* name, const void* value, std::size_t size, int flags) {
    return ::fsetxattr(descriptor, name, value, size, flags);
}

int SystemCalls::fremovexattr(int descriptor, const char* name) {
    return ::fremovexattr(descriptor, name);
}

int SystemCalls::renameat2(int from_directory, const char* from, int to_directory, const char* to,
                           unsigned flags) {
    return ::renameat2(from_directory, from, to_directory, to, flags);
}

int SystemCalls::unlinkat(int directory, const char* path, int flags) {
    return ::unlinkat(directory, path, flags);
}

int SystemCalls::mkdirat(int directory, const char* path, mode_t mode) {
    return ::mkdirat(directory, path, mode);
}

int SystemCalls::symlinkat(const char* target, int directory, const char* path) {
    return ::symlinkat(target, directory, path);
}

ssize_t SystemCalls::readlinkat(int directory, const char* path, char* buffer, std::size_t size) {
    return ::readlinkat(directory, path, buffer, size);
}

ScopedSystemCalls::ScopedSystemCalls(SystemCalls& replacement)
    : previous_(internal::installed_system_calls.exchange(&replacement, std::memory_order_acq_rel)) {}

ScopedSystemCalls::~ScopedSystemCalls() {
    internal::installed_system_calls.store(previous_, std::memory_order_release);
}

} // namespace host
