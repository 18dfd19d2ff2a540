#include "host/linux/directory_path.h"

#include "host/linux/descriptor.h"
#include "host/linux/directory_stream.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include <cerrno>
#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

namespace host {

namespace {

// Deeper trees than any path fits are a loop of mounts.
constexpr int kDeepest = 100'000;

bool is_same(const struct stat& a, const struct stat& b) {
    return a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

// The top of what was unmounted while it was in use is another one.
bool is_root(const struct stat& status) {
    struct stat root = {};
    return system_calls().fstatat(AT_FDCWD, "/", &root, 0) == 0 && is_same(root, status);
}

// The numbers in directory entries are those of what is mounted over, and on stacked file systems another
// layer's.
enum class Numbers { trusted, doubted };

Result<std::string> find_leaf(int parent, const struct stat& wanted, Numbers numbers) {
    Result<Descriptor> listing = reopen_directory(parent);
    if (!listing.ok())
        return listing.status();
    DirectoryStream stream(listing->get());
    for (DirectoryStream::Entry entry; stream.next(entry);) {
        if (entry.type != DT_DIR && entry.type != DT_UNKNOWN)
            continue;
        if (numbers == Numbers::trusted && entry.inode != wanted.st_ino)
            continue;
        struct stat status = {};
        if (system_calls().fstatat(parent, entry.leaf.data(), &status,
                                   AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT) == 0 &&
            is_same(status, wanted))
            return std::string(entry.leaf);
    }
    return Status(ENOENT);
}

} // namespace

Result<std::string> path_by_climbing(int directory) {
    struct stat status = {};
    if (system_calls().fstat(directory, &status) != 0)
        return Status(errno);
    if (status.st_nlink == 0)
        return Status(ENOENT);
    std::string path;
    Descriptor here;
    for (int depth = 0; depth < kDeepest; ++depth) {
        Result<Descriptor> parent = open_directory(here.valid() ? here.get() : directory, "..");
        if (!parent.ok())
            return parent.status();
        struct stat above = {};
        if (system_calls().fstat(parent->get(), &above) != 0)
            return Status(errno);
        if (is_same(above, status))
            return is_root(status) ? Result<std::string>(path.empty() ? "/" : path) : Status(ENOENT);
        Result<std::string> leaf = find_leaf(parent->get(), status, Numbers::trusted);
        if (!leaf.ok() && leaf.error() == ENOENT)
            leaf = find_leaf(parent->get(), status, Numbers::doubted);
        if (!leaf.ok())
            return leaf;
        path.insert(0, "/" + *leaf);
        here = *std::move(parent);
        status = above;
    }
    return Status(ELOOP);
}

} // namespace host
