#pragma once

#include <Volume.h>
#include <memory>
#include <optional>
#include <string>
#include <vector>

struct ChosenVolume {
    BVolume volume;
    std::string name;
    std::string root;
};

/// Every volume, in the roster's order.
std::vector<ChosenVolume> AllVolumes();

/// The volumes whose root directories are named; nothing, with `problem` set, when one of them is no volume's
/// root.
std::optional<std::vector<ChosenVolume>> VolumesOf(const std::vector<std::string>& roots,
                                                   std::string& problem);
