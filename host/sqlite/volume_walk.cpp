// The parts of VolumeIndex that go through the volume's directories.

#include "host/linux/directory_cache.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/tree_walker.h"
#include "host/sqlite/volume_index.h"
#include <algorithm>
#include <cerrno>
#include <chrono>
#include <dirent.h>
#include <fcntl.h>
#include <unordered_map>
#include <unordered_set>

namespace host {
namespace {

constexpr std::uint64_t kProgressStep = 2000;
constexpr int kRetrySteps = 100;
constexpr std::chrono::milliseconds kRetryStep{100};
// Clocks of files are coarser than ours.
constexpr std::int64_t kClockSlack = 1'000'000'000;

std::int64_t now() {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
               std::chrono::system_clock::now().time_since_epoch())
        .count();
}

// Tells the directory cache where the directories were that a walk did not meet, so that the writer finds out
// whether they are gone or cannot be read.
void remember_unmet(DeviceId device, const std::vector<IndexStore::KnownDirectory>& listed,
                    const std::vector<IndexStore::KnownDirectory>& met) {
    std::unordered_set<std::uint64_t> passed;
    for (const auto& directory : met)
        passed.insert(directory.inode);
    std::unordered_map<std::uint64_t, const IndexStore::KnownDirectory*> places;
    for (const auto* directories : {&listed, &met}) {
        for (const auto& directory : *directories)
            places[directory.inode] = &directory;
    }
    DirectoryCache& cache = DirectoryCache::instance();
    std::unordered_set<std::uint64_t> remembered;
    for (const auto& directory : listed) {
        if (passed.contains(directory.inode))
            continue;
        // And the way to it.
        for (auto place = places.find(directory.inode);
             place != places.end() && remembered.insert(place->first).second;
             place = places.find(place->second->parent))
            cache.remember(device, place->first, place->second->parent, place->second->name);
    }
}

} // namespace

Status VolumeIndex::walk_volume(Looking looking, const std::atomic<bool>* cancelled,
                                const std::function<bool(std::uint64_t)>& progress, Ground ground) {
    if (ground == Ground::fore)
        ++walks_waiting_;
    MutexLock walking(walk_mutex_);
    if (ground == Ground::fore)
        --walks_waiting_;
    const Status status = walk_locked(looking, cancelled, progress, ground);
    walking.unlock();
    if (ground == Ground::back)
        gave_way_ = status.error() == ECANCELED;
    else if (gave_way_.exchange(false) && !status.ok())
        reconcile_in_background();
    return status;
}

Status VolumeIndex::walk_locked(Looking looking, const std::atomic<bool>* cancelled,
                                const std::function<bool(std::uint64_t)>& progress, Ground ground) {
    const std::int64_t started = now();
    std::size_t indices = 0;
    std::uint64_t losses = 0;
    std::int64_t walked = 0;
    std::int64_t suspect = 0;
    std::set<std::string> indexed;
    bool complete = false;
    {
        MutexLock lock(mutex_);
        if (!open_locked(Opening::only_existing))
            return {};
        complete = !lost_changes_ && store_.meta("complete", 0) != 0;
        // Somebody else's walk was waited for.
        if (complete && looking == Looking::changed_only && ground == Ground::fore && cancelled == nullptr &&
            !progress)
            return {};
        indices = list_.size();
        indexed = indexed_;
        walked = store_.meta("walked", 0);
        suspect = store_.meta("suspect", 0);
        losses = losses_;
    }
    // Rows that are complete stand until the last file has been looked at.
    const bool keeps_rows = complete && looking == Looking::everything;
    if (!complete)
        looking = Looking::everything;
    auto opened = TreeWalker::open(device_);
    if (!opened)
        return opened.status();
    TreeWalker& walker = **opened;
    auto reader = borrow_reader();
    if (!reader)
        return ENOTSUP;
    // A row's number may be given to another file meanwhile, so rows are told apart by where they stand.
    RowNumber largest = 0;
    if (!succeeded(reader->largest_row(largest)))
        return ENOTSUP;
    RowSet seen(static_cast<std::size_t>(largest) + 1);
    std::vector<IndexStore::KnownDirectory> directories;
    std::vector<IndexStore::KnownDirectory> listed;
    if (!succeeded(reader->all_directories(listed)))
        return ENOTSUP;
    std::unordered_set<std::uint64_t> known;
    for (const auto& directory : listed) {
        if (directory.change_time != 0)
            known.insert(directory.inode);
    }
    AttributeNames names;
    if (keeps_rows && !succeeded(reader->attributes(names)))
        return ENOTSUP;
    StateReader states;
    EntryState state;
    std::vector<Finding> findings;
    directories.push_back({walker.root_status().st_ino, walker.root_status().st_ino, ".",
                           change_time_of(walker.root_status())});
    TreeWalker::Entry entry;
    std::uint64_t count = 0;
    Status status;
    while ((status = walker.next(entry)).ok()) {
        if (stopping_ || (cancelled != nullptr && cancelled->load(std::memory_order_relaxed)) ||
            (ground == Ground::back && walks_waiting_ != 0))
            return ECANCELED;
        if (progress && ++count % kProgressStep == 0 && !progress(count))
            return ECANCELED;
        if (const struct stat* directory = walker.entered_directory())
            directories.push_back(
                {directory->st_ino, entry.directory, std::string(entry.leaf), change_time_of(*directory)});
        if (entry.kind != NodeKind::file && entry.kind != NodeKind::directory)
            continue;
        IndexRow row;
        const std::string leaf(entry.leaf);
        const DatabaseResult found = keeps_rows ? reader->find(entry.directory, leaf, row)
                                                : reader->find_place(entry.directory, leaf, row);
        if (!succeeded(found))
            return ENOTSUP;
        if (found == DatabaseResult::row && row.id <= largest)
            seen.insert(row.id);
        if (keeps_rows) {
            if (!states.read(entry.directory_descriptor, device_, leaf.c_str(), state).ok())
                continue;
            const bool wanted = std::any_of(state.attributes.begin(), state.attributes.end(),
                                            [&](const auto& a) { return indexed.contains(a.name); });
            const bool agrees =
                found == DatabaseResult::row ? wanted && row_agrees(row, state, names) : !wanted;
            if (!agrees) {
                walker.remember_directory();
                findings.push_back({entry.directory, leaf});
            }
            continue;
        }
        bool changed = looking == Looking::everything;
        if (!changed) {
            struct stat found_status = {};
            if (system_calls().fstatat(entry.directory_descriptor, leaf.c_str(), &found_status,
                                       AT_SYMLINK_NOFOLLOW) != 0)
                continue;
            const std::int64_t change_time = change_time_of(found_status);
            changed =
                found == DatabaseResult::row
                    ? row.inode != found_status.st_ino || row.change_time != change_time || !row.settled
                    : suspect != 0 || change_time > walked - kClockSlack || !known.contains(entry.directory);
        }
        if (!changed)
            continue;
        walker.remember_directory();
        queue_.put(entry.directory, leaf, ChangeNote::Source::observed);
    }
    if (status.error() != ENOENT)
        return status;
    // What a volume that went away does not show has not vanished from it.
    if (VolumeTable::instance().refresh()->find(device_) == nullptr)
        return ENODEV;
    // Not "observed": these rows may be wrong although their change times are right.
    for (const Finding& finding : findings)
        queue_.put(finding.directory, finding.leaf, ChangeNote::Source::own);
    remember_unmet(device_, listed, directories);
    for (RowNumber id = 1; id <= largest; ++id) {
        IndexRow row;
        if (!seen.holds(id) && reader->read(id, row) == DatabaseResult::row)
            queue_.put(row.directory, row.name, ChangeNote::Source::vanished);
    }
    give_back_reader(std::move(reader));
    queue_.wait_for(queue_.reported());
    const Status finished = finish_walk(directories, started, suspect, losses, indices);
    if (finished.ok() && progress)
        (void)progress(count);
    return finished;
}

Status VolumeIndex::finish_walk(const std::vector<IndexStore::KnownDirectory>& directories,
                                std::int64_t started, std::int64_t suspect, std::uint64_t losses,
                                std::size_t indices) {
    MutexLock lock(mutex_);
    if (losses_ != losses || !store_.is_open())
        return ENOTSUP;
    if (list_.size() != indices)
        return EAGAIN;
    DatabaseResult result = store_.begin();
    if (succeeded(result))
        result = store_.connection().execute("DELETE FROM directory");
    for (std::size_t i = 0; succeeded(result) && i < directories.size(); ++i)
        result = store_.put_directory(directories[i]);
    if (succeeded(result))
        result = store_.set_meta("complete", 1);
    if (succeeded(result))
        result = store_.set_meta("walked", started);
    if (succeeded(result) && store_.meta("suspect", 0) == suspect)
        result = store_.set_meta("suspect", 0);
    if (succeeded(result))
        result = store_.commit();
    if (!succeeded(result)) {
        store_.roll_back();
        lost_changes_ = true;
        return ENOTSUP;
    }
    found_unclean_ = false;
    lost_changes_ = false;
    return {};
}

void VolumeIndex::note_directory(IndexStore& reader, std::uint64_t directory, const Directory& opened,
                                 std::vector<std::uint64_t>* subdirectories) {
    std::vector<IndexRow> rows;
    (void)reader.rows_in(directory, rows);
    std::unordered_set<std::string> indexed;
    for (const IndexRow& row : rows)
        indexed.insert(row.name);
    Result<Descriptor> readable = reopen_directory(opened.descriptor());
    if (!readable)
        return;
    const auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(device_);
    DirectoryStream stream(readable->get());
    DirectoryStream::Entry entry;
    while (stream.next(entry)) {
        const std::string leaf(entry.leaf);
        indexed.erase(leaf);
        struct stat status = {};
        if (system_calls().fstatat(readable->get(), leaf.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0)
            continue;
        const bool is_directory = S_ISDIR(status.st_mode);
        if (is_directory && (leaf == kBlobDirectoryName || volume == nullptr ||
                             volumes->is_border(*volume, status.st_dev, status.st_ino)))
            continue;
        if (is_directory || S_ISREG(status.st_mode))
            queue_.put(directory, leaf, ChangeNote::Source::observed);
        if (is_directory && subdirectories != nullptr) {
            DirectoryCache::instance().remember(device_, status.st_ino, directory, leaf);
            subdirectories->push_back(status.st_ino);
        }
    }
    for (const std::string& leaf : indexed)
        queue_.put(directory, leaf, ChangeNote::Source::observed);
}

Status VolumeIndex::look_at_directories(const std::atomic<bool>* cancelled) {
    auto reader = borrow_reader();
    if (!reader)
        return ENOTSUP;
    std::vector<IndexStore::KnownDirectory> directories;
    if (!succeeded(reader->all_directories(directories)))
        return ENOTSUP;
    DirectoryCache& cache = DirectoryCache::instance();
    std::unordered_set<std::uint64_t> known;
    for (const auto& directory : directories) {
        known.insert(directory.inode);
        cache.remember(device_, directory.inode, directory.parent, directory.name);
    }
    std::vector<IndexStore::KnownDirectory> looked_at;
    std::vector<std::uint64_t> gone;
    std::vector<std::uint64_t> found;
    for (std::size_t i = 0; i < directories.size(); ++i) {
        if (stopping_ || (cancelled != nullptr && cancelled->load(std::memory_order_relaxed)))
            return ECANCELED;
        IndexStore::KnownDirectory directory = directories[i];
        const auto opened = cache.find(device_, directory.inode, DirectoryCache::Search::hints_only);
        struct stat status = {};
        if (!opened || system_calls().fstat((*opened)->descriptor(), &status) != 0) {
            gone.push_back(directory.inode);
            std::vector<IndexRow> rows;
            (void)reader->rows_in(directory.inode, rows);
            for (const IndexRow& row : rows)
                queue_.put(directory.inode, row.name, ChangeNote::Source::own);
            continue;
        }
        if (change_time_of(status) == directory.change_time)
            continue;
        found.clear();
        note_directory(*reader, directory.inode, **opened, &found);
        directory.change_time = change_time_of(status);
        looked_at.push_back(directory);
        for (const std::uint64_t inode : found) {
            const auto child = cache.find(device_, inode, DirectoryCache::Search::hints_only);
            const auto place = child ? (*child)->place() : Result<Directory::Place>(Status(ENOENT));
            if (place && known.insert(inode).second)
                directories.push_back({inode, directory.inode, place->leaf, 0});
            else if (place)
                looked_at.push_back({inode, directory.inode, place->leaf, 0});
        }
    }
    give_back_reader(std::move(reader));
    queue_.wait_for(queue_.reported());
    MutexLock lock(mutex_);
    DatabaseResult result = store_.begin();
    for (const auto& directory : looked_at) {
        if (succeeded(result))
            result = store_.put_directory(directory);
    }
    for (const std::uint64_t inode : gone) {
        if (succeeded(result))
            result = store_.erase_directory(inode);
    }
    if (succeeded(result))
        result = store_.commit();
    if (!succeeded(result))
        store_.roll_back();
    return {};
}

Status VolumeIndex::reconcile(Indexes::Depth depth, const std::atomic<bool>* cancelled) {
    if (!in_use())
        return {};
    (void)flush();
    (void)take_over_dead();
    static const std::atomic<bool> never{false};
    const std::atomic<bool>* flag = cancelled != nullptr ? cancelled : &never;
    bool directories_suffice = depth == Indexes::Depth::directories && is_complete();
    if (directories_suffice) {
        MutexLock lock(mutex_);
        // Changes of attributes that were lost with a process are not to be seen from the directories.
        directories_suffice = !is_suspect_locked();
    }
    const Status status =
        directories_suffice ? look_at_directories(flag) : walk_volume(Looking::changed_only, flag, nullptr);
    return status.error() == EAGAIN || status.error() == ENOTSUP ? Status() : status;
}

Status VolumeIndex::rebuild(const std::function<bool(std::uint64_t)>& progress) {
    if (!in_use())
        return {};
    (void)flush();
    {
        MutexLock lock(mutex_);
        check_file_locked();
        bool sound = store_.is_open();
        if (sound) {
            Statement check = store_.connection().prepare("PRAGMA quick_check(1)");
            sound = check.valid() && check.step() == DatabaseResult::row && check.bytes(0) == "ok";
        }
        if (!sound)
            start_over_locked();
    }
    const auto report = progress ? progress : [](std::uint64_t) { return true; };
    const Status status = walk_volume(Looking::everything, nullptr, report);
    return status.error() == EAGAIN || status.error() == ENOTSUP ? Status() : status;
}

void VolumeIndex::work_in_background() {
    Status status;
    do {
        // Somebody who could not wait may have walked already.
        if (!reconcile_wanted_.exchange(false) && is_complete())
            return;
        status = walk_volume(Looking::changed_only, nullptr, nullptr, Ground::back);
        // The database could not be written: a full disk has time to be seen to.
        for (int i = 0; status.error() == ENOTSUP && i < kRetrySteps && !stopping_; ++i)
            std::this_thread::sleep_for(kRetryStep);
    } while (!stopping_ && (reconcile_wanted_ || status.error() == EAGAIN || status.error() == ENOTSUP));
}

void VolumeIndex::reconcile_in_background() {
    reconcile_wanted_ = true;
    background_.start();
}

} // namespace host
