#include "host/sqlite/walk_query.h"
#include "host/linux/seen_entry.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/entry_state.h"
#include <cerrno>

namespace host {

WalkQuery::~WalkQuery() {
    if (live_)
        live_->end();
}

Status WalkQuery::next(Hit& hit) {
    if (!walker_)
        return ENOENT;
    TreeWalker::Entry entry;
    Status status;
    while ((status = walker_->next(entry)).ok()) {
        EntrySubject subject(device_, entry.directory_descriptor, entry.leaf);
        if (!condition_->holds(subject))
            continue;
        walker_->remember_directory();
        hit.ref.device = device_;
        hit.ref.directory = entry.directory;
        hit.ref.leaf.assign(entry.leaf);
        hit.inode = entry.inode;
        if (entry.kind == NodeKind::file)
            set_seen_file(hit.ref);
        if (!live_ || live_->hand_out(hit.ref, hit.inode))
            return {};
    }
    walker_.reset();
    // The end of a walk through a volume that went away meanwhile is not the end of its entries.
    if (VolumeTable::instance().refresh()->find(device_) == nullptr)
        return ENODEV;
    return status;
}

Status WalkQuery::rewind() {
    auto walker = TreeWalker::open(device_);
    if (!walker)
        return walker.status();
    walker_ = std::move(*walker);
    if (live_)
        live_->rewind();
    return {};
}

} // namespace host
