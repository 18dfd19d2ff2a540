// CLVContainerView: what frames a ColumnListView, its header and its scroll bars.
#pragma once

#include "gui/ColumnListView/BetterScrollView.h"

class ColumnListView;

// What is added to a window in the list's stead. Made by the list; owns list and header as any view its
// children. Thread rule: that of BView.
class CLVContainerView : public BetterScrollView {
  public:
    CLVContainerView(ColumnListView* target, uint32 resizing_mode, uint32 flags, bool horizontal,
                     bool vertical, bool scroll_view_corner, border_style border);
};
