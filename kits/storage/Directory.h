// BDirectory: an open directory, its entries, and the making of new ones.
#pragma once

#include <EntryList.h>
#include <Node.h>

class BFile;
class BSymLink;
struct FoundEntry;

namespace host {
class DirectoryReader;
}

// The directory stays the same one when it is renamed or moved. A symbolic link to a directory is followed
// when it is opened. The list of entries leaves out "." and "..". Each copy has its own place in the list, at
// its start. One thread at a time.
class BDirectory : public BNode, public BEntryList {
  public:
    BDirectory();
    BDirectory(const entry_ref* ref);
    BDirectory(const node_ref* ref);
    BDirectory(const BEntry* entry);
    BDirectory(const char* path);
    BDirectory(const BDirectory* directory, const char* path);
    BDirectory(const BDirectory& other);
    BDirectory& operator=(const BDirectory& other);
    ~BDirectory() override;

    // B_NOT_A_DIRECTORY for a file, B_ENTRY_NOT_FOUND for nothing.
    status_t SetTo(const entry_ref* ref);
    status_t SetTo(const node_ref* ref);
    status_t SetTo(const BEntry* entry);
    status_t SetTo(const char* path);
    status_t SetTo(const BDirectory* directory, const char* path);
    void Unset();

    // The entry by which the directory is known in the one that holds it.
    status_t GetEntry(BEntry* entry) const;
    bool IsRootDirectory() const;

    // The entry at a path below this directory; B_ENTRY_NOT_FOUND when nothing is there. Without a directory
    // set the path starts at the current one.
    status_t FindEntry(const char* path, BEntry* entry, bool traverse = false) const;
    // True when there is such a file of one of these kinds (node_flavor) below this directory, at any depth.
    bool Contains(const char* path, int32 nodeFlags = B_ANY_NODE) const;
    bool Contains(const BEntry* entry, int32 nodeFlags = B_ANY_NODE) const;
    status_t GetStatFor(const char* path, struct stat* stat) const;

    status_t GetNextEntry(BEntry* entry, bool traverse = false) override;
    status_t GetNextRef(entry_ref* ref) override;
    int32 GetNextDirents(struct dirent* buffer, size_t length, int32 count = INT_MAX) override;
    status_t Rewind() override;
    // Counts all entries and leaves the place in the list alone.
    int32 CountEntries() override;

    // B_FILE_EXISTS when there is something already (for a file: when `failIfExists`; otherwise it is
    // emptied). `directory`, `file` and `link` may be null, or this directory itself.
    status_t CreateDirectory(const char* path, BDirectory* directory);
    status_t CreateFile(const char* path, BFile* file, bool failIfExists = false);
    status_t CreateSymLink(const char* path, const char* linkToPath, BSymLink* link);

  private:
    status_t NextEntry(FoundEntry& entry);
    status_t SetToNode(const node_ref& node);

    node_ref mDirectory;
    // Made by the first question for an entry.
    std::unique_ptr<host::DirectoryReader> mReader;
    // Read for GetNextDirents(), but too large for what was left of its buffer.
    std::unique_ptr<FoundEntry> mPending;
};

// Makes a directory and those above it that are missing. An existing directory is success; something else
// under that name is B_NOT_A_DIRECTORY.
status_t create_directory(const char* path, mode_t mode);
