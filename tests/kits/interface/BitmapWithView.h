// A white bitmap with one view that fills it.
#pragma once

#include "PixelPicture.h"

#include <Bitmap.h>
#include <View.h>

class BitmapWithView {
  public:
    BitmapWithView(int32 width, int32 height)
        : mBitmap(BRect(0, 0, static_cast<float>(width - 1), static_cast<float>(height - 1)), B_RGB32, true),
          view(new BView(mBitmap.Bounds(), "view", B_FOLLOW_ALL, B_WILL_DRAW)) {
        mBitmap.AddChild(view);
    }

    Rows Show() const { return PixelPicture::ShowSurface(mBitmap.Surface()); }
    uint32 At(int32 x, int32 y) const {
        return reinterpret_cast<const uint32*>(mBitmap.Surface().Row(y))[x] & 0xFFFFFF;
    }
    int CountInked() const {
        int count = 0;
        for (int32 y = 0; y < mBitmap.Surface().height; ++y) {
            for (int32 x = 0; x < mBitmap.Surface().width; ++x) {
                count += At(x, y) != 0xFFFFFF;
            }
        }
        return count;
    }
    BBitmap& Bitmap() { return mBitmap; }

  private:
    BBitmap mBitmap;

  public:
    BView* const view; // belongs to the bitmap
};
