#include "ListAutoscroll.h"

#include <algorithm>
#include <cmath>

float autoscroll_step(float beyond, float page) {
    // 75 pixels a second next to the edge, 25 more for every two pixels farther away.
    constexpr float kSlowest = 3;
    constexpr float kPerPixel = 0.5F;
    if (beyond == 0) {
        return 0;
    }
    const float step = std::floor(kSlowest + (std::abs(beyond) - 1) * kPerPixel);
    return std::copysign(std::clamp(step, 1.0F, std::max(1.0F, page)), beyond);
}
