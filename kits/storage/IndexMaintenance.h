// Keeping the attribute indices in order: additions of this library to the platform's calls in <fs_index.h>.
#pragma once

#include <StorageDefs.h>
#include <SupportDefs.h>

#include <functional>

// All calls from any thread; all block until they are done.

// Builds a volume's index anew from the attributes on its files. `progress`, which may be empty, is called on
// this thread with the number of files looked at so far, every few thousand files; when it answers false the
// old index stays and the result is B_CANCELED. B_BAD_VALUE for no volume, B_UNSUPPORTED for one without
// queries.
status_t rebuild_index(dev_t device, const std::function<bool(uint64 files)>& progress);

// Takes in what other programs did to the volume while nobody was watching. B_REFRESH_DIRECTORIES looks at
// the directories that changed (files that came, went or were renamed), B_REFRESH_FILES also at every indexed
// file (attributes changed in place).
enum index_refresh { B_REFRESH_DIRECTORIES, B_REFRESH_FILES };
status_t refresh_index(dev_t device, index_refresh depth);

// Returns when every change made by this process is in the index on disk.
status_t sync_index(dev_t device);

// From now on the indices of all volumes that have one, and of those that are mounted later, take in what
// other programs change: what happened before, in the background at idle priority, and then each change as it
// comes. For programs with a message loop, once the indices have been made; a second call does nothing.
void follow_index_changes();

// Writes everything and ends the threads behind the indices; the next use starts them again. For the end of a
// program.
void close_indices();
