#pragma once

#include "host/api/entry.h"
#include "host/api/predicate.h"
#include "host/api/result.h"
#include <atomic>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace host {

/// Hands out the hits of one query. One thread at a time. Every hit was looked at on the file system just
/// before it is returned. Destruction ends the query, live updates included.
class RunningQuery {
  public:
    virtual ~RunningQuery() = default;

    struct Hit {
        EntryRef ref;
        std::uint64_t inode = 0;
    };
    /// ENOENT at the end; ENODEV when the volume has gone.
    virtual Status next(Hit& hit) = 0;
    virtual Status rewind() = 0;
};

/// An entry began or ceased to satisfy a live query. Called on a thread of the host's; must not block.
struct QueryUpdate {
    enum class Change { entered, left };
    Change change = Change::entered;
    EntryRef ref;
    std::uint64_t inode = 0;
};
using QueryListener = std::function<void(const QueryUpdate&)>;

struct IndexInfo {
    std::string attribute;
    std::uint32_t type = 0;
    std::int64_t size = 0;              ///< bytes used, as far as it can be told apart
    std::int64_t creation_time = 0;     ///< nanoseconds since 1970
    std::int64_t modification_time = 0; ///< nanoseconds since 1970
    std::uint32_t user = 0;
    std::uint32_t group = 0;
};

/// Position of a reported change in a volume's queue. As long as the queue has not taken it, further changes
/// of the same file need no new report.
struct ChangeTicket {
    std::uint64_t position = 0;
    const std::atomic<std::uint64_t>* taken = nullptr;

    bool still_queued() const {
        return taken != nullptr && taken->load(std::memory_order_seq_cst) < position;
    }
};

/// The attribute indices of all volumes. The attributes on the files are the truth; an index that is missing,
/// damaged or of another version is rebuilt and never an error to the caller. All calls from any thread.
class Indexes {
  public:
    virtual ~Indexes() = default;

    /// EEXIST when there is one already (of whatever type), EROFS/ENOTSUP when the volume cannot have any,
    /// ENODEV.
    virtual Status create(DeviceId volume, const std::string& attribute, std::uint32_t type) = 0;
    virtual Status remove(DeviceId volume, const std::string& attribute) = 0;
    /// In order of creation; "name", "size" and "last_modified", which every volume answers, come first.
    virtual Result<std::vector<IndexInfo>> list(DeviceId volume) = 0;

    /// A query in any process sees every change that was made through this library before the call. With a
    /// listener the query stays live until the RunningQuery is destroyed.
    virtual Result<std::unique_ptr<RunningQuery>>
    query(DeviceId volume, std::shared_ptr<const Predicate> predicate, QueryListener listener) = 0;

    /// Reports that the attributes of this entry's file have just been changed. Never blocks on disk; returns
    /// a ticket without queue where the volume has no index.
    virtual ChangeTicket attributes_changed(const EntryRef& ref) = 0;

    /// Reports that an entry came, went, or was renamed through this library.
    virtual void entry_changed(const EntryRef& ref) = 0;

    /// Follows other programs' changes on all volumes from now on: watches directories and reconciles in the
    /// background at idle priority; volumes that are mounted later are followed too. Called once by programs
    /// with a message loop; later calls do nothing.
    virtual void follow_changes() = 0;

    /// Brings the index up to date with directories that changed since it last looked, and (thorough) with
    /// every indexed file. After a process died with changes not yet written, either depth is thorough.
    /// Blocks. `cancelled` may be null.
    enum class Depth { directories, thorough };
    virtual Status reconcile(DeviceId volume, Depth depth, const std::atomic<bool>* cancelled) = 0;

    /// Builds the volume's index anew from the attributes. `progress` is called with the number of files
    /// looked at, every few thousand files, on the calling thread; it answers false to cancel (ECANCELED, the
    /// old rows then stand).
    virtual Status rebuild(DeviceId volume, const std::function<bool(std::uint64_t)>& progress) = 0;

    /// Returns when all changes reported so far are committed.
    virtual Status flush(DeviceId volume) = 0;

    /// Commits, stops following, ends all threads and closes all databases; the next call opens them again.
    /// Called at the end of a program.
    virtual void shut_down() = 0;
};

Indexes& indexes();

} // namespace host
