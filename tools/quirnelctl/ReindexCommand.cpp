#include "Commands.h"
#include "Interruption.h"
#include "VolumeChoice.h"
#include <Errors.h>
#include <IndexMaintenance.h>

int ReindexVolumes(const Request& request, Output& output) {
    std::string problem;
    std::vector<ChosenVolume> volumes;
    if (request.arguments.empty()) {
        for (const ChosenVolume& volume : AllVolumes()) {
            if (volume.volume.IsPersistent() && volume.volume.KnowsQuery())
                volumes.push_back(volume);
        }
        if (volumes.empty())
            return Fail("no volume here answers queries");
    } else if (const auto named = VolumesOf(request.arguments, problem)) {
        volumes = *named;
    } else {
        return Fail(problem);
    }
    CatchInterruptions();
    for (const ChosenVolume& volume : volumes) {
        std::uint64_t looked_at = 0;
        const status_t status = rebuild_index(volume.volume.Device(), [&](std::uint64_t files) {
            looked_at = files;
            return !Interrupted();
        });
        if (status == B_CANCELED)
            return Fail("cancelled; the index of " + Printable(volume.root) + " is as it was");
        if (status != B_OK)
            return Fail(Printable(volume.root) + ": " + strerror(status));
        if (output.IsJson()) {
            output.Line(JsonObject()
                            .Bytes("volume", volume.name)
                            .Bytes("root", volume.root)
                            .Number("files", static_cast<std::int64_t>(looked_at))
                            .Take());
        } else {
            output.Line("Rebuilt the index of " + Printable(volume.name) + " (" + Printable(volume.root) +
                        "), " + std::to_string(looked_at) + " files looked at");
        }
    }
    return 0;
}
