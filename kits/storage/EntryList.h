// BEntryList: what a directory and a query have in common, entries that come one after the other.
#pragma once

#include <StorageDefs.h>

#include <dirent.h>
#include <limits.h>

class BEntry;
struct entry_ref;

class BEntryList {
  public:
    virtual ~BEntryList();

    // B_ENTRY_NOT_FOUND at the end of the list.
    virtual status_t GetNextEntry(BEntry* entry, bool traverse = false) = 0;
    virtual status_t GetNextRef(entry_ref* ref) = 0;
    // Fills the buffer with at most `count` records that follow one another at a distance of d_reclen bytes.
    // The number of records, 0 at the end; B_BAD_VALUE when not even one fits.
    virtual int32 GetNextDirents(struct dirent* buffer, size_t length, int32 count = INT_MAX) = 0;
    virtual status_t Rewind() = 0;
    virtual int32 CountEntries() = 0;
};
