#include "host/sqlite/row_writer.h"
#include "host/linux/volume_table.h"
#include "host/sqlite/known_directory.h"
#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <tuple>

namespace host {

void RowWriter::reset() {
    attribute_ids_.clear();
    names_.clear();
    known_directories_.clear();
    last_handle_.reset();
    last_directory_ = 0;
}

DirectoryCache::Handle RowWriter::find_directory(const ChangeNote& note) {
    if (note.directory == last_directory_)
        return last_handle_;
    const auto found =
        note.source == ChangeNote::Source::vanished
            ? DirectoryCache::instance().find(device_, note.directory, DirectoryCache::Search::hints_only)
            : find_known_directory(store_, device_, note.directory, searched_in_vain_);
    last_directory_ = note.directory;
    last_handle_ = found ? *found : nullptr;
    last_error_ = found.status();
    return last_handle_;
}

DatabaseResult RowWriter::write(std::vector<ChangeNote>& notes, const std::set<std::string>& indexed,
                                LiveQueries& live) {
    changes_.clear();
    live_changes_.clear();
    left_unread_ = false;
    last_directory_ = 0;
    last_handle_.reset();
    searched_in_vain_ = false;
    for (const ChangeNote& note : notes)
        ++(note.source == ChangeNote::Source::own ? statistics_.reported : statistics_.observed);
    // Equal notes are one, and a directory's notes together need it opened once.
    const auto place = [](const ChangeNote& note) {
        return std::tie(note.directory, note.leaf, note.source);
    };
    std::sort(notes.begin(), notes.end(),
              [&](const ChangeNote& a, const ChangeNote& b) { return place(a) < place(b); });
    notes.erase(std::unique(notes.begin(), notes.end(),
                            [](const ChangeNote& a, const ChangeNote& b) {
                                return a.directory == b.directory && a.leaf == b.leaf;
                            }),
                notes.end());
    const auto listeners = live.any() ? live.all() : std::vector<std::shared_ptr<LiveQuery>>();
    DatabaseResult result = store_.begin();
    if (succeeded(result) && names_.empty())
        result = store_.attributes(names_);
    for (std::size_t i = 0; succeeded(result) && i < notes.size(); ++i)
        result = write_note(notes[i], indexed, listeners);
    const bool erases = std::any_of(changes_.begin(), changes_.end(), [](const auto& c) { return c.erased; });
    // What a volume that went away does not show has not vanished from it.
    if (succeeded(result) && erases && VolumeTable::instance().refresh()->find(device_) == nullptr)
        result = DatabaseResult::failed;
    if (succeeded(result) && !changes_.empty()) {
        std::vector<RowNumber> rows;
        rows.reserve(changes_.size());
        for (const RowChange& change : changes_)
            rows.push_back(change.row);
        result = store_.log_changes(rows, sequence_);
    }
    if (succeeded(result))
        result = store_.commit();
    last_handle_.reset();
    last_directory_ = 0;
    if (!succeeded(result)) {
        store_.roll_back();
        reset();
        changes_.clear();
        return result;
    }
    statistics_.rows_changed += changes_.size();
    for (const LiveChange& change : live_changes_)
        change.query->entry_looked_at(change.directory, change.leaf, change.inode, change.was, change.is);
    return result;
}

DatabaseResult RowWriter::make_record(const EntryState& state, std::vector<std::byte>& record) {
    for (const FileAttribute& attribute : state.attributes) {
        const auto key = std::make_pair(std::string_view(attribute.name), attribute.type);
        auto found = std::find_if(attribute_ids_.begin(), attribute_ids_.end(), [&](const auto& entry) {
            return entry.first.second == key.second && entry.first.first == key.first;
        });
        if (found == attribute_ids_.end()) {
            std::uint32_t id = 0;
            const DatabaseResult result = store_.attribute_id(attribute.name, attribute.type, id);
            if (!succeeded(result))
                return result;
            found = attribute_ids_.emplace(std::make_pair(attribute.name, attribute.type), id).first;
            names_[id] = {attribute.name, attribute.type};
        }
        RecordedAttribute recorded = recorded_form(attribute);
        recorded.id = found->second;
        append_recorded_attribute(record, recorded);
    }
    return DatabaseResult::done;
}

DatabaseResult RowWriter::remember_directory(std::uint64_t directory) {
    while (known_directories_.insert(directory).second) {
        IndexStore::KnownDirectory known;
        DatabaseResult result = store_.directory(directory, known);
        if (result != DatabaseResult::done)
            return result;
        const auto handle =
            DirectoryCache::instance().find(device_, directory, DirectoryCache::Search::hints_only);
        if (!handle)
            return result;
        const auto place = (*handle)->place();
        if (!place)
            return result;
        result = store_.put_directory({directory, place->parent_inode, place->leaf, 0});
        if (!succeeded(result))
            return result;
        if (place->parent_device != (*handle)->file_system_device() || place->parent_inode == directory)
            return result;
        directory = place->parent_inode;
        // Nobody may have been shown it yet, and without it the way to those below would have to be searched.
        if (!DirectoryCache::instance().find(device_, directory, DirectoryCache::Search::hints_only) &&
            !open_parent(**handle))
            return result;
    }
    return DatabaseResult::done;
}

DatabaseResult RowWriter::erase_row(const IndexRow& row) {
    changes_.push_back({row.id, true, {}});
    return store_.erase(row.id);
}

DatabaseResult RowWriter::write_links(const IndexRow& row) {
    std::vector<RowNumber> others;
    DatabaseResult result = store_.rows_of_inode(row.inode, others);
    for (std::size_t i = 0; succeeded(result) && i < others.size(); ++i) {
        if (others[i] == row.id)
            continue;
        IndexRow other;
        result = store_.read(others[i], other);
        if (result != DatabaseResult::row)
            continue;
        if (other.attributes == row.attributes && other.change_time == row.change_time)
            continue;
        other.attributes = row.attributes;
        other.change_time = row.change_time;
        other.links = row.links;
        other.settled = row.settled;
        other.exact = row.exact;
        changes_.push_back({other.id, false, other.attributes});
        result = store_.update(other);
    }
    return result;
}

DatabaseResult RowWriter::write_row(const ChangeNote& note, const IndexRow* old, const EntryState& state) {
    IndexRow row;
    row.directory = note.directory;
    row.name = note.leaf;
    row.inode = state.status.st_ino;
    row.change_time = change_time_of(state.status);
    row.links = S_ISDIR(state.status.st_mode) ? 1 : static_cast<std::uint32_t>(state.status.st_nlink);
    row.settled = state.settled;
    row.exact = state.settled && is_recorded_exactly(state);
    DatabaseResult result = make_record(state, row.attributes);
    if (!succeeded(result))
        return result;
    if (old == nullptr) {
        result = remember_directory(note.directory);
        if (succeeded(result))
            result = store_.insert(row);
    } else {
        row.id = old->id;
        const bool same = old->inode == row.inode && old->change_time == row.change_time &&
                          old->links == row.links && old->settled == row.settled && old->exact == row.exact &&
                          old->attributes == row.attributes;
        if (same)
            return DatabaseResult::done;
        result = store_.update(row);
    }
    if (!succeeded(result))
        return result;
    changes_.push_back({row.id, false, row.attributes});
    return row.links > 1 ? write_links(row) : result;
}

void RowWriter::compare_live(const ChangeNote& note, const IndexRow* old, const EntryState* state,
                             const std::vector<std::shared_ptr<LiveQuery>>& live) {
    for (const auto& query : live) {
        bool was = false;
        if (old != nullptr && query->condition().bound()) {
            EntrySubject before(device_, last_handle_ ? last_handle_->descriptor() : -1, note.leaf);
            before.set_record(old->attributes, names_);
            was = query->condition().holds(before);
        }
        bool is = false;
        if (state != nullptr && last_handle_) {
            EntrySubject after(device_, last_handle_->descriptor(), note.leaf);
            after.set_state(*state);
            is = query->condition().holds(after);
        }
        const std::uint64_t inode = state != nullptr ? state->status.st_ino : old != nullptr ? old->inode : 0;
        live_changes_.push_back({query, note.directory, note.leaf, inode, was, is});
    }
}

// Hits look at the file anyway.
DatabaseResult RowWriter::leave_as_it_is(const ChangeNote& note) {
    left_unread_ |= note.source == ChangeNote::Source::own;
    return DatabaseResult::done;
}

DatabaseResult RowWriter::write_note(const ChangeNote& note, const std::set<std::string>& indexed,
                                     const std::vector<std::shared_ptr<LiveQuery>>& live) {
    IndexRow old;
    const DatabaseResult found = store_.find(note.directory, note.leaf, old);
    if (!succeeded(found))
        return found;
    const IndexRow* old_row = found == DatabaseResult::row ? &old : nullptr;
    const auto directory = find_directory(note);
    EntryState state;
    bool there = false;
    if (directory) {
        if (note.source != ChangeNote::Source::own && old_row != nullptr && old.settled && live.empty()) {
            struct stat status = {};
            if (fstatat(directory->descriptor(), note.leaf.c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0 &&
                status.st_ino == old.inode && change_time_of(status) == old.change_time)
                return DatabaseResult::done;
        }
        ++(note.source == ChangeNote::Source::own ? statistics_.reported_read : statistics_.observed_read);
        const Status read = reader_.read(directory->descriptor(), device_, note.leaf.c_str(), state);
        there = read.ok();
        if (!read.ok() && read.error() != ENOENT && read.error() != ENOTDIR)
            return leave_as_it_is(note);
    } else if (says_nothing_of_the_entry(last_error_.error())) {
        return leave_as_it_is(note);
    }
    if (!live.empty())
        compare_live(note, old_row, there ? &state : nullptr, live);
    const bool wanted = there && std::any_of(state.attributes.begin(), state.attributes.end(),
                                             [&](const auto& a) { return indexed.contains(a.name); });
    if (wanted)
        return write_row(note, old_row, state);
    return old_row != nullptr ? erase_row(old) : DatabaseResult::done;
}

} // namespace host
