#include "host/sqlite/own_work.h"
#include "host/linux/attribute_store.h"
#include "host/linux/directory_stream.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/sqlite/entry_state.h"
#include <algorithm>
#include <cerrno>
#include <ctime>
#include <fcntl.h>
#include <iterator>

namespace host {
namespace {

// So many changes after the first.
constexpr int kWork = 16;
// Enough for most directories in one go.
constexpr std::size_t kBufferSize = 8192;

std::int64_t nanoseconds(const timespec& time) {
    return time.tv_sec * 1'000'000'000 + time.tv_nsec;
}

// The clock by which file systems give their times.
std::int64_t file_time() {
    timespec now = {};
    clock_gettime(CLOCK_REALTIME_COARSE, &now);
    return nanoseconds(now);
}

} // namespace

void OwnWork::follow(ChangeWatcher* watcher) {
    MutexLock lock(mutex_);
    watcher_ = watcher;
    narrowed_.reset();
    in_a_row_ = 0;
}

void OwnWork::changed_in(std::uint64_t directory, std::uint64_t reported) {
    MutexLock lock(mutex_);
    if (watcher_ == nullptr)
        return;
    const Clock::time_point now = Clock::now();
    in_a_row_ = now - last_change_ <= limits_.pause ? std::min(in_a_row_ + 1, kWork) : 0;
    last_change_ = now;
    if (narrowed_ && visit_.directory == directory)
        return;
    leave_locked(reported);
    if (in_a_row_ < kWork)
        return;
    const auto opened =
        DirectoryCache::instance().find(device_, directory, DirectoryCache::Search::hints_only);
    struct stat status = {};
    if (!opened || system_calls().fstat((*opened)->descriptor(), &status) != 0 ||
        status.st_size > limits_.largest_directory)
        return;
    visit_ = {directory, file_time(), now, 0};
    if (watcher_->watch_directory((*opened)->descriptor(), ChangeWatcher::Scope::all_but_attributes))
        narrowed_ = *opened;
}

void OwnWork::leave_locked(std::uint64_t position) {
    if (!narrowed_)
        return;
    if (!watcher_->watch_directory(narrowed_->descriptor(), ChangeWatcher::Scope::everything))
        watch_lost_ = true;
    narrowed_.reset();
    // Where the clock was set back, changes have times from before the visit began.
    const auto length = std::chrono::nanoseconds(Clock::now() - visit_.began).count();
    visit_.since = std::min(visit_.since, file_time() - length) - limits_.telling_time.count();
    visit_.position = position;
    left_.push_back(visit_);
}

std::vector<OwnWork::Visit> OwnWork::take_left(std::uint64_t position, std::uint64_t reported, bool& all) {
    MutexLock lock(mutex_);
    if (narrowed_ && (reported <= position || Clock::now() - visit_.began > limits_.longest_visit))
        leave_locked(position);
    all = !watch_lost_;
    watch_lost_ = false;
    const auto end = std::find_if(left_.begin(), left_.end(),
                                  [&](const Visit& visit) { return visit.position > position; });
    std::vector<Visit> taken(left_.begin(), end);
    left_.erase(left_.begin(), end);
    return taken;
}

bool OwnWork::look_over(std::vector<ChangeNote>& group, std::uint64_t position, std::uint64_t reported) {
    bool all = true;
    std::vector<Visit> visits = take_left(position, reported, all);
    if (visits.empty())
        return all;
    // Several visits to a directory are one, since the first.
    std::sort(visits.begin(), visits.end(), [](const Visit& a, const Visit& b) {
        return a.directory != b.directory ? a.directory < b.directory : a.since < b.since;
    });
    visits.erase(std::unique(visits.begin(), visits.end(),
                             [](const Visit& a, const Visit& b) { return a.directory == b.directory; }),
                 visits.end());
    std::unordered_map<std::uint64_t, Leaves> in_hand;
    for (const Visit& visit : visits)
        in_hand[visit.directory];
    for (const ChangeNote& note : group) {
        const auto found = in_hand.find(note.directory);
        if (found != in_hand.end() && note.source != ChangeNote::Source::vanished)
            found->second.insert(note.leaf);
    }
    std::vector<ChangeNote> found;
    for (const Visit& visit : visits)
        all &= look_into(visit, in_hand[visit.directory], found);
    std::move(found.begin(), found.end(), std::back_inserter(group));
    return all;
}

bool OwnWork::look_into(const Visit& visit, const Leaves& in_hand, std::vector<ChangeNote>& found) {
    // Seldom gone, and then a walk in the background costs less than a search here.
    const auto opened =
        DirectoryCache::instance().find(device_, visit.directory, DirectoryCache::Search::hints_only);
    if (!opened)
        return false;
    Result<Descriptor> readable = reopen_directory((*opened)->descriptor());
    if (!readable)
        return readable.error() == ENOENT;
    DirectoryStream stream(readable->get(), kBufferSize);
    DirectoryStream::Entry entry;
    while (stream.next(entry)) {
        if (entry.leaf == kBlobDirectoryName || in_hand.contains(entry.leaf))
            continue;
        struct stat status = {};
        const bool seen =
            system_calls().fstatat(readable->get(), entry.leaf.data(), &status, AT_SYMLINK_NOFOLLOW) == 0;
        if (!seen || change_time_of(status) >= visit.since)
            found.push_back({visit.directory, std::string(entry.leaf), ChangeNote::Source::observed});
    }
    return stream.error() == 0;
}

} // namespace host
