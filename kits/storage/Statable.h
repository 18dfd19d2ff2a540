// BStatable: the questions about a file's size, times, owner and kind that entries and nodes both answer.
#pragma once

#include <StorageDefs.h>

#include <sys/stat.h>
#include <time.h>

class BVolume;
struct node_ref;

namespace host {
struct NodeStat;
}

// Getters fill their argument or leave it alone and answer why: B_BAD_VALUE for a null argument, B_NO_INIT
// for an object without a node, B_ENTRY_NOT_FOUND when the file has gone. Setters change the file at once.
// Symbolic links are not followed. One thread at a time.
class BStatable {
  public:
    virtual ~BStatable();

    // st_dev is the volume's number, as in node_ref; st_ctime moves with every change of the file, attributes
    // included.
    virtual status_t GetStat(struct stat* stat) const;

    bool IsFile() const;
    bool IsDirectory() const;
    bool IsSymLink() const;

    status_t GetNodeRef(node_ref* ref) const;

    status_t GetOwner(uid_t* owner) const;
    status_t SetOwner(uid_t owner);
    status_t GetGroup(gid_t* group) const;
    status_t SetGroup(gid_t group);
    // The permission bits alone, without the kind of the node.
    status_t GetPermissions(mode_t* permissions) const;
    status_t SetPermissions(mode_t permissions);

    status_t GetSize(off_t* size) const;
    status_t GetModificationTime(time_t* time) const;
    status_t SetModificationTime(time_t time);
    // B_UNSUPPORTED where the file system does not record it.
    status_t GetCreationTime(time_t* time) const;
    // Always B_UNSUPPORTED: no file system of this machine lets it be set.
    status_t SetCreationTime(time_t time);
    status_t GetAccessTime(time_t* time) const;
    status_t SetAccessTime(time_t time);

    // B_BAD_VALUE when the file lies on no volume.
    status_t GetVolume(BVolume* volume) const;

  private:
    virtual status_t ReadStat(host::NodeStat* stat) const = 0;
    // `what`: bits of <StatFields.h>.
    virtual status_t WriteStat(const struct stat& stat, uint32 what) = 0;
};
