#include "host/sqlite/volume_index.h"
#include "host/api/threads.h"
#include "host/linux/opening.h"
#include "host/linux/volume_table.h"
#include <algorithm>
#include <cerrno>
#include <chrono>
#include <sys/stat.h>
#include <unistd.h>

namespace host {
namespace {

std::int64_t now() {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
               std::chrono::system_clock::now().time_since_epoch())
        .count();
}

} // namespace

VolumeIndex::VolumeIndex(DeviceId device, const std::string& stable_key)
    : device_(device), stable_key_(stable_key), files_(stable_key), own_work_(device),
      writer_(device, store_) {}

VolumeIndex::~VolumeIndex() {
    stopping_ = true;
    queue_.stop();
    std::unique_ptr<ChangeWatcher> watcher;
    {
        MutexLock lock(watcher_mutex_);
        own_work_.follow(nullptr);
        watcher = std::move(watcher_);
    }
    // Its thread may be about to start a walk.
    watcher.reset();
    background_.stop();
    std::thread writer;
    {
        MutexLock lock(mutex_);
        writer.swap(writer_thread_);
    }
    if (writer.joinable())
        writer.join();
    readers_.clear();
    MutexLock lock(mutex_);
    if (store_.is_open() && dirty_ && !lost_changes_ && !found_unclean_ && !is_suspect_locked() &&
        !slots_.others_alive() && volume_is_written())
        (void)store_.set_meta("clean", 1);
    store_.close();
    queue_.show_in(nullptr);
    slots_.close();
}

// What still waits in memory goes with a device that is pulled out, and rows that tell of it would be wrong.
bool VolumeIndex::volume_is_written() const {
    const Result<Descriptor> root = VolumeTable::instance().open_root(device_);
    if (!root)
        return false;
    const Result<Descriptor> readable = reopen_directory(root->get());
    return readable && ::syncfs(readable->get()) == 0;
}

bool VolumeIndex::open_store_locked() {
    DatabaseResult result = store_.open(files_.database(), Connection::Mode::create);
    if (result == DatabaseResult::damaged) {
        files_.discard_database();
        result = store_.open(files_.database(), Connection::Mode::create);
    }
    if (!succeeded(result))
        return false;
    files_.protect();
    database_inode_ = files_.database_inode();
    std::vector<ListedIndex> listed;
    if (!succeeded(store_.indices(listed))) {
        store_.close();
        return false;
    }
    if (listed.empty()) {
        // A fresh database: what is indexed outlives its predecessor.
        listed = files_.read_list();
        for (const ListedIndex& index : listed)
            (void)store_.add_index(index);
    }
    list_ = std::move(listed);
    indexed_.clear();
    for (const ListedIndex& index : list_)
        indexed_.insert(index.attribute);
    found_unclean_ = store_.meta("clean", 0) == 0 && !dirty_;
    return true;
}

bool VolumeIndex::open_locked(Opening opening) {
    if (store_.is_open())
        return true;
    if (opening == Opening::only_existing && !files_.exist())
        return false;
    if (!files_.make_directory().ok() || !open_store_locked())
        return false;
    if (slots_.open(files_.slots()))
        queue_.show_in(slots_.own());
    if (changes_missed_.exchange(false)) {
        mark_incomplete_locked();
        background_.start();
    }
    if (slots_.take_over_dead() || (found_unclean_ && !slots_.others_alive()))
        mark_suspect_locked();
    if (is_suspect_locked())
        reconcile_in_background();
    if (!writer_thread_.joinable() && !stopping_)
        writer_thread_ = std::thread([this] { write_groups(); });
    open_ = true;
    return true;
}

void VolumeIndex::let_go_locked() {
    writer_.reset();
    store_.close();
    columns_.clear();
    readers_.clear();
}

void VolumeIndex::start_over_locked() {
    let_go_locked();
    files_.discard_database();
    (void)open_store_locked();
}

void VolumeIndex::check_file_locked() {
    if (store_.is_open() && files_.database_inode() == database_inode_)
        return;
    let_go_locked();
    (void)open_store_locked();
}

void VolumeIndex::mark_incomplete_locked() {
    lost_changes_ = true;
    ++losses_;
    (void)store_.set_meta("complete", 0);
}

void VolumeIndex::mark_suspect_locked() {
    found_unclean_ = true;
    // A mark of its own each time: a walk takes away only the one that it began with.
    if (!succeeded(store_.set_meta("suspect", now())))
        mark_incomplete_locked();
}

bool VolumeIndex::is_suspect_locked() {
    return store_.meta("suspect", 0) != 0;
}

bool VolumeIndex::take_over_dead() {
    if (!slots_.take_over_dead())
        return false;
    MutexLock lock(mutex_);
    mark_suspect_locked();
    return true;
}

Status VolumeIndex::create(const std::string& attribute, std::uint32_t type) {
    if (attribute.empty())
        return EINVAL;
    if (attribute == "name" || attribute == "size" || attribute == "last_modified")
        return EEXIST;
    {
        MutexLock lock(mutex_);
        if (!open_locked(Opening::create))
            return ENOTSUP;
        check_file_locked();
        std::vector<ListedIndex> listed;
        if (succeeded(store_.indices(listed)))
            list_ = listed;
        for (const ListedIndex& index : list_) {
            if (index.attribute == attribute)
                return EEXIST;
        }
        const ListedIndex index = {attribute, type, now()};
        if (!succeeded(store_.begin()))
            return EIO;
        if (!succeeded(store_.add_index(index)) || !succeeded(store_.set_meta("complete", 0)) ||
            !succeeded(store_.commit())) {
            store_.roll_back();
            return EIO;
        }
        list_.push_back(index);
        indexed_.insert(attribute);
        (void)files_.write_list(list_);
        files_.protect();
    }
    background_.start();
    return {};
}

Status VolumeIndex::remove(const std::string& attribute) {
    MutexLock lock(mutex_);
    if (!open_locked(Opening::only_existing))
        return ENOENT;
    const auto found = std::find_if(list_.begin(), list_.end(), [&attribute](const ListedIndex& index) {
        return index.attribute == attribute;
    });
    if (found == list_.end())
        return ENOENT;
    if (!succeeded(store_.remove_index(attribute)))
        return EIO;
    list_.erase(found);
    indexed_.erase(attribute);
    return files_.write_list(list_);
}

std::vector<IndexInfo> VolumeIndex::list() {
    std::vector<IndexInfo> result;
    MutexLock lock(mutex_);
    if (!open_locked(Opening::only_existing))
        return result;
    check_file_locked();
    std::vector<ListedIndex> listed;
    if (succeeded(store_.indices(listed)))
        list_ = listed;
    indexed_.clear();
    struct stat status = {};
    (void)::stat(files_.database().c_str(), &status);
    for (const ListedIndex& index : list_) {
        indexed_.insert(index.attribute);
        IndexInfo info;
        info.attribute = index.attribute;
        info.type = index.type;
        info.creation_time = index.created;
        info.modification_time = status.st_mtim.tv_sec * 1'000'000'000 + status.st_mtim.tv_nsec;
        info.size = status.st_size / static_cast<std::int64_t>(list_.size());
        info.user = status.st_uid;
        info.group = status.st_gid;
        result.push_back(info);
    }
    return result;
}

bool VolumeIndex::in_use() {
    if (open_.load(std::memory_order_acquire))
        return true;
    if (!files_.exist())
        return false;
    MutexLock lock(mutex_);
    return open_locked(Opening::only_existing);
}

ChangeTicket VolumeIndex::attributes_changed(const EntryRef& ref) {
    if (!in_use()) {
        if (files_.exist())
            changes_missed_ = true;
        return {};
    }
    own_work_.changed_in(ref.directory, queue_.reported());
    return queue_.put(ref.directory, ref.leaf, ChangeNote::Source::own);
}

void VolumeIndex::entry_changed(const EntryRef& ref) {
    (void)attributes_changed(ref);
}

void VolumeIndex::entry_observed(std::uint64_t directory, const std::string& leaf,
                                 ChangeNote::Source source) {
    queue_.put(directory, leaf, source);
}

void VolumeIndex::write_groups() {
    (void)set_thread_name(current_native_thread(), "index writer");
    std::vector<ChangeNote> group;
    std::uint64_t position = 0;
    while (queue_.take(group, position)) {
        if (!own_work_.look_over(group, position, queue_.reported()))
            reconcile_in_background();
        bool written = write_group(group);
        if (queue_.overflowed()) {
            MutexLock lock(mutex_);
            mark_incomplete_locked();
            written = false;
        }
        queue_.set_committed(position);
        if (!written)
            background_.start();
    }
}

bool VolumeIndex::write_group(std::vector<ChangeNote>& group) {
    MutexLock lock(mutex_);
    check_file_locked();
    if (!store_.is_open()) {
        lost_changes_ = true;
        ++losses_;
        return true;
    }
    // A power cut may take what was written last, but not the mark that something was.
    if (!dirty_ && succeeded(store_.set_meta_durably("clean", 0)))
        dirty_ = true;
    const DatabaseResult result = writer_.write(group, indexed_, live_);
    if (result == DatabaseResult::done) {
        // Checked when somebody reconciles, not at once: the medium is no better then.
        if (writer_.left_unread())
            mark_suspect_locked();
        if (!writer_.changes().empty())
            columns_.apply(store_, writer_.changes(), writer_.sequence());
        return !lost_changes_;
    }
    if (result == DatabaseResult::damaged)
        start_over_locked();
    mark_incomplete_locked();
    return result != DatabaseResult::failed;
}

Status VolumeIndex::flush() {
    if (open_.load(std::memory_order_acquire))
        queue_.wait_for(queue_.reported());
    return {};
}

bool VolumeIndex::is_complete() {
    MutexLock lock(mutex_);
    return store_.is_open() && !lost_changes_ && store_.meta("complete", 0) != 0;
}

Status VolumeIndex::search(const Condition& condition, std::vector<RowNumber>& rows) {
    rows.clear();
    if (!in_use())
        return files_.exist() ? Status(ENOTSUP) : Status();
    (void)flush();
    slots_.wait_for_others();
    if (take_over_dead())
        reconcile_in_background();
    for (int attempt = 0; attempt < 3; ++attempt) {
        {
            MutexLock lock(mutex_);
            check_file_locked();
            if (indexed_.empty())
                return {};
        }
        if (!is_complete()) {
            const Status walked = walk_volume(Looking::changed_only, nullptr, nullptr);
            if (walked.error() == ENODEV)
                return walked;
            if (walked.error() == EAGAIN)
                continue;
            if (!is_complete())
                return ENOTSUP;
        }
        auto reader = borrow_reader();
        if (!reader)
            return ENOTSUP;
        const DatabaseResult result = columns_.find(*reader, condition, rows);
        if (succeeded(result)) {
            give_back_reader(std::move(reader));
            return {};
        }
        reader.reset();
        if (result != DatabaseResult::damaged)
            return ENOTSUP;
        report_damage();
    }
    return ENOTSUP;
}

void VolumeIndex::report_damage() {
    MutexLock lock(mutex_);
    start_over_locked();
}

WriterStatistics VolumeIndex::statistics() {
    MutexLock lock(mutex_);
    return writer_.statistics();
}

void VolumeIndex::follow() {
    MutexLock lock(watcher_mutex_);
    if (watcher_ || stopping_)
        return;
    ChangeWatcher::Sink sink;
    sink.entry_changed = [this](std::uint64_t directory, const std::string& leaf) {
        entry_observed(directory, leaf, ChangeNote::Source::observed);
    };
    sink.changes_missed = [this] { reconcile_in_background(); };
    watcher_ = std::make_unique<ChangeWatcher>(device_, std::move(sink));
    // The change times of files over a network come from another machine's clock.
    const Result<VolumeInfo> info = VolumeTable::instance().info(device_);
    if (info && !info->shared)
        own_work_.follow(watcher_.get());
}

} // namespace host
