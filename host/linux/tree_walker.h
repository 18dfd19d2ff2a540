#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/linux/descriptor.h"
#include "host/linux/directory_stream.h"
#include "host/linux/volume_table.h"
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <vector>

namespace host {

/// Walks the directories of one volume, each directory before what it holds, in the order of the directory
/// entries. Roots of other volumes, what is mounted below and the volume's blob directory are left out;
/// symbolic links are handed out but not followed; a directory that cannot be read, or vanishes, is passed
/// over. Memory is bounded by the depth. One thread at a time; the tree may change meanwhile.
class TreeWalker {
  public:
    struct Entry {
        std::string_view leaf; ///< terminated by a zero byte; valid until the next call
        std::uint64_t inode = 0;
        std::uint64_t directory = 0;   ///< inode of the directory that holds it
        int directory_descriptor = -1; ///< of that directory; not to be read from
        NodeKind kind = NodeKind::other;
    };

    /// ENODEV when there is no such volume.
    static Result<std::unique_ptr<TreeWalker>> open(DeviceId volume);

    /// ENOENT at the end.
    Status next(Entry& entry);

    /// The status that the directory handed out last had when it was opened; null where it could not be
    /// opened, or the last entry was none.
    const struct stat* entered_directory() const;
    const struct stat& root_status() const { return root_status_; }

    /// Tells the directory cache the way to the directory that holds the last entry.
    void remember_directory();
    /// The same for the directory handed out last.
    void remember_entered_directory();

  private:
    struct Frame {
        Frame(Descriptor opened, std::uint64_t number, std::string name)
            : descriptor(std::move(opened)), stream(descriptor.get()), inode(number), leaf(std::move(name)) {}
        Descriptor descriptor;
        DirectoryStream stream;
        std::uint64_t inode = 0;
        std::string leaf;
        bool remembered = false;
    };

    TreeWalker(std::shared_ptr<const VolumeSnapshot> volumes, const Volume& volume);
    enum class Descent { entered, unreadable, border };
    Descent descend(const Entry& entry);
    void remember_frames(std::size_t count);
    bool is_open_above(std::uint64_t inode) const;

    const std::shared_ptr<const VolumeSnapshot> volumes_;
    const Volume& volume_;
    struct stat root_status_ = {};
    struct stat entered_status_ = {};
    bool entered_ = false;
    /// Where the last entry came from; the frames above it are what it led into.
    std::size_t current_ = 0;
    std::vector<std::unique_ptr<Frame>> frames_;
};

} // namespace host
