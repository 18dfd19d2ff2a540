// Running a volume's jobs in tests.
#pragma once

#include "TrackVolume.h"
#include "indexing/FileIndexListItem.h"

#include <Directory.h>
#include <Entry.h>
#include <Path.h>
#include <VolumeRoster.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>

// The row of the volume with that root directory.
inline std::unique_ptr<FileIndexListItem> MakeItem(const std::string& root) {
    BVolumeRoster roster;
    BVolume volume;
    while (roster.GetNextVolume(&volume) == B_OK) {
        BDirectory directory;
        BEntry entry;
        BPath path;
        if (volume.GetRootDirectory(&directory) != B_OK || directory.GetEntry(&entry) != B_OK ||
            entry.GetPath(&path) != B_OK || root != path.Path())
            continue;
        auto listEntry = std::make_unique<VolumeListEntry>();
        listEntry->query = std::make_unique<BQuery>();
        listEntry->volume = std::make_unique<BVolume>(volume);
        listEntry->knowsQuery = volume.KnowsQuery();
        return std::make_unique<FileIndexListItem>(listEntry.release());
    }
    ADD_FAILURE() << "no volume at " << root;
    return nullptr;
}

// Polls, as a window does, until the condition holds. False when it does not in time.
template <typename Condition>
[[nodiscard]] bool WaitUntil(Condition condition, bigtime_t patience = 120000000) {
    const bigtime_t limit = system_time() + patience;
    while (!condition()) {
        if (system_time() > limit)
            return false;
        snooze(500);
    }
    return true;
}

inline void RunToEnd(FileIndexListItem& item, void (FileIndexListItem::*start)()) {
    (item.*start)();
    EXPECT_TRUE(WaitUntil([&] { return item.IsDone(); })) << "the job does not end";
}

inline std::string StatusTextOf(const FileIndexListItem& item) {
    char text[kJobStatusTextSize];
    item.GetStatusText(text);
    return text;
}
