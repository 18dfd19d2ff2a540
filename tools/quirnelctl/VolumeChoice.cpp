#include "VolumeChoice.h"

#include "Output.h"
#include <Directory.h>
#include <Entry.h>
#include <Path.h>
#include <VolumeRoster.h>
#include <algorithm>
#include <array>

namespace {

ChosenVolume Described(const BVolume& volume) {
    ChosenVolume chosen{volume, {}, {}};
    std::array<char, B_FILE_NAME_LENGTH> name{};
    if (volume.GetName(name.data()) == B_OK)
        chosen.name = name.data();
    BDirectory directory;
    BEntry entry;
    BPath path;
    if (volume.GetRootDirectory(&directory) == B_OK && directory.GetEntry(&entry) == B_OK &&
        entry.GetPath(&path) == B_OK)
        chosen.root = path.Path();
    return chosen;
}

bool IsSameDirectory(const char* one, const char* other) {
    node_ref first;
    node_ref second;
    return BDirectory(one).GetNodeRef(&first) == B_OK && BDirectory(other).GetNodeRef(&second) == B_OK &&
           first == second;
}

} // namespace

std::vector<ChosenVolume> AllVolumes() {
    std::vector<ChosenVolume> volumes;
    BVolumeRoster roster;
    BVolume volume;
    while (roster.GetNextVolume(&volume) == B_OK)
        volumes.push_back(Described(volume));
    return volumes;
}

std::optional<std::vector<ChosenVolume>> VolumesOf(const std::vector<std::string>& roots,
                                                   std::string& problem) {
    std::vector<ChosenVolume> all = AllVolumes();
    std::vector<ChosenVolume> chosen;
    for (const std::string& root : roots) {
        const ChosenVolume* found = nullptr;
        for (const ChosenVolume& candidate : all) {
            if (IsSameDirectory(root.c_str(), candidate.root.c_str()))
                found = &candidate;
        }
        if (found == nullptr) {
            problem = Printable(root) + " is not the root of a volume; 'quirnelctl volumes' lists them, "
                                        "BEKITS_VOLUMES or ~/.config/bekits/volumes declares more";
            return std::nullopt;
        }
        const bool is_chosen = std::any_of(chosen.begin(), chosen.end(), [&](const ChosenVolume& volume) {
            return volume.volume == found->volume;
        });
        if (!is_chosen)
            chosen.push_back(*found);
    }
    return chosen;
}
