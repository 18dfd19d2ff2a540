#include "host/sqlite/index_query.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include <cerrno>
#include <fcntl.h>

namespace host {
namespace {

// So few that a query never starves the program of descriptors.
constexpr std::size_t kHeldDirectories = 64;

} // namespace

IndexQuery::IndexQuery(std::shared_ptr<VolumeIndex> index, std::shared_ptr<const Condition> condition,
                       std::shared_ptr<LiveQuery> live, std::vector<RowNumber> rows)
    : index_(std::move(index)), condition_(std::move(condition)), live_(std::move(live)),
      rows_(std::move(rows)) {}

IndexQuery::~IndexQuery() {
    if (live_)
        live_->end();
    if (reader_)
        index_->give_back_reader(std::move(reader_));
}

const Directory* IndexQuery::directory_of(std::uint64_t inode) {
    if (inode == last_inode_ && last_directory_ != nullptr)
        return last_directory_;
    auto found = directories_.find(inode);
    if (found == directories_.end()) {
        if (directories_.size() >= kHeldDirectories)
            directories_.clear();
        DirectoryCache& cache = DirectoryCache::instance();
        auto handle = cache.find(index_->device(), inode, DirectoryCache::Search::hints_only);
        for (std::uint64_t at = inode; !handle && at != 0;) {
            IndexStore::KnownDirectory known;
            if (reader_->directory(at, known) != DatabaseResult::row)
                break;
            cache.remember(index_->device(), known.inode, known.parent, known.name);
            handle = cache.find(index_->device(), inode, DirectoryCache::Search::hints_only);
            at = known.parent == at ? 0 : known.parent;
        }
        if (!handle)
            handle = cache.find(index_->device(), inode, DirectoryCache::Search::whole_volume);
        found = directories_.emplace(inode, handle ? *handle : nullptr).first;
    }
    last_inode_ = inode;
    return last_directory_ = found->second.get();
}

bool IndexQuery::is_hit(IndexRow& row, Hit& hit) {
    const Directory* directory = directory_of(row.directory);
    struct stat status = {};
    if (directory == nullptr || system_calls().fstatat(directory->descriptor(), row.name.c_str(), &status,
                                                       AT_SYMLINK_NOFOLLOW) != 0) {
        index_->entry_observed(row.directory, row.name, ChangeNote::Source::observed);
        return false;
    }
    const bool true_row =
        row.settled && status.st_ino == row.inode && change_time_of(status) == row.change_time;
    EntrySubject subject(index_->device(), directory->descriptor(), row.name);
    subject.set_status(status);
    if (true_row)
        subject.set_record(row.attributes, names_);
    else
        index_->entry_observed(row.directory, row.name, ChangeNote::Source::observed);
    if (!condition_->holds(subject))
        return false;
    hit.ref.device = index_->device();
    hit.ref.directory = row.directory;
    hit.ref.leaf = row.name;
    hit.inode = status.st_ino;
    return !live_ || live_->hand_out(hit.ref, hit.inode);
}

Status IndexQuery::next(Hit& hit) {
    if (position_ == rows_.size())
        return ENOENT;
    if (!reader_) {
        reader_ = index_->borrow_reader();
        if (!reader_ || !succeeded(reader_->attributes(names_)))
            return ENOENT;
    }
    while (position_ < rows_.size()) {
        const DatabaseResult result = reader_->read(rows_[position_++], row_);
        if (result == DatabaseResult::row && is_hit(row_, hit))
            return {};
        if (result == DatabaseResult::damaged)
            index_->report_damage();
        if (!succeeded(result))
            break;
    }
    position_ = rows_.size();
    directories_.clear();
    last_directory_ = nullptr;
    if (VolumeTable::instance().refresh()->find(index_->device()) == nullptr)
        return ENODEV;
    return ENOENT;
}

Status IndexQuery::rewind() {
    const Status found = index_->search(*condition_, rows_);
    position_ = 0;
    if (reader_ && !succeeded(reader_->attributes(names_)))
        reader_.reset();
    if (live_)
        live_->rewind();
    return found;
}

} // namespace host
