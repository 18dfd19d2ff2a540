#include "Commands.h"
#include "VolumeChoice.h"
#include <algorithm>

int ListVolumes(const Request& request, Output& output) {
    if (!request.arguments.empty())
        return Fail("volumes takes no arguments");
    const std::vector<ChosenVolume> volumes = AllVolumes();
    std::size_t name_width = 4;
    std::size_t root_width = 4;
    for (const ChosenVolume& volume : volumes) {
        name_width = std::max(name_width, DisplayWidth(Printable(volume.name)));
        root_width = std::max(root_width, DisplayWidth(Printable(volume.root)));
    }
    if (!output.IsJson())
        output.Line(Padded("device", 20) + "  " + Padded("name", name_width) + "  " +
                    Padded("root", root_width) + "  attributes  queries");
    for (const ChosenVolume& volume : volumes) {
        const auto device = static_cast<std::uint64_t>(volume.volume.Device());
        const bool attributes = volume.volume.KnowsAttr();
        const bool queries = volume.volume.KnowsQuery();
        if (output.IsJson()) {
            // As text: the numbers of declared volumes are larger than what every JSON reader keeps exactly.
            output.Line(JsonObject()
                            .Text("device", std::to_string(device))
                            .Bytes("name", volume.name)
                            .Bytes("root", volume.root)
                            .Flag("attributes", attributes)
                            .Flag("queries", queries)
                            .Take());
        } else {
            output.Line(Padded(std::to_string(device), 20) + "  " +
                        Padded(Printable(volume.name), name_width) + "  " +
                        Padded(Printable(volume.root), root_width) + "  " +
                        Padded(attributes ? "yes" : "no", 10) + "  " + (queries ? "yes" : "no"));
        }
    }
    return 0;
}
