#pragma once

#include "Output.h"
#include <Message.h>
#include <Messenger.h>
#include <optional>
#include <string>
#include <vector>

/// A layer of the player, as it describes itself (docs/soundplay.md).
struct LayerValues {
    BMessenger messenger; ///< not valid in a layer's own answer
    std::int32_t number = 0;
    std::string name;
    std::string path;
    std::string state;
    std::string error;
    double pitch = 1;
    double position = 0;
    double length = -1;
    double volume = 1;
};

/// The layer at `index` of an answer; nothing when there is none.
std::optional<LayerValues> LayerAt(const BMessage& answer, int32 index);
/// A table with titles, an object a layer as JSON; nothing without layers.
void PrintLayers(const std::vector<LayerValues>& layers, Output& output);
std::string LayerAsJson(const LayerValues& layer);
/// Hours where there are any, minutes and seconds.
std::string TimeText(double seconds);
