// BitmapViews: the side of a bitmap that views are attached to.
#pragma once

#include "ViewHost.h"

#include <Bitmap.h>
#include <Locker.h>

#include <vector>

// Owns the views. Guarded by its own lock, which BBitmap::Lock() takes.
class BitmapViews : public ViewHost {
  public:
    explicit BitmapViews(const BBitmap& bitmap);
    ~BitmapViews() override;

    bool Lock() { return mLock.Lock(); }
    void Unlock() { mLock.Unlock(); }
    bool IsLocked() const override { return mLock.IsLocked(); }
    PixelSurface Surface() const override { return mBitmap.Surface(); }
    void ViewRemoved(BView* view) override;

    void AddChild(BView* view);
    bool RemoveChild(BView* view);
    const std::vector<BView*>& Children() const { return mChildren; }

  private:
    const BBitmap& mBitmap;
    mutable BLocker mLock{"bitmap"};
    std::vector<BView*> mChildren;
};
