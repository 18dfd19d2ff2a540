#include "host/sqlite/index_query.h"
#include "host/linux/seen_entry.h"
#include "host/linux/system_calls.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/attribute_value.h"
#include "host/sqlite/known_directory.h"
#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <functional>

namespace host {
namespace {

// So few that a query never starves the program of descriptors.
constexpr std::size_t kHeldDirectories = 64;
// Rows read together: few at first, so that the first hit comes soon.
constexpr std::size_t kFirstGroup = 8;
constexpr std::size_t kLargestGroup = 256;

} // namespace

IndexQuery::IndexQuery(std::shared_ptr<VolumeIndex> index, std::shared_ptr<const Condition> condition,
                       std::shared_ptr<LiveQuery> live, std::vector<RowNumber> rows)
    : index_(std::move(index)), condition_(std::move(condition)), live_(std::move(live)),
      rows_(std::move(rows)) {
    condition_->collect_attributes(asked_for_);
}

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
        const auto handle = find_known_directory(*reader_, index_->device(), inode, searched_in_vain_);
        if (!handle)
            volume_is_gone_ = VolumeTable::instance().refresh()->find(index_->device()) == nullptr;
        found = directories_.emplace(inode, handle ? *handle : nullptr).first;
    }
    last_inode_ = inode;
    return last_directory_ = found->second.get();
}

bool IndexQuery::is_hit(const IndexRow& row, Hit& hit) {
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
    if (!give(hit))
        return false;
    if (S_ISREG(status.st_mode)) {
        set_seen_file(hit.ref);
        if (true_row && row.exact)
            tell_attributes(row);
    }
    return true;
}

// Whoever asked for hits is likely to read their attributes next. A row that lacks one of those that were
// asked for is not told: what a file lacks may be derived and written to it, so its own word is to count.
void IndexQuery::tell_attributes(const IndexRow& row) {
    KnownAttributes& attributes = attributes_of_seen_file();
    attributes.known = true;
    attributes.inode = row.inode;
    attributes.change_time = row.change_time;
    attributes.list.clear();
    std::size_t met = 0;
    RecordReader reader(row.attributes);
    RecordedAttribute recorded;
    while (reader.next(recorded)) {
        const auto found = names_.find(recorded.id);
        if (found == names_.end()) {
            attributes.known = false;
            return;
        }
        const AttributeNameAndType& name = found->second;
        const bool is_text = kind_of_type(name.type) == AttributeValue::Kind::text;
        met += asked_for_.contains(name.name) ? 1 : 0;
        if (recorded.cut)
            attributes.add(name.name);
        else
            attributes.add(name.name, name.type, recorded.bytes,
                           is_text ? KnownAttributes::Ending::terminated : KnownAttributes::Ending::plain);
    }
    attributes.known = attributes.known && met == asked_for_.size();
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
    while (succeeded(result) && !volume_is_gone_) {
        while (looked_at_ < group_ && !volume_is_gone_) {
            if (is_hit(read_[looked_at_++], hit))
                return {};
        }
        if (position_ == rows_.size())
            break;
        result = read_rows();
    }
    return succeeded(result) ? Status(ENOENT) : recover(result);
}

DatabaseResult IndexQuery::read_rows() {
    const std::size_t wanted =
        std::min({std::max(kFirstGroup, 2 * looked_at_), kLargestGroup, rows_.size() - position_});
    if (read_.size() < wanted)
        read_.resize(wanted);
    group_ = 0;
    looked_at_ = 0;
    DatabaseResult result = reader_->begin_reading();
    for (const std::size_t end = position_ + wanted; succeeded(result) && position_ < end; ++position_) {
        result = reader_->read(rows_[position_], read_[group_]);
        if (!succeeded(result))
            break;
        if (result == DatabaseResult::row)
            ++group_;
    }
    if (succeeded(result))
        result = reader_->commit();
    if (succeeded(result))
        return DatabaseResult::done;
    reader_->roll_back();
    // What was read before is looked at first; then the row that cannot be read is met again.
    return group_ > 0 ? DatabaseResult::done : result;
}

Status IndexQuery::recover(DatabaseResult result) {
    reader_.reset();
    std::sort(given_.begin(), given_.end());
    given_before_ = given_.size();
    // Damage that comes again right after the index was rebuilt is not worth a third attempt.
    const bool again = recovered_;
    recovered_ = true;
    position_ = 0;
    group_ = 0;
    looked_at_ = 0;
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
    group_ = 0;
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
    group_ = 0;
    looked_at_ = 0;
    if (live_)
        live_->rewind();
    reader_.reset();
    Status found = index_->search(*condition_, rows_);
    if (found.error() == ENOTSUP)
        found = recover(DatabaseResult::failed);
    return found.error() == EAGAIN ? Status() : found;
}

} // namespace host
