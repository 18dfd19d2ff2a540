#include "host/linux/blob_store.h"

#include "host/api/directories.h"
#include "host/api/thread_safety.h"
#include "host/linux/attribute_store.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include <array>
#include <atomic>
#include <cerrno>
#include <fcntl.h>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace host {

namespace {

const std::string& blob_directory_name() {
    static const std::string name(kBlobDirectoryName);
    return name;
}

std::string users_blob_directory() {
    return data_directory() + "/blobs";
}

// Blobs whose bytes have been found right, so that reading one in pieces hashes it once. A blob that was
// tampered with afterwards has another change time.
class VerifiedBlobs {
  public:
    bool contains(const Sha256& hash, const struct stat& status) {
        const Entry wanted = entry_of(hash, status);
        MutexLock lock(mutex_);
        for (const Entry& entry : entries_) {
            if (entry == wanted)
                return true;
        }
        return false;
    }

    void add(const Sha256& hash, const struct stat& status) {
        MutexLock lock(mutex_);
        entries_[next_++ % entries_.size()] = entry_of(hash, status);
    }

  private:
    struct Entry {
        Sha256 hash = {};
        dev_t device = 0;
        ino_t inode = 0;
        off_t size = -1;
        std::int64_t change_seconds = 0;
        std::int64_t change_nanoseconds = 0;
        bool operator==(const Entry&) const = default;
    };

    static Entry entry_of(const Sha256& hash, const struct stat& status) {
        return {hash,           status.st_dev,         status.st_ino,
                status.st_size, status.st_ctim.tv_sec, status.st_ctim.tv_nsec};
    }

    Mutex mutex_;
    std::array<Entry, 32> entries_ GUARDED_BY(mutex_);
    std::size_t next_ GUARDED_BY(mutex_) = 0;
};

VerifiedBlobs& verified_blobs() {
    static VerifiedBlobs blobs;
    return blobs;
}

Result<Descriptor> open_verified(int directory, const Sha256& hash, std::uint64_t size) {
    const std::string leaf = to_hexadecimal(hash);
    Descriptor blob(system_calls().openat(directory, leaf.c_str(),
                                          O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC | O_NOCTTY, 0));
    if (!blob.valid())
        return Status(errno);
    struct stat status = {};
    if (system_calls().fstat(blob.get(), &status) != 0)
        return Status(errno);
    if (!S_ISREG(status.st_mode) || static_cast<std::uint64_t>(status.st_size) != size)
        return Status(ENOENT);
    if (verified_blobs().contains(hash, status))
        return blob;

    std::vector<std::byte> bytes(static_cast<std::size_t>(size));
    if (!read_fully(blob.get(), bytes.data(), bytes.size(), 0).ok())
        return Status(ENOENT);
    const Result<Sha256> found = sha256(bytes);
    if (!found.ok() || *found != hash)
        return Status(ENOENT);
    verified_blobs().add(hash, status);
    return blob;
}

// Whoever may make entries in the volume's root may add blobs; all may read one whose hash they know; nobody
// may list them or delete another's.
mode_t blob_directory_mode(int root) {
    struct stat status = {};
    if (system_calls().fstat(root, &status) != 0)
        return 0711;
    const mode_t writers = status.st_mode & 0022u;
    return 0711u | writers | (writers != 0 ? 01000u : 0u);
}

Result<Descriptor> volumes_blob_directory(DeviceId device) {
    Result<Descriptor> root = VolumeTable::instance().open_root(device);
    if (!root.ok())
        return root.status();
    return open_directory(root->get(), blob_directory_name().c_str());
}

Result<Descriptor> make_volumes_blob_directory(DeviceId device) {
    Result<Descriptor> root = VolumeTable::instance().open_root(device);
    if (!root.ok())
        return root.status();
    const char* leaf = blob_directory_name().c_str();
    Result<Descriptor> directory = open_directory(root->get(), leaf);
    if (directory.ok() || directory.error() != ENOENT)
        return directory;
    const bool made = system_calls().mkdirat(root->get(), leaf, 0700) == 0;
    if (!made && errno != EEXIST)
        return Status(errno);
    directory = open_directory(root->get(), leaf);
    // Set afterwards because the process's umask must not narrow it.
    if (made && directory.ok())
        (void)system_calls().fchmod(directory->get(), blob_directory_mode(root->get()));
    return directory;
}

Status write_fully(int descriptor, std::span<const std::byte> bytes) {
    while (!bytes.empty()) {
        const ssize_t count = system_calls().write(descriptor, bytes.data(), bytes.size());
        if (count < 0 && errno == EINTR)
            continue;
        if (count < 0)
            return Status(errno);
        bytes = bytes.subspan(static_cast<std::size_t>(count));
    }
    return {};
}

Status write_and_flush(int descriptor, std::span<const std::byte> bytes) {
    if (const Status written = write_fully(descriptor, bytes); !written.ok())
        return written;
    if (system_calls().fchmod(descriptor, 0444) != 0 || system_calls().fsync(descriptor) != 0)
        return Status(errno);
    return {};
}

Status store_in(int directory, const Sha256& hash, std::span<const std::byte> bytes) {
    if (open_verified(directory, hash, bytes.size()).ok())
        return {};

    static std::atomic<unsigned> counter{0};
    const std::string temporary =
        ".new-" + std::to_string(::getpid()) + "-" + std::to_string(counter.fetch_add(1));
    Descriptor file(system_calls().openat(directory, temporary.c_str(),
                                          O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (!file.valid())
        return Status(errno);
    Status status = write_and_flush(file.get(), bytes);
    if (status.ok() && system_calls().renameat2(directory, temporary.c_str(), directory,
                                                to_hexadecimal(hash).c_str(), 0) != 0)
        status = Status(errno);
    if (!status.ok()) {
        (void)system_calls().unlinkat(directory, temporary.c_str(), 0);
        return status;
    }
    if (system_calls().fsync(directory) == 0)
        return {};
    // A directory that may not be read cannot be flushed; the file's own flush takes its name along where the
    // file system keeps a journal.
    if (errno != EBADF)
        return errno;
    return system_calls().fsync(file.get()) == 0 ? Status() : Status(errno);
}

// Errors that say "not here", for which the user's own directory is as good. A full or failing disk is not
// among them.
bool is_refused(int error) {
    return error == EACCES || error == EPERM || error == EROFS || error == ENOTDIR || error == ENODEV ||
           error == ENOENT || error == EEXIST;
}

Result<Descriptor> open_in_directory(const std::string& path, const AttributeMarker& marker) {
    Result<Descriptor> directory = open_directory(AT_FDCWD, path.c_str());
    if (!directory.ok())
        return directory;
    return open_verified(directory->get(), marker.hash, marker.size);
}

// A file may have been written when a directory above it was a declared volume, and no longer be on one.
Result<Descriptor> open_above(int referrer, const AttributeMarker& marker) {
    std::string path(4096, '\0');
    const std::string link = "/proc/self/fd/" + std::to_string(referrer);
    const ssize_t length = system_calls().readlinkat(AT_FDCWD, link.c_str(), path.data(), path.size());
    if (length <= 0 || path[0] != '/')
        return Status(ENOENT);
    path.resize(static_cast<std::size_t>(length));
    for (std::size_t slash = path.rfind('/'); slash != std::string::npos; slash = path.rfind('/')) {
        path.resize(slash);
        Result<Descriptor> blob = open_in_directory(path + "/" + blob_directory_name(), marker);
        if (blob.ok())
            return blob;
    }
    return Status(ENOENT);
}

} // namespace

Status read_fully(int descriptor, std::byte* buffer, std::size_t size, std::int64_t position) {
    while (size > 0) {
        const ssize_t count = system_calls().pread(descriptor, buffer, size, position);
        if (count < 0 && errno == EINTR)
            continue;
        if (count <= 0)
            return Status(count < 0 ? errno : EIO);
        buffer += count;
        size -= static_cast<std::size_t>(count);
        position += count;
    }
    return {};
}

Result<Sha256> blob_store::store(DeviceId device, std::span<const std::byte> bytes) {
    const Result<Sha256> hash = sha256(bytes);
    if (!hash.ok())
        return hash;

    Status status;
    Result<Descriptor> directory = make_volumes_blob_directory(device);
    if (directory.ok())
        status = store_in(directory->get(), *hash, bytes);
    else
        status = directory.status();
    if (status.ok())
        return hash;
    if (!is_refused(status.error()))
        return status;

    const std::string path = users_blob_directory();
    if (const Status made = make_directories(path); !made.ok())
        return made;
    directory = open_directory(AT_FDCWD, path.c_str());
    if (!directory.ok())
        return directory.status();
    status = store_in(directory->get(), *hash, bytes);
    if (!status.ok())
        return status;
    return hash;
}

Result<Descriptor> blob_store::open(DeviceId device, int referrer, const AttributeMarker& marker) {
    Result<Descriptor> directory = volumes_blob_directory(device);
    if (directory.ok()) {
        Result<Descriptor> blob = open_verified(directory->get(), marker.hash, marker.size);
        if (blob.ok())
            return blob;
    }
    Result<Descriptor> blob = open_in_directory(users_blob_directory(), marker);
    if (blob.ok())
        return blob;
    blob = open_above(referrer, marker);
    if (blob.ok())
        return blob;
    // A copy on another volume has the marker, and its blob lies where the original is.
    const auto volumes = VolumeTable::instance().current();
    for (const Volume& volume : volumes->volumes()) {
        if (volume.info.id == device)
            continue;
        directory = volumes_blob_directory(volume.info.id);
        if (!directory.ok())
            continue;
        blob = open_verified(directory->get(), marker.hash, marker.size);
        if (blob.ok())
            return blob;
    }
    return Status(ENOENT);
}

} // namespace host
