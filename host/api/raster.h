// Resampling of 32-bit pictures.
//
// Thread rule: pure functions, any thread.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

namespace host {

// Pixels of 0xAARRGGBB, colours not multiplied by alpha. Borrowed: the caller keeps the memory.
struct PixelView {
    const std::uint32_t* pixels = nullptr;
    int width = 0;
    int height = 0;
    std::size_t stride = 0; // pixels from one row to the next
};

struct MutablePixelView {
    std::uint32_t* pixels = nullptr;
    int width = 0;
    int height = 0;
    std::size_t stride = 0;
};

// Fills `target` with the whole of `source`: area averages where the picture shrinks, interpolated where it
// grows. Colours of transparent pixels do not bleed into their neighbours. False when a side is empty, longer
// than 32767 pixels, or memory is short; the target is then untouched.
[[nodiscard]] bool scale_smoothly(PixelView source, MutablePixelView target);

} // namespace host
