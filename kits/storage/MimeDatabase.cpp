#include <MimeDatabase.h>

#include <HostConversions.h>
#include <OS.h>

#include "host/api/directories.h"
#include "host/api/file_system.h"

#include <algorithm>
#include <memory>

namespace {

constexpr std::string_view kSuffix = ".mime";
constexpr const char* kLockName = ".lock";
constexpr const char* kTemporaryName = ".new";
// A record holds two small icons and texts; anything much larger is none.
constexpr std::int64_t kLargestRecord = 4 * 1024 * 1024;

std::string DatabasePath() {
    return host::config_directory() + "/mime";
}

// A comma cannot be part of a type.
std::string FileName(std::string_view type) {
    std::string name = FoldedType(type);
    std::replace(name.begin(), name.end(), '/', ',');
    return name + std::string(kSuffix);
}

std::string TypeOfFile(std::string_view name) {
    name.remove_suffix(kSuffix.size());
    std::string type(name);
    std::replace(type.begin(), type.end(), ',', '/');
    return type;
}

host::Result<host::EntryRef> RefOf(const std::string& name) {
    return host::file_system().entry_of(DatabasePath() + "/" + name, host::Follow::no);
}

host::Result<std::unique_ptr<host::Node>> Open(const std::string& name, const host::OpenOptions& options) {
    host::Result<host::EntryRef> ref = RefOf(name);
    if (!ref)
        return ref.status();
    return host::file_system().open(*ref, options);
}

// Makes the database's directory and keeps others from changing records until it is destroyed.
class ChangeLock {
  public:
    status_t Acquire() {
        constexpr bigtime_t kLongestWait = 10'000'000;
        constexpr bigtime_t kPause = 1000;
        if (host::Status status = host::make_directories(DatabasePath()); !status)
            return StatusOf(status);
        host::OpenOptions options;
        options.access = host::Access::read_write;
        options.missing = host::Missing::create;
        host::Result<std::unique_ptr<host::Node>> node = Open(kLockName, options);
        if (!node)
            return StatusOf(node);
        mNode = *std::move(node);
        for (bigtime_t end = system_time() + kLongestWait;;) {
            host::Status status = mNode->lock();
            if (status.error() != EWOULDBLOCK)
                return StatusOf(status);
            if (system_time() > end)
                return B_TIMED_OUT;
            snooze(kPause);
        }
    }

  private:
    // Closing it releases the lock.
    std::unique_ptr<host::Node> mNode;
};

// Whole or not at all, also when the machine stops: the record gets its name when its bytes are on the disk.
status_t Store(std::string_view type, const MimeRecord& record) {
    std::vector<char> bytes;
    if (status_t status = record.Serialize(bytes); status != B_OK)
        return status;
    host::OpenOptions options;
    options.access = host::Access::write;
    options.missing = host::Missing::create;
    options.truncate = host::Truncate::yes;
    host::Result<std::unique_ptr<host::Node>> node = Open(kTemporaryName, options);
    if (!node)
        return StatusOf(node);
    for (size_t written = 0; written < bytes.size();) {
        host::Result<std::size_t> count = (*node)->write_at(static_cast<std::int64_t>(written),
                                                            bytes.data() + written, bytes.size() - written);
        if (!count)
            return StatusOf(count);
        if (*count == 0)
            return B_DEVICE_FULL;
        written += *count;
    }
    if (host::Status status = (*node)->sync(); !status)
        return StatusOf(status);
    host::Result<host::EntryRef> temporary = RefOf(kTemporaryName);
    host::Result<host::EntryRef> goal = RefOf(FileName(type));
    if (!temporary || !goal)
        return StatusOf(temporary ? goal : temporary);
    return StatusOf(host::file_system().rename(*temporary, *goal, host::FileSystem::Replace::yes));
}

} // namespace

status_t MimeDatabase::Read(std::string_view type, MimeRecord& record) {
    host::Result<std::unique_ptr<host::Node>> node = Open(FileName(type), host::OpenOptions());
    if (!node)
        return B_ENTRY_NOT_FOUND;
    host::Result<host::NodeStat> stat = (*node)->stat();
    if (!stat || stat->kind != host::NodeKind::file || stat->size > kLargestRecord)
        return B_ENTRY_NOT_FOUND;
    std::vector<char> bytes(static_cast<size_t>(stat->size));
    size_t filled = 0;
    while (filled < bytes.size()) {
        host::Result<std::size_t> count =
            (*node)->read_at(static_cast<std::int64_t>(filled), bytes.data() + filled, bytes.size() - filled);
        if (!count || *count == 0)
            return B_ENTRY_NOT_FOUND;
        filled += *count;
    }
    return record.Parse(bytes.data(), bytes.size()) == B_OK ? B_OK : B_ENTRY_NOT_FOUND;
}

status_t MimeDatabase::Change(std::string_view type,
                              const std::function<status_t(MimeRecord& record)>& change) {
    ChangeLock lock;
    if (status_t status = lock.Acquire(); status != B_OK)
        return status;
    MimeRecord record(type);
    if (Read(type, record) != B_OK)
        record = MimeRecord(type);
    if (status_t status = change(record); status != B_OK)
        return status;
    return Store(type, record);
}

status_t MimeDatabase::Remove(std::string_view type) {
    if (ChangeTime() == 0)
        return B_OK;
    ChangeLock lock;
    if (status_t status = lock.Acquire(); status != B_OK)
        return status;
    host::Result<host::EntryRef> ref = RefOf(FileName(type));
    host::Status status = ref ? host::file_system().remove(*ref) : ref.status();
    return status.error() == ENOENT ? B_OK : StatusOf(status);
}

status_t MimeDatabase::List(std::vector<std::string>& types) {
    types.clear();
    host::Result<host::EntryRef> ref = host::file_system().entry_of(DatabasePath(), host::Follow::yes);
    if (!ref)
        return B_OK;
    host::Result<host::NodeStat> stat = host::file_system().stat(*ref);
    if (!stat)
        return stat.error() == ENOENT ? B_OK : StatusOf(stat);
    auto reader = host::file_system().read_directory(stat->id);
    if (!reader)
        return StatusOf(reader);
    host::DirectoryReader::Entry entry;
    while ((*reader)->next(entry)) {
        if (!entry.leaf.ends_with(kSuffix))
            continue;
        std::string type = TypeOfFile(entry.leaf);
        MimeRecord record(type);
        if (Read(type, record) == B_OK)
            types.push_back(std::move(type));
    }
    std::sort(types.begin(), types.end());
    return B_OK;
}

int64 MimeDatabase::ChangeTime() {
    host::Result<host::EntryRef> ref = host::file_system().entry_of(DatabasePath(), host::Follow::yes);
    if (!ref)
        return 0;
    host::Result<host::NodeStat> stat = host::file_system().stat(*ref);
    return stat ? stat->change_time : 0;
}
