// The pictures that the gallery's rows show, drawn here.
#pragma once

#include <GraphicsDefs.h>

#include <memory>

class BBitmap;

// 16 x 16 pixels of B_CMAP8, transparent around a disc of one of the system's colours.
std::unique_ptr<BBitmap> MakeDisc(uint8 colorIndex);
// `width` x `height` pixels of B_RGB32: a framed area of one colour.
std::unique_ptr<BBitmap> MakeSwatch(int32 width, int32 height, rgb_color color);
