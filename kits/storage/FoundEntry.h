// An entry that a list has come upon, and its form as a directory record. Internal to the storage kit.
#pragma once

#include <EntryList.h>

#include "host/api/entry.h"

#include <functional>
#include <memory>

struct FoundEntry {
    host::EntryRef ref;
    std::uint64_t inode = 0;
};

// Gives the next entry, or B_ENTRY_NOT_FOUND at the end, or why there is none.
using EntrySource = std::function<status_t(FoundEntry& entry)>;

// Fills a buffer for BEntryList::GetNextDirents(). An entry that is taken from the source but for which no
// room is left goes into `pending`, which the source gives out first.
[[nodiscard]] int32 FillDirents(struct dirent* buffer, size_t length, int32 count, const EntrySource& source,
                                std::unique_ptr<FoundEntry>& pending);
