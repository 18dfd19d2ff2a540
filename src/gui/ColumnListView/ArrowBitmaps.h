// The pictures that mark super-rows.
#pragma once

#include <SupportDefs.h>

// 11 x 11 pixels of B_CMAP8, each row padded to 12 bytes; what is not drawn is transparent.
constexpr int32 kArrowDataBytes = 132;

// To the right: the row is collapsed. Down: it is expanded.
extern const uint8 CLVRightArrowData[kArrowDataBytes];
extern const uint8 CLVDownArrowData[kArrowDataBytes];
