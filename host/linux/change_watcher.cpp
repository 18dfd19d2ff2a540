#include "host/linux/change_watcher.h"

#include "host/api/threads.h"
#include "host/linux/attribute_store.h"
#include "host/linux/directory_cache.h"
#include "host/linux/directory_stream.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/linux/tree_walker.h"
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/inotify.h>
#include <unistd.h>

namespace host {
namespace {

constexpr std::uint32_t kEvents = IN_ATTRIB | IN_CLOSE_WRITE | IN_CREATE | IN_DELETE | IN_MOVED_FROM |
                                  IN_MOVED_TO | IN_ONLYDIR | IN_EXCL_UNLINK;
constexpr std::uint32_t kAllButAttributes = kEvents & ~static_cast<std::uint32_t>(IN_ATTRIB);
constexpr int kDeepest = 200;
// Milliseconds.
constexpr int kNap = 50;

// The number of the watch, or negative.
int add_watch(int notifications, int directory, std::uint32_t events) {
    const std::string path = "/proc/self/fd/" + std::to_string(directory);
    return inotify_add_watch(notifications, path.c_str(), events);
}

} // namespace

ChangeWatcher::ChangeWatcher(DeviceId device, Sink sink, const Limits& limits)
    : device_(device), sink_(std::move(sink)), limits_(limits),
      notifications_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)), wake_(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)),
      thread_([this] { run(); }) {}

ChangeWatcher::~ChangeWatcher() {
    stopping_ = true;
    const std::uint64_t one = 1;
    (void)!::write(wake_.get(), &one, sizeof one);
    thread_.join();
}

void ChangeWatcher::say_limit_once() {
    static std::atomic<bool> said{false};
    limited_ = true;
    if (!said.exchange(true))
        std::fprintf(stderr,
                     "The system's limit of watched directories (fs.inotify.max_user_watches) or watchers "
                     "(fs.inotify.max_user_instances) is reached: "
                     "changes by other programs are looked for every ten minutes.\n");
}

void ChangeWatcher::watch(int directory, std::uint64_t inode) {
    if (limited_)
        return;
    if (directories_.size() >= limits_.directories) {
        say_limit_once();
        return;
    }
    const int number = add_watch(notifications_.get(), directory, kEvents);
    if (number >= 0)
        directories_[number] = inode;
    else if (errno == ENOSPC || errno == EMFILE || errno == ENOMEM || errno == EBADF)
        say_limit_once();
}

bool ChangeWatcher::watch_directory(int directory, Scope scope) {
    if (scope == Scope::everything) {
        const bool watched = add_watch(notifications_.get(), directory, kEvents) >= 0;
        // Somebody took away this user's right to read it: looked at from time to time, as with too many.
        if (!watched)
            limited_ = true;
        return watched;
    }
    return complete_ && !limited_ && add_watch(notifications_.get(), directory, kAllButAttributes) >= 0;
}

void ChangeWatcher::add_all() {
    auto walker = TreeWalker::open(device_);
    if (!walker)
        return;
    const Result<Descriptor> root = VolumeTable::instance().open_root(device_);
    if (root)
        watch(root->get(), (*walker)->root_status().st_ino);
    TreeWalker::Entry entry;
    while (!stopping_ && !limited_ && (*walker)->next(entry).ok()) {
        const struct stat* status = (*walker)->entered_directory();
        if (status == nullptr)
            continue;
        Result<Descriptor> opened = open_directory(entry.directory_descriptor, entry.leaf.data());
        if (opened)
            watch(opened->get(), status->st_ino);
        // So that events name directories that can be found.
        (*walker)->remember_entered_directory();
        (void)read_events();
    }
    complete_ = true;
    if (!stopping_)
        sink_.changes_missed();
}

void ChangeWatcher::run() {
    (void)set_thread_name(current_native_thread(), "change watcher");
    (void)set_thread_schedule(current_native_thread(), {process_niceness() + 10, io_class::idle});
    if (!notifications_.valid())
        say_limit_once();
    add_all();
    while (!stopping_) {
        pollfd waited[2] = {{wake_.get(), POLLIN, 0}, {notifications_.get(), POLLIN, 0}};
        const int ready =
            poll(waited, notifications_.valid() ? 2 : 1, static_cast<int>(limits_.interval.count()));
        if (stopping_)
            return;
        if (ready == 0 && limited_)
            sink_.changes_missed();
        if (ready > 0) {
            // Meanwhile the system makes one event of a file's several, and whoever changed it gets on.
            (void)poll(waited, 1, kNap);
            if (!stopping_ && !read_events())
                sink_.changes_missed();
        }
    }
}

bool ChangeWatcher::read_events() {
    alignas(inotify_event) char buffer[65536];
    bool all = true;
    while (!stopping_ && notifications_.valid()) {
        const ssize_t size = ::read(notifications_.get(), buffer, sizeof buffer);
        if (size <= 0)
            break;
        for (ssize_t position = 0; position < size;) {
            inotify_event event = {};
            std::memcpy(&event, buffer + position, sizeof event);
            const char* name = buffer + position + sizeof event;
            position += static_cast<ssize_t>(sizeof event + event.len);
            if ((event.mask & IN_Q_OVERFLOW) != 0)
                all = false;
            const auto found = directories_.find(event.wd);
            if (found == directories_.end())
                continue;
            const std::uint64_t directory = found->second;
            if ((event.mask & IN_IGNORED) != 0) {
                directories_.erase(found);
                continue;
            }
            if (event.len == 0)
                continue;
            const std::string leaf(name);
            if (leaf == kBlobDirectoryName)
                continue;
            sink_.entry_changed(directory, leaf);
            if ((event.mask & IN_ISDIR) != 0 && (event.mask & (IN_CREATE | IN_MOVED_TO)) != 0)
                directory_came(directory, leaf);
        }
    }
    return all;
}

void ChangeWatcher::directory_came(std::uint64_t parent, const std::string& leaf) {
    DirectoryCache& cache = DirectoryCache::instance();
    const auto above = cache.find(device_, parent, DirectoryCache::Search::hints_only);
    if (!above)
        return;
    Result<Descriptor> opened = open_directory((*above)->descriptor(), leaf.c_str());
    struct stat status = {};
    if (!opened || system_calls().fstat(opened->get(), &status) != 0)
        return;
    cache.remember(device_, status.st_ino, parent, leaf);
    watch_tree(opened->get(), status.st_ino, 0);
}

void ChangeWatcher::watch_tree(int directory, std::uint64_t inode, int depth) {
    const auto volumes = VolumeTable::instance().current();
    const Volume* volume = volumes->find(device_);
    struct stat status = {};
    if (depth > kDeepest || stopping_ || volume == nullptr || system_calls().fstat(directory, &status) != 0 ||
        volumes->is_border(*volume, status.st_dev, status.st_ino))
        return;
    // Watched before it is read: what comes in between is reported twice, but not missed.
    watch(directory, inode);
    Result<Descriptor> readable = reopen_directory(directory);
    if (!readable)
        return;
    DirectoryStream stream(readable->get());
    DirectoryStream::Entry entry;
    while (!stopping_ && stream.next(entry)) {
        const std::string leaf(entry.leaf);
        sink_.entry_changed(inode, leaf);
        if (entry.type != DT_DIR && entry.type != DT_UNKNOWN)
            continue;
        Result<Descriptor> child = open_directory(readable->get(), leaf.c_str());
        if (!child || system_calls().fstat(child->get(), &status) != 0)
            continue;
        DirectoryCache::instance().remember(device_, status.st_ino, inode, leaf);
        watch_tree(child->get(), status.st_ino, depth + 1);
    }
}

} // namespace host
