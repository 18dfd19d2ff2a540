// ScrollViewCorner: the square where two scroll bars meet.
#pragma once

#include <View.h>

// 15 pixels square at (left, top); follows the right and bottom sides.
class ScrollViewCorner : public BView {
  public:
    ScrollViewCorner(float left, float top);
    void Draw(BRect update_rect) override;
};
