// The 256 colours of B_CMAP8 pixels.
#pragma once

#include <GraphicsDefs.h>

// This kit's own table: 0 .. 31 are greys from black in steps of 8; 63 is white; 32 .. 246 are the rest of a
// cube of six levels (0, 51, .. 255) a component, red changing slowest; 247 .. 254 are colours that the
// interface uses much; 255 (B_TRANSPARENT_MAGIC_CMAP8) is transparent and listed as B_TRANSPARENT_COLOR.
// Thread rule: any thread.

// The index of the nearest colour by the sum of squared differences, the lowest of equally near ones. Never
// the transparent one; the alpha of `color` is not looked at.
uint8 index_for_color(rgb_color color);

rgb_color color_for_index(uint8 index);
