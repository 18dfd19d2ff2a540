// How fast a list scrolls while the pointer is dragged past its upper or lower edge. Plain arithmetic.
#pragma once

#include <SupportDefs.h>

// A list tells itself so, by a BMessageRunner, to scroll on.
inline constexpr uint32 kListAutoscroll = 'LvAs';
// Between two steps, in microseconds.
inline constexpr bigtime_t kListAutoscrollInterval = 40000;

// How many pixels one step goes when the pointer is so many pixels past the edge: negative ones are above it
// and scroll up. `page` is the height that shows, which no step goes beyond.
float autoscroll_step(float beyond, float page);
