#include "host/linux/entry_reader.h"

#include "host/linux/node_stat.h"
#include "host/linux/system_calls.h"
#include <cerrno>
#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

namespace host {

namespace {

NodeKind kind_of(int directory, const DirectoryStream::Entry& entry) {
    switch (entry.type) {
    case DT_REG:
        return NodeKind::file;
    case DT_DIR:
        return NodeKind::directory;
    case DT_LNK:
        return NodeKind::symbolic_link;
    case DT_UNKNOWN:
        break;
    default:
        return NodeKind::other;
    }
    struct stat status = {};
    if (system_calls().fstatat(directory, entry.leaf.data(), &status,
                               AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT) != 0)
        return NodeKind::other;
    return to_node_kind(status.st_mode);
}

} // namespace

Status EntryReader::next(Entry& entry) {
    DirectoryStream::Entry found;
    if (!stream_.next(found))
        return stream_.error() != 0 ? stream_.error() : ENOENT;
    entry.leaf.assign(found.leaf);
    entry.inode = found.inode;
    entry.kind = kind_of(directory_.get(), found);
    return {};
}

Status EntryReader::rewind() {
    if (::lseek(directory_.get(), 0, SEEK_SET) < 0)
        return errno;
    stream_ = DirectoryStream(directory_.get());
    return {};
}

} // namespace host
