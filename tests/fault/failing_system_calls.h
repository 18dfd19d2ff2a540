#pragma once

#include "host/linux/system_calls.h"
#include <atomic>
#include <cerrno>
#include <fcntl.h>
#include <string>
#include <vector>

namespace test {

/// Lets every system call through until the one that is to fail: the `nth` changing call (from 0) from now on
/// answers -1 with `error`, and so do all that follow when `for_good`. The clean-up call unlinkat always goes
/// through. Counts with nth = never to learn how many there are.
class FailingSystemCalls : public host::SystemCalls {
  public:
    static constexpr int kNever = -1;
    enum class Lasting { once, for_good };

    explicit FailingSystemCalls(int nth = kNever, int error = EIO, Lasting lasting = Lasting::once)
        : nth_(nth), error_(error), lasting_(lasting) {}

    int changing_calls() const { return count_; }
    /// The call that was made to fail; empty when it was not reached.
    const std::string& failed_call() const { return failed_call_; }

    int openat(int directory, const char* path, int flags, mode_t mode) override {
        if ((flags & O_CREAT) != 0 && fails("openat"))
            return -1;
        return SystemCalls::openat(directory, path, flags, mode);
    }
    ssize_t write(int descriptor, const void* data, std::size_t size) override {
        if (fails("write")) {
            // A disk that fills up takes a part first.
            if (size > 1)
                (void)SystemCalls::write(descriptor, data, size / 2);
            errno = error_;
            return -1;
        }
        return SystemCalls::write(descriptor, data, size);
    }
    int fchmod(int descriptor, mode_t mode) override {
        return fails("fchmod") ? -1 : SystemCalls::fchmod(descriptor, mode);
    }
    int fsync(int descriptor) override { return fails("fsync") ? -1 : SystemCalls::fsync(descriptor); }
    int fsetxattr(int descriptor, const char* name, const void* value, std::size_t size, int flags) override {
        return fails("fsetxattr") ? -1 : SystemCalls::fsetxattr(descriptor, name, value, size, flags);
    }
    int fremovexattr(int descriptor, const char* name) override {
        return fails("fremovexattr") ? -1 : SystemCalls::fremovexattr(descriptor, name);
    }
    int renameat2(int from_directory, const char* from, int to_directory, const char* to,
                  unsigned flags) override {
        return fails("renameat2") ? -1
                                  : SystemCalls::renameat2(from_directory, from, to_directory, to, flags);
    }
    int mkdirat(int directory, const char* path, mode_t mode) override {
        return fails("mkdirat") ? -1 : SystemCalls::mkdirat(directory, path, mode);
    }

  private:
    bool fails(const char* call) {
        const int index = count_++;
        const bool now = nth_ != kNever && (index == nth_ || (index > nth_ && lasting_ == Lasting::for_good));
        if (now) {
            if (failed_call_.empty())
                failed_call_ = call;
            errno = error_;
        }
        return now;
    }

    const int nth_;
    const int error_;
    const Lasting lasting_;
    std::atomic<int> count_{0};
    std::string failed_call_;
};

} // namespace test
