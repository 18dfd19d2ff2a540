// Where the parts of a volume's row lie. Draws nothing.
#pragma once

#include <Point.h>
#include <Rect.h>

// The least that icon, text and bar need from a row's top to its bottom edge.
inline constexpr float kVolumeRowHeight = 20;
inline constexpr float kVolumeRowFontSize = 12;
// What the volume's name has before the bar begins.
inline constexpr float kVolumeNameWidth = 85;

// All in the coordinates of the row's frame, in pixels. Points are baselines.
struct VolumeRowLayout {
    explicit VolumeRowLayout(BRect row);

    BRect icon; // 16 by 16 pixels
    BPoint name;
    BRect bar; // with its outline
    BPoint unsupported;
    BPoint status;
};

// What of a progress bar is filled. A progress below 0, of which the whole is not known, fills all of it.
struct BarFill {
    BarFill(BRect bar, float progress);

    // Not valid where there is nothing of it.
    BRect filled;
    BRect empty;
};
