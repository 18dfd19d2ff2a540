// A small picture to draw on, shown as text so that a test can say what it expects.
#pragma once

#include "PixelSurface.h"

#include <map>
#include <string>
#include <vector>

// Starts white. Show() gives one character a pixel: '.' white, '#' black, 'r' 'g' 'b' the pure colours, '?'
// others.
class PixelPicture {
  public:
    PixelPicture(int32 width, int32 height, color_space space = B_RGB32)
        : mBits(static_cast<size_t>(padded_row_size(space, width) * height)) {
        mSurface.bits = mBits.data();
        mSurface.bytesPerRow = static_cast<int32>(padded_row_size(space, width));
        mSurface.width = width;
        mSurface.height = height;
        mSurface.space = space;
        const std::vector<pixel32> white(static_cast<size_t>(width), 0xFFFFFFFF);
        for (int32 y = 0; y < height; ++y) {
            store_pixels(space, mSurface.Row(y), 0, width, white.data());
        }
    }

    PixelSurface& Surface() { return mSurface; }

    pixel32 At(int32 x, int32 y) const {
        pixel32 pixel = 0;
        load_pixels(mSurface.space, mSurface.Row(y), x, 1, &pixel);
        return pixel;
    }

    std::vector<std::string> Show() const { return ShowSurface(mSurface); }

    static std::vector<std::string> ShowSurface(const PixelSurface& surface) {
        static const std::map<pixel32, char> kLetters = {
            {0xFFFFFF, '.'}, {0x000000, '#'}, {0xFF0000, 'r'}, {0x00FF00, 'g'}, {0x0000FF, 'b'}};
        std::vector<std::string> rows;
        for (int32 y = 0; y < surface.height; ++y) {
            std::string row;
            for (int32 x = 0; x < surface.width; ++x) {
                pixel32 pixel = 0;
                load_pixels(surface.space, surface.Row(y), x, 1, &pixel);
                const auto letter = kLetters.find(pixel & 0xFFFFFF);
                row += letter == kLetters.end() ? '?' : letter->second;
            }
            rows.push_back(row);
        }
        return rows;
    }

  private:
    std::vector<uint8> mBits;
    PixelSurface mSurface;
};

typedef std::vector<std::string> Rows;
