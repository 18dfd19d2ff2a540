// BEntry: a place in a directory where a file is, or could be.
#pragma once

#include <EntryRef.h>
#include <Statable.h>

#include <string>

class BDirectory;
class BPath;

// An entry names a directory and a leaf in it; the directory must exist, the leaf need not (then the entry is
// abstract). The entry follows its directory when that is renamed or moved. Nothing is kept open.
// One thread at a time.
//
// A method of an entry that was not set, or set without success, answers B_NO_INIT. Common answers besides:
// B_ENTRY_NOT_FOUND (a directory of the path, or the entry's own directory, is not there), B_NOT_A_DIRECTORY,
// B_NAME_TOO_LONG, B_LINK_LIMIT (a loop of symbolic links), B_PERMISSION_DENIED, B_BAD_VALUE (null or empty
// arguments).
class BEntry : public BStatable {
  public:
    BEntry();
    BEntry(const BDirectory* directory, const char* path, bool traverse = false);
    BEntry(const entry_ref* ref, bool traverse = false);
    BEntry(const char* path, bool traverse = false);
    BEntry(const BEntry& other);
    BEntry& operator=(const BEntry& other);
    ~BEntry() override;

    status_t InitCheck() const;
    // True when there is a file at the entry, a symbolic link that leads nowhere included.
    bool Exists() const;

    // With `traverse` a symbolic link is followed, also several in a row, to the entry that it names; the end
    // of the chain may be abstract. A relative path starts at the directory, or at the current directory.
    status_t SetTo(const BDirectory* directory, const char* path, bool traverse = false);
    status_t SetTo(const entry_ref* ref, bool traverse = false);
    status_t SetTo(const char* path, bool traverse = false);
    void Unset();

    status_t GetRef(entry_ref* ref) const;
    status_t GetPath(BPath* path) const;
    // The directory that holds the entry. The system's root has none: B_ENTRY_NOT_FOUND.
    status_t GetParent(BEntry* entry) const;
    status_t GetParent(BDirectory* directory) const;
    // Into a buffer of B_FILE_NAME_LENGTH bytes.
    status_t GetName(char* buffer) const;

    // Moves the file to another name in its directory, or another path on the same volume. B_FILE_EXISTS when
    // there is something already and `clobber` is false; B_CROSS_DEVICE_LINK for another volume. The entry
    // then names the new place; after a failure it is unchanged.
    status_t Rename(const char* path, bool clobber = false);
    // The same into another directory, under its own leaf when `path` is null.
    status_t MoveTo(BDirectory* directory, const char* path = nullptr, bool clobber = false);
    // Unlinks the file; a directory must be empty (B_DIRECTORY_NOT_EMPTY). The entry becomes abstract.
    status_t Remove();

    // Two entries are equal when they name the same leaf in the same directory, or are both not set.
    bool operator==(const BEntry& other) const;
    bool operator!=(const BEntry& other) const { return !(*this == other); }

  private:
    status_t ReadStat(host::NodeStat* stat) const override;
    status_t WriteStat(const struct stat& stat, uint32 what) override;
    status_t SetToPath(const std::string& path, bool traverse);
    status_t MoveToRef(const entry_ref& goal, bool clobber);
    status_t Fail(status_t status);

    entry_ref mRef;
    status_t mStatus = B_NO_INIT;
};

// The reference of a path; the leaf need not exist. Symbolic links at the end are not followed.
[[nodiscard]] status_t get_ref_for_path(const char* path, entry_ref* ref);
