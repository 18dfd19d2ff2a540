#include "Commands.h"
#include "Interruption.h"
#include "ProgressLine.h"
#include "VolumeChoice.h"
#include "indexing/FileIndexListItem.h"
#include <OS.h>
#include <Query.h>

namespace {

enum class Job { index, strip };

constexpr bigtime_t kPollInterval = 20'000; // microseconds

std::unique_ptr<FileIndexListItem> RowFor(const ChosenVolume& volume) {
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(volume.volume);
    entry->knowsQuery = volume.volume.KnowsQuery();
    return std::make_unique<FileIndexListItem>(entry.release());
}

/// Runs the job to its end or to an interruption.
int RunJob(const ChosenVolume& volume, Job job, Output& output) {
    const std::unique_ptr<FileIndexListItem> row = RowFor(volume);
    ProgressLine progress;
    if (job == Job::index)
        row->IndexAttributes();
    else
        row->EraseAttributes();
    while (!row->IsDone() && !Interrupted()) {
        progress.Show(Printable(volume.name) + ": " + std::to_string(row->FileCount()) +
                      (job == Job::index ? " files indexed" : " files stripped"));
        snooze(kPollInterval);
    }
    const bool finished = row->IsDone() && row->Progress() == 1.0f;
    const bool interrupted = !row->IsDone();
    row->CancelScan();
    progress.Clear();

    if (output.IsJson()) {
        output.Line(JsonObject()
                        .Bytes("volume", volume.name)
                        .Bytes("root", volume.root)
                        .Text("job", job == Job::index ? "index" : "strip")
                        .Text("state", finished ? "finished" : (interrupted ? "cancelled" : "failed"))
                        .Number("files", row->FileCount())
                        .Take());
    } else if (finished) {
        output.Line((job == Job::index ? "Indexed " : "Stripped ") + std::to_string(row->FileCount()) +
                    " files on " + Printable(volume.name) + " (" + Printable(volume.root) + ")");
    }
    if (interrupted)
        return Fail("cancelled on " + Printable(volume.root) + " after " + std::to_string(row->FileCount()) +
                    " files");
    return finished ? 0 : Fail("the files of " + Printable(volume.root) + " could not be listed");
}

int RunOnVolumes(const Request& request, Job job, Output& output) {
    std::string problem;
    std::vector<ChosenVolume> volumes;
    if (request.arguments.empty()) {
        for (const ChosenVolume& volume : AllVolumes()) {
            if (volume.volume.IsPersistent() && !volume.volume.IsReadOnly() && volume.volume.KnowsAttr() &&
                volume.volume.KnowsQuery())
                volumes.push_back(volume);
        }
        if (volumes.empty())
            return Fail(
                "no volume here can be written, holds attributes and answers queries; 'quirnelctl volumes' "
                "tells which, and queries need a data directory that can be written");
    } else {
        const auto named = VolumesOf(request.arguments, problem);
        if (!named)
            return Fail(problem);
        for (const ChosenVolume& volume : *named) {
            if (!volume.volume.KnowsAttr())
                return Fail(Printable(volume.root) + ": this volume's file system holds no attributes");
            if (!volume.volume.KnowsQuery())
                return Fail(Printable(volume.root) + ": this volume answers no queries");
            if (volume.volume.IsReadOnly())
                return Fail(Printable(volume.root) + ": this volume is read-only");
        }
        volumes = *named;
    }
    CatchInterruptions();
    int status = 0;
    for (const ChosenVolume& volume : volumes) {
        status = RunJob(volume, job, output);
        if (status != 0)
            break;
    }
    return status;
}

} // namespace

int IndexVolumes(const Request& request, Output& output) {
    return RunOnVolumes(request, Job::index, output);
}

int StripVolumes(const Request& request, Output& output) {
    return RunOnVolumes(request, Job::strip, output);
}
