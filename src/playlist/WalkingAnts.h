// The frame of marching stripes that says: let go here.
#pragma once

#include <GraphicsDefs.h>
#include <Rect.h>

class BView;

class WalkingAnts {
  public:
    // Draws the frame two pixels wide and steps on: the stripes of the top and right edges one way, those of
    // the left and bottom edges the other. After eight steps they are where they were.
    void DrawAndStep(BView* view, BRect frame);

  private:
    // White where a bit is set, black elsewhere.
    pattern mTopAndRight = {{0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3}};
    pattern mLeftAndBottom = {{0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3}};
};
