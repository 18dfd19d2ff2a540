#include "gui/ColumnListView/ScrollExtent.h"

#include <algorithm>

namespace {

float ShownSize(const ScrollExtent& extent) {
    return extent.shownTo - extent.shownFrom;
}

float ContentSize(const ScrollExtent& extent) {
    return std::max(extent.dataTo - extent.dataFrom, ShownSize(extent));
}

} // namespace

float ScrollBackOffset(const ScrollExtent& extent) {
    if (extent.shownFrom < extent.dataFrom) {
        return extent.dataFrom - extent.shownFrom;
    }
    return std::min(0.0F, extent.dataFrom + ContentSize(extent) - extent.shownTo);
}

ScrollBarState BarStateOf(const ScrollExtent& extent, bool scrolling_allowed) {
    const float shown = ShownSize(extent);
    const float from = std::min(extent.dataFrom, extent.shownFrom);
    const float content =
        scrolling_allowed ? ContentSize(extent) : std::max(extent.dataTo, extent.shownTo) - from;
    ScrollBarState state;
    // A view without extent shows all of no content.
    state.proportion = content > 0 ? shown / content : 1;
    if (state.IsScrollable()) {
        state.min = from;
        state.max = std::max(extent.dataFrom + content - shown, extent.shownFrom);
    }
    return state;
}
