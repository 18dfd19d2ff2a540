#include "support/Jobs.h"

#include "indexing/FileIndexListItem.h"
#include "samples/SampleLibrary.h"
#include "support/Figures.h"
#include <IndexMaintenance.h>
#include <OS.h>
#include <Query.h>
#include <VolumeRoster.h>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

namespace bench {

double RunJob(const BVolume& volume, Job job, std::size_t expected, const JobWatcher& watcher) {
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(volume);
    entry->knowsQuery = true;
    FileIndexListItem row(entry.release());
    const Stopwatch watch;
    if (job == Job::index)
        row.IndexAttributes();
    else
        row.EraseAttributes();
    while (watcher && !row.IsDone()) {
        watcher(static_cast<std::size_t>(row.FileCount()));
        snooze(500);
    }
    status_t ignored = 0;
    wait_for_thread(row.Thread(), &ignored);
    sync_index(volume.Device());
    const double seconds = watch.Seconds();
    if (static_cast<std::size_t>(row.FileCount()) != expected) {
        std::fprintf(stderr, "the job came to %d files instead of %zu\n", static_cast<int>(row.FileCount()),
                     expected);
        std::exit(1);
    }
    return static_cast<double>(expected) / seconds;
}

void MakeLibrary(const std::filesystem::path& root, std::size_t count) {
    if (const std::string problem = samples::WriteLargeLibrary(root.string(), count); !problem.empty()) {
        std::fprintf(stderr, "%s\n", problem.c_str());
        std::exit(1);
    }
}

BVolume OnlyVolume() {
    BVolumeRoster roster;
    BVolume volume;
    if (roster.GetNextVolume(&volume) != B_OK || !volume.KnowsQuery()) {
        std::fprintf(stderr, "this folder's file system holds no attributes\n");
        std::exit(1);
    }
    return volume;
}

bool Apart(const std::function<bool()>& work) {
    std::fflush(stdout);
    const pid_t child = fork();
    if (child == 0)
        _exit(work() ? 0 : 1);
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

} // namespace bench
