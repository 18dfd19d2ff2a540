// BScreen: what is known of a screen.
#pragma once

#include <GraphicsDefs.h>
#include <Rect.h>
#include <SupportDefs.h>

class BWindow;

// A snapshot is taken with every call; any thread. Without a display no screen is valid.
class BScreen {
  public:
    explicit BScreen(screen_id id = B_MAIN_SCREEN_ID);
    // The screen on which the most of the window lies.
    explicit BScreen(BWindow* window);
    ~BScreen();

    bool IsValid() const;
    // B_ERROR behind the last one, where it stays.
    status_t SetToNext();
    screen_id ID() const { return mId; }
    // In screen coordinates, the main screen's left top corner at (0, 0) as a rule. An invalid rectangle for
    // an invalid screen.
    BRect Frame() const;
    // The part that panels of the desktop leave free.
    BRect UsableFrame() const;
    color_space ColorSpace() const;
    // The time of one picture, in microseconds, has gone by: nothing here waits for the beam.
    status_t WaitForRetrace();
    status_t WaitForRetrace(bigtime_t timeout);

    uint8 IndexForColor(rgb_color color);
    uint8 IndexForColor(uint8 red, uint8 green, uint8 blue, uint8 alpha = 255);
    rgb_color ColorForIndex(uint8 index);
    uint8 InvertIndex(uint8 index);
    const color_map* ColorMap();

  private:
    screen_id mId;
};
