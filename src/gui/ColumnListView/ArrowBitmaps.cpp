#include "gui/ColumnListView/ArrowBitmaps.h"

#include <GraphicsDefs.h>

namespace {

// Indices of the system's colours: two greys.
constexpr uint8 kEdge = 8;
constexpr uint8 kFill = 23;
constexpr uint8 kNone = B_TRANSPARENT_MAGIC_CMAP8;

} // namespace

// clang-format off
const uint8 CLVRightArrowData[kArrowDataBytes] = {
    kNone, kNone, kNone, kEdge, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kEdge, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kEdge, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kEdge, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kFill, kEdge, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kFill, kFill, kEdge, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kFill, kEdge, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kEdge, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kEdge, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kEdge, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
};

const uint8 CLVDownArrowData[kArrowDataBytes] = {
    kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kEdge, kNone,
    kNone, kEdge, kFill, kFill, kFill, kFill, kFill, kFill, kFill, kEdge, kNone, kNone,
    kNone, kNone, kEdge, kFill, kFill, kFill, kFill, kFill, kEdge, kNone, kNone, kNone,
    kNone, kNone, kNone, kEdge, kFill, kFill, kFill, kEdge, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kEdge, kFill, kEdge, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kNone, kEdge, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
    kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone, kNone,
};
// clang-format on
