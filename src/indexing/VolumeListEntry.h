// One volume as the file indexer lists it.
#pragma once

#include <Query.h>
#include <Volume.h>

#include <memory>

// Made for each persistent volume and handed to its FileIndexListItem, which owns it. A plain record: read by
// its item's thread and job without a lock, never changed once handed over.
struct VolumeListEntry {
    // An empty query that comes with the entry. The jobs make their own.
    std::unique_ptr<BQuery> query;
    std::unique_ptr<BVolume> volume;
    bool knowsQuery = false;
};
