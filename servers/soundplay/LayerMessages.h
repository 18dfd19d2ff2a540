// The messages that the player and its layers take (docs/soundplay.md).
#pragma once

#include <SupportDefs.h>

inline constexpr char kSoundPlaySignature[] = "application/x-marcone-soundplay";

// The code of all commands; which one stands in "command" (int32).
inline constexpr uint32 kLayerCommand = 'abra';

enum : int32 {
    // To the player: opens a layer.
    kNewLayer = 1,
    // To a layer: ends it.
    kDeleteLayer = 3,
    // To a layer: "newref" (entry_ref), "pitch", "abspos", "volume" (doubles), whichever there are.
    kSetValues = 4,
    // To a layer: its values; to the player: those of all layers.
    kGetValues = 5,
};
