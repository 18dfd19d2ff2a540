#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <sys/stat.h>
#include <sys/statfs.h>
#include <sys/types.h>

namespace host {

/// Every system call by which host/linux touches files. Each method is the call of its name: the same result,
/// -1 and errno on failure. Derive and install with ScopedSystemCalls to make a call fail in a test.
/// Stateless here; any thread.
class SystemCalls {
  public:
    virtual ~SystemCalls() = default;

    virtual int openat(int directory, const char* path, int flags, mode_t mode);
    virtual int fstat(int descriptor, struct stat* result);
    virtual int fstatat(int directory, const char* path, struct stat* result, int flags);
    virtual int statx(int directory, const char* path, int flags, unsigned mask, struct statx* result);
    virtual int fstatfs(int descriptor, struct statfs* result);
    virtual ssize_t getdents(int descriptor, void* buffer, std::size_t size);

    virtual ssize_t pread(int descriptor, void* buffer, std::size_t size, off_t position);
    virtual ssize_t pwrite(int descriptor, const void* data, std::size_t size, off_t position);
    virtual ssize_t write(int descriptor, const void* data, std::size_t size);
    virtual int ftruncate(int descriptor, off_t size);
    virtual int fchmod(int descriptor, mode_t mode);
    virtual int fchown(int descriptor, uid_t user, gid_t group);
    virtual int futimens(int descriptor, const struct timespec times[2]);
    virtual int fsync(int descriptor);

    virtual ssize_t fgetxattr(int descriptor, const char* name, void* buffer, std::size_t size);
    virtual ssize_t flistxattr(int descriptor, char* buffer, std::size_t size);
    virtual int fsetxattr(int descriptor, const char* name, const void* value, std::size_t size, int flags);
    virtual int fremovexattr(int descriptor, const char* name);

    virtual int renameat2(int from_directory, const char* from, int to_directory, const char* to,
                          unsigned flags);
    virtual int unlinkat(int directory, const char* path, int flags);
    virtual int mkdirat(int directory, const char* path, mode_t mode);
    virtual int symlinkat(const char* target, int directory, const char* path);
    virtual ssize_t readlinkat(int directory, const char* path, char* buffer, std::size_t size);
};

namespace internal {
extern std::atomic<SystemCalls*> installed_system_calls;
}

/// The calls in force: the real ones unless a test has installed others. One load and one virtual call.
inline SystemCalls& system_calls() {
    return *internal::installed_system_calls.load(std::memory_order_acquire);
}

/// Installs other system calls for the whole process until destroyed. Scopes nest; the replacement must
/// outlive the scope and every call under way.
class ScopedSystemCalls {
  public:
    explicit ScopedSystemCalls(SystemCalls& replacement);
    ~ScopedSystemCalls();
    ScopedSystemCalls(const ScopedSystemCalls&) = delete;
    ScopedSystemCalls& operator=(const ScopedSystemCalls&) = delete;

  private:
    SystemCalls* previous_ = nullptr;
};

} // namespace host
