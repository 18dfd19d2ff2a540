#include "host/sqlite/index_query.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/known_directory.h"
#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <functional>

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
        const auto handle = find_known_directory(*reader_, index_->device(), inode);
        if (!handle)
            volume_is_gone_ = VolumeTable::instance().refresh()->find(index_->device()) == nullptr;
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
        if (!volume_is_gone_)
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
    return give(hit);
}

bool IndexQuery::give(const Hit& hit) {
    std::uint64_t fingerprint = std::hash<std::string>()(hit.ref.leaf) + hit.ref.directory;
    fingerprint = (fingerprint ^ fingerprint >> 32) * 0x9e3779b97f4a7c15U + hit.ref.directory;
    const auto sorted_end = given_.begin() + static_cast<std::ptrdiff_t>(given_before_);
    if (std::binary_search(given_.begin(), sorted_end, fingerprint))
        return false;
    given_.push_back(fingerprint);
    return !live_ || live_->hand_out(hit.ref, hit.inode);
}

Status IndexQuery::next_row(Hit& hit) {
    if (walk_) {
        Status status;
        while ((status = walk_->next(hit)).ok() && !give(hit)) {
        }
        return status;
    }
    DatabaseResult result = DatabaseResult::done;
    if (!reader_ && position_ < rows_.size()) {
        reader_ = index_->borrow_reader();
        result = reader_ ? reader_->attributes(names_) : DatabaseResult::failed;
    }
    while (succeeded(result) && position_ < rows_.size() && !volume_is_gone_) {
        result = reader_->read(rows_[position_], row_);
        if (!succeeded(result))
            break;
        ++position_;
        if (result == DatabaseResult::row && is_hit(row_, hit))
            return {};
    }
    return succeeded(result) ? Status(ENOENT) : recover(result);
}

Status IndexQuery::recover(DatabaseResult result) {
    reader_.reset();
    std::sort(given_.begin(), given_.end());
    given_before_ = given_.size();
    // Damage that comes again right after the index was rebuilt is not worth a third attempt.
    const bool again = recovered_;
    recovered_ = true;
    position_ = 0;
    rows_.clear();
    Status found = ENOTSUP;
    if (result == DatabaseResult::damaged && !again) {
        index_->report_damage();
        found = index_->search(*condition_, rows_);
    }
    if (found.error() == ENOTSUP) {
        walk_ = std::make_unique<WalkQuery>(index_->device(), condition_, nullptr, nullptr, nullptr);
        found = walk_->rewind();
    }
    return found.ok() ? Status(EAGAIN) : found;
}

Status IndexQuery::next(Hit& hit) {
    Status status;
    do {
        status = next_row(hit);
    } while (status.error() == EAGAIN);
    if (status.error() != ENOENT)
        return status;
    position_ = rows_.size();
    directories_.clear();
    last_directory_ = nullptr;
    if (VolumeTable::instance().refresh()->find(index_->device()) == nullptr)
        return ENODEV;
    return ENOENT;
}

Status IndexQuery::rewind() {
    walk_.reset();
    given_.clear();
    given_before_ = 0;
    recovered_ = false;
    volume_is_gone_ = false;
    directories_.clear();
    last_directory_ = nullptr;
    rows_.clear();
    position_ = 0;
    if (live_)
        live_->rewind();
    reader_.reset();
    Status found = index_->search(*condition_, rows_);
    if (found.error() == ENOTSUP)
        found = recover(DatabaseResult::failed);
    return found.error() == EAGAIN ? Status() : found;
}

} // namespace host
