#include "host/linux/file_node.h"

#include "host/linux/node_stat.h"
#include "host/linux/system_calls.h"
#include <cerrno>
#include <fcntl.h>
#include <sys/file.h>

namespace host {

namespace {

// EBADF is what a bare reference answers: it has no attributes and takes none.
Status reading_status(Status status) {
    return status.error() == EBADF ? Status(ENOENT) : status;
}

Status writing_status(Status status) {
    return status.error() == EBADF ? Status(ENOTSUP) : status;
}

Status outcome_of(int result) {
    return result == 0 ? Status() : Status(errno);
}

struct timespec to_timespec(std::int64_t nanoseconds) {
    constexpr std::int64_t kSecond = 1'000'000'000;
    struct timespec time = {};
    if (nanoseconds < 0) {
        time.tv_nsec = UTIME_OMIT;
    } else {
        time.tv_sec = nanoseconds / kSecond;
        time.tv_nsec = nanoseconds % kSecond;
    }
    return time;
}

} // namespace

FileNode::~FileNode() {
    if (content_changed_)
        (void)indexes().attributes_changed(ref_);
}

void FileNode::believe(const KnownAttributes& attributes) {
    if (!attributes.known)
        return;
    constexpr std::int64_t kSecond = 1'000'000'000;
    const AttributeSnapshot::Moment before = recent_.moment();
    struct stat status = {};
    if (system_calls().fstat(descriptor_.get(), &status) == 0 && status.st_ino == attributes.inode &&
        status.st_ctim.tv_sec * kSecond + status.st_ctim.tv_nsec == attributes.change_time)
        recent_.take(attributes.list, before);
}

Result<NodeStat> FileNode::stat() {
    struct statx status = {};
    if (system_calls().statx(descriptor_.get(), "", AT_EMPTY_PATH | AT_NO_AUTOMOUNT, kNodeStatMask,
                             &status) != 0)
        return Status(errno);
    return to_node_stat(status, device_);
}

Result<NodeKind> FileNode::kind() {
    if (!kind_) {
        const Result<NodeStat> found = stat();
        if (!found.ok())
            return found.status();
        kind_ = found->kind;
    }
    return *kind_;
}

Result<std::size_t> FileNode::read_at(std::int64_t position, void* buffer, std::size_t size) {
    ssize_t count = -1;
    do {
        count = system_calls().pread(descriptor_.get(), buffer, size, position);
    } while (count < 0 && errno == EINTR);
    if (count < 0)
        return Status(errno);
    return static_cast<std::size_t>(count);
}

Result<std::size_t> FileNode::write_at(std::int64_t position, const void* data, std::size_t size) {
    ssize_t count = -1;
    do {
        count = system_calls().pwrite(descriptor_.get(), data, size, position);
    } while (count < 0 && errno == EINTR);
    if (count < 0)
        return Status(errno);
    content_changed_ |= count > 0;
    return static_cast<std::size_t>(count);
}

Status FileNode::set_size(std::int64_t size) {
    const Status status = outcome_of(system_calls().ftruncate(descriptor_.get(), size));
    content_changed_ |= status.ok();
    return status;
}

Status FileNode::set_mode(std::uint32_t permissions) {
    return writing_status(outcome_of(system_calls().fchmod(descriptor_.get(), permissions & 07777)));
}

Status FileNode::set_owner(std::uint32_t user, std::uint32_t group) {
    return writing_status(outcome_of(system_calls().fchown(descriptor_.get(), user, group)));
}

Status FileNode::set_times(std::int64_t access_time, std::int64_t modification_time) {
    const struct timespec times[2] = {to_timespec(access_time), to_timespec(modification_time)};
    const Status status = writing_status(outcome_of(system_calls().futimens(descriptor_.get(), times)));
    content_changed_ |= status.ok();
    return status;
}

Status FileNode::sync() {
    return outcome_of(system_calls().fsync(descriptor_.get()));
}

Status FileNode::lock() {
    return outcome_of(::flock(descriptor_.get(), LOCK_EX | LOCK_NB));
}

Status FileNode::unlock() {
    return outcome_of(::flock(descriptor_.get(), LOCK_UN));
}

Result<std::vector<std::string>> FileNode::attribute_names() {
    Result<std::vector<std::string>> names = host::attribute_names(file());
    if (!names.ok() && names.error() == EBADF)
        return std::vector<std::string>();
    return names;
}

Result<AttributeInfo> FileNode::attribute_info(const std::string& name) {
    const Result<AttributeInfo> info = host::attribute_info(file(), name.c_str());
    if (!info.ok())
        return reading_status(info.status());
    return info;
}

Result<std::size_t> FileNode::read_attribute(const char* name, std::int64_t offset, void* buffer,
                                             std::size_t size) {
    const Result<std::size_t> count = host::read_attribute(file(), name, offset, buffer, size);
    if (!count.ok())
        return reading_status(count.status());
    return count;
}

Status FileNode::write_attribute(const char* name, std::uint32_t type, std::int64_t offset, const void* data,
                                 std::size_t size) {
    return report(host::write_attribute(file(), name, type, offset, data, size));
}

Status FileNode::remove_attribute(const char* name) {
    return report(reading_status(host::remove_attribute(file(), name)));
}

Status FileNode::rename_attribute(const std::string& from, const std::string& to) {
    return report(reading_status(host::rename_attribute(file(), from.c_str(), to.c_str())));
}

Status FileNode::report(Status outcome) {
    if (!outcome.ok())
        return writing_status(outcome);
    // Asked only after the change is on the file: whoever takes the queued report from now on reads it.
    if (!ticket_.still_queued())
        ticket_ = indexes().attributes_changed(ref_);
    return outcome;
}

} // namespace host
