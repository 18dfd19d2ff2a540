// Reading image files from memory.
//
// Thread rule: any thread; no graphical application object is needed or made.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <vector>

namespace host {

inline constexpr std::size_t max_image_file_size = std::size_t{256} << 20;
inline constexpr std::int64_t max_image_pixels = 100'000'000;

enum class ImageStatus {
    ok,
    unknown_format, // none of the installed readers knows it
    damaged,        // a known format, but no picture comes out
    too_large,      // more than max_image_file_size bytes or max_image_pixels pixels
    no_memory,
};

struct DecodedImage {
    ImageStatus status = ImageStatus::unknown_format;
    std::string format; // "png", "jpeg", ...
    int width = 0;
    int height = 0;
    bool has_alpha = false;
    std::vector<std::uint32_t>
        pixels; // width x height of 0xAARRGGBB, not multiplied by alpha, rows from the top
};

// What the data is, from its first bytes; sizes are not looked at. Empty when no reader knows it.
[[nodiscard]] std::string identify_image(std::span<const std::byte> data);

// The (first) picture of the file, turned upright as its EXIF orientation says. The size that the file claims
// is checked before memory is taken for it.
[[nodiscard]] DecodedImage decode_image(std::span<const std::byte> data);

struct EncodedImage {
    ImageStatus status = ImageStatus::unknown_format;
    std::vector<std::byte> data;
};

// Writes a picture as a file of the given format ("png", "jpeg", "bmp", ...).
[[nodiscard]] EncodedImage encode_image(const std::string& format, int width, int height, bool has_alpha,
                                        std::span<const std::uint32_t> pixels);

struct ImageFormat {
    std::string name; // "png"
    std::string mime_type;
    bool can_read = false;
    bool can_write = false;
};

// What this machine's readers and writers can do, sorted by name.
[[nodiscard]] std::vector<ImageFormat> image_formats();

} // namespace host
