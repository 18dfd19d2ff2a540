// Icons for kinds of files, from the desktop's icon theme.
//
// Thread rule: any thread. Needs no display and no graphical application object: theme files are read
// directly. Icons are kept in memory, by type and size, for the life of the process.
#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

namespace host {

struct IconPixels {
    int size = 0;                      // pixels on a side
    std::vector<std::uint32_t> pixels; // size x size of 0xAARRGGBB, not multiplied by alpha
    bool from_theme = false;           // false: the built-in drawing
};

// What the built-in drawings distinguish.
enum class IconKind { document, audio, image, folder, volume, program };

// The icon of a MIME type ("audio/mpeg", "inode/directory", "inode/mount-point"), `size` pixels on a side
// (kept within 8 .. 512): from the user's icon theme, the themes it inherits from and "hicolor"; else a
// drawing of our own. Never null.
[[nodiscard]] std::shared_ptr<const IconPixels> icon_for_type(std::string_view mime_type, int size);

// The built-in drawing, whatever the theme has.
[[nodiscard]] IconPixels draw_builtin_icon(IconKind kind, int size);

[[nodiscard]] IconKind icon_kind_of_type(std::string_view mime_type);

} // namespace host
