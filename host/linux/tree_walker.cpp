#include "host/linux/tree_walker.h"

#include "host/linux/attribute_store.h"
#include "host/linux/directory_cache.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include <algorithm>
#include <dirent.h>
#include <fcntl.h>

namespace host {
namespace {

NodeKind kind_of(unsigned char type) {
    switch (type) {
    case DT_REG:
        return NodeKind::file;
    case DT_DIR:
        return NodeKind::directory;
    case DT_LNK:
        return NodeKind::symbolic_link;
    default:
        return NodeKind::other;
    }
}

} // namespace

TreeWalker::TreeWalker(std::shared_ptr<const VolumeSnapshot> volumes, const Volume& volume)
    : volumes_(std::move(volumes)), volume_(volume) {}

Result<std::unique_ptr<TreeWalker>> TreeWalker::open(DeviceId device) {
    auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(device);
    if (volume == nullptr) {
        volumes = VolumeTable::instance().refresh();
        volume = volumes->find(device);
    }
    if (volume == nullptr)
        return Status(ENODEV);
    Result<Descriptor> root = VolumeTable::instance().open_root(device);
    if (!root)
        return Status(ENODEV);
    std::unique_ptr<TreeWalker> walker(new TreeWalker(volumes, *volume));
    if (system_calls().fstat(root->get(), &walker->root_status_) != 0)
        return Status(errno);
    Result<Descriptor> readable = reopen_directory(root->get());
    if (!readable)
        return readable.status();
    walker->frames_.push_back(
        std::make_unique<Frame>(std::move(*readable), walker->root_status_.st_ino, std::string()));
    return walker;
}

bool TreeWalker::is_open_above(std::uint64_t inode) const {
    return std::any_of(frames_.begin(), frames_.end(),
                       [inode](const auto& frame) { return frame->inode == inode; });
}

TreeWalker::Descent TreeWalker::descend(const Entry& entry) {
    Result<Descriptor> opened = open_directory(entry.directory_descriptor, entry.leaf.data());
    if (!opened) {
        struct stat status = {};
        if (system_calls().fstatat(entry.directory_descriptor, entry.leaf.data(), &status,
                                   AT_SYMLINK_NOFOLLOW) != 0)
            return Descent::border;
        return volumes_->is_border(volume_, status.st_dev, status.st_ino) ? Descent::border
                                                                          : Descent::unreadable;
    }
    if (system_calls().fstat(opened->get(), &entered_status_) != 0)
        return Descent::unreadable;
    if (volumes_->is_border(volume_, entered_status_.st_dev, entered_status_.st_ino))
        return Descent::border;
    // A bind mount can show a directory inside itself.
    if (is_open_above(entered_status_.st_ino))
        return Descent::border;
    frames_.push_back(
        std::make_unique<Frame>(std::move(*opened), entered_status_.st_ino, std::string(entry.leaf)));
    entered_ = true;
    return Descent::entered;
}

Status TreeWalker::next(Entry& entry) {
    entered_ = false;
    DirectoryStream::Entry found;
    while (!frames_.empty()) {
        Frame& frame = *frames_.back();
        if (!frame.stream.next(found)) {
            frames_.pop_back();
            continue;
        }
        if (frames_.size() == 1 && found.leaf == kBlobDirectoryName)
            continue;
        current_ = frames_.size() - 1;
        entry.leaf = found.leaf;
        entry.inode = found.inode;
        entry.directory = frame.inode;
        entry.directory_descriptor = frame.descriptor.get();
        entry.kind = kind_of(found.type);
        if (found.type == DT_UNKNOWN) {
            struct stat status = {};
            if (system_calls().fstatat(entry.directory_descriptor, entry.leaf.data(), &status,
                                       AT_SYMLINK_NOFOLLOW) != 0)
                continue;
            entry.kind = kind_of(static_cast<unsigned char>(IFTODT(status.st_mode)));
        }
        if (entry.kind == NodeKind::directory && descend(entry) == Descent::border)
            continue;
        return {};
    }
    return ENOENT;
}

const struct stat* TreeWalker::entered_directory() const {
    return entered_ ? &entered_status_ : nullptr;
}

void TreeWalker::remember_directory() {
    remember_frames(std::min(current_ + 1, frames_.size()));
}

void TreeWalker::remember_entered_directory() {
    remember_frames(frames_.size());
}

void TreeWalker::remember_frames(std::size_t count) {
    for (std::size_t i = count; i-- > 1;) {
        Frame& frame = *frames_[i];
        if (frame.remembered)
            return;
        DirectoryCache::instance().remember(volume_.info.id, frame.inode, frames_[i - 1]->inode, frame.leaf);
        frame.remembered = true;
    }
}

} // namespace host
