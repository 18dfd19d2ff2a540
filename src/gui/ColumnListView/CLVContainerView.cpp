#include "gui/ColumnListView/CLVContainerView.h"

#include "gui/ColumnListView/ColumnListView.h"

CLVContainerView::CLVContainerView(ColumnListView* target, uint32 resizing_mode, uint32 flags,
                                   bool horizontal, bool vertical, bool scroll_view_corner,
                                   border_style border)
    : BetterScrollView(nullptr, target, resizing_mode, flags, horizontal, vertical, scroll_view_corner,
                       border) {}
