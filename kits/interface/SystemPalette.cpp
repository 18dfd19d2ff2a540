#include "SystemPalette.h"

#include <InterfaceDefs.h>

#include <array>

namespace {

constexpr int kGreyCount = 32;
constexpr int kGreyStep = 8;
constexpr int kWhiteIndex = 63;
constexpr int kFirstCubeIndex = 32;
constexpr int kFirstExtraIndex = 247;
constexpr int kLevels = 6;
constexpr int kLevelStep = 51;

constexpr std::array<rgb_color, 8> kExtraColors = {{
    {255, 203, 0, 255},
    {51, 102, 152, 255},
    {0, 0, 229, 255},
    {64, 64, 128, 255},
    {178, 178, 178, 255},
    {236, 190, 90, 255},
    {222, 222, 228, 255},
    {70, 180, 80, 255},
}};

// Position of a cube colour in the table: white has a place of its own, black is the first grey.
constexpr int CubeIndex(int red, int green, int blue) {
    const int position = (red * kLevels + green) * kLevels + blue;
    if (position == 0) {
        return 0;
    }
    if (position == kLevels * kLevels * kLevels - 1) {
        return kWhiteIndex;
    }
    const int index = kFirstCubeIndex + position - 1;
    return index < kWhiteIndex ? index : index + 1;
}

constexpr uint8 Component(int value) {
    return static_cast<uint8>(value);
}

constexpr std::array<rgb_color, 256> MakeColors() {
    std::array<rgb_color, 256> colors = {};
    for (int red = 0; red < kLevels; ++red) {
        for (int green = 0; green < kLevels; ++green) {
            for (int blue = 0; blue < kLevels; ++blue) {
                colors[static_cast<size_t>(CubeIndex(red, green, blue))] = make_color(
                    Component(red * kLevelStep), Component(green * kLevelStep), Component(blue * kLevelStep));
            }
        }
    }
    for (int i = 0; i < kGreyCount; ++i) {
        const uint8 level = Component(i * kGreyStep);
        colors[static_cast<size_t>(i)] = make_color(level, level, level);
    }
    for (size_t i = 0; i < kExtraColors.size(); ++i) {
        colors[kFirstExtraIndex + i] = kExtraColors[i];
    }
    colors[B_TRANSPARENT_MAGIC_CMAP8] = B_TRANSPARENT_COLOR;
    return colors;
}

constexpr std::array<rgb_color, 256> kColors = MakeColors();

int Distance(rgb_color a, rgb_color b) {
    const int red = a.red - b.red;
    const int green = a.green - b.green;
    const int blue = a.blue - b.blue;
    return red * red + green * green + blue * blue;
}

// Keeps the nearest of the indices that it is shown.
class Nearest {
  public:
    explicit Nearest(rgb_color color) : mColor(color) {}

    void Consider(int index) {
        const int distance = Distance(mColor, kColors[static_cast<size_t>(index)]);
        if (distance < mDistance || (distance == mDistance && index < mIndex)) {
            mDistance = distance;
            mIndex = index;
        }
    }
    uint8 Index() const { return static_cast<uint8>(mIndex); }

  private:
    rgb_color mColor;
    int mDistance = 3 * 256 * 256;
    int mIndex = 0;
};

int NearestLevel(uint8 component) {
    return (component + kLevelStep / 2) / kLevelStep;
}

const color_map* MakeColorMap() {
    static color_map map = {};
    for (size_t i = 0; i < kColors.size(); ++i) {
        map.color_list[i] = kColors[i];
    }
    for (uint32 i = 0; i < 32768; ++i) {
        const auto widen = [](uint32 five) { return static_cast<uint8>((five << 3) | (five >> 2)); };
        map.index_map[i] = index_for_color(make_color(widen(i >> 10), widen((i >> 5) & 31), widen(i & 31)));
    }
    for (size_t i = 0; i < kColors.size(); ++i) {
        const rgb_color color = kColors[i];
        map.inversion_map[i] =
            i == B_TRANSPARENT_MAGIC_CMAP8
                ? B_TRANSPARENT_MAGIC_CMAP8
                : index_for_color(make_color(Component(255 - color.red), Component(255 - color.green),
                                             Component(255 - color.blue)));
    }
    return &map;
}

} // namespace

uint8 index_for_color(rgb_color color) {
    Nearest nearest(color);
    const int grey = (color.red + color.green + color.blue) / 3 / kGreyStep;
    nearest.Consider(grey);
    if (grey + 1 < kGreyCount) {
        nearest.Consider(grey + 1);
    }
    nearest.Consider(CubeIndex(NearestLevel(color.red), NearestLevel(color.green), NearestLevel(color.blue)));
    for (size_t i = 0; i < kExtraColors.size(); ++i) {
        nearest.Consider(kFirstExtraIndex + static_cast<int>(i));
    }
    return nearest.Index();
}

rgb_color color_for_index(uint8 index) {
    return kColors[index];
}

const color_map* system_colors() {
    static const color_map* const map = MakeColorMap();
    return map;
}
