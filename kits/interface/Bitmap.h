// BBitmap: a picture in memory, which may also be drawn on by views.
#pragma once

#include <Archivable.h>
#include <GraphicsDefs.h>
#include <InterfaceDefs.h>
#include <Rect.h>

#include <memory>

class BMessage;
class BView;
class BitmapViews;
struct PixelSurface;

// Creation flags.
enum {
    B_BITMAP_CLEAR_TO_WHITE = 0x00000001,
    B_BITMAP_ACCEPTS_VIEWS = 0x00000002,
    B_BITMAP_IS_AREA = 0x00000004,
    B_BITMAP_IS_LOCKED = 0x00000008 | B_BITMAP_IS_AREA,
    B_BITMAP_IS_CONTIGUOUS = 0x00000010 | B_BITMAP_IS_LOCKED,
    B_BITMAP_IS_OFFSCREEN = 0x00000020,
    B_BITMAP_WILL_OVERLAY = 0x00000040 | B_BITMAP_IS_OFFSCREEN,
    B_BITMAP_RESERVE_OVERLAY_CHANNEL = 0x00000080
};

inline constexpr int32 B_ANY_BYTES_PER_ROW = -1;

// Owns its pixels and the views that were added to it. Rows are padded to a multiple of four bytes. A bitmap
// that cannot be made (a frame that is not valid, a colour space that is not supported, more than 32767
// pixels on a side or 512 MB) is there but not valid: it has no pixels, and everything on it fails or does
// nothing.
//
// Thread rule: one thread at a time; a bitmap that accepts views is guarded by its own Lock(). Reading Bits()
// of bitmaps that nobody changes is safe from any thread.
class BBitmap : public BArchivable {
  public:
    // A bitmap that accepts views starts white, others start with all bytes zero.
    BBitmap(BRect bounds, uint32 flags, color_space space, int32 bytesPerRow = B_ANY_BYTES_PER_ROW,
            screen_id screen = B_MAIN_SCREEN_ID);
    BBitmap(BRect bounds, color_space space, bool acceptsViews = false, bool needsContiguous = false);
    // A copy of the source's pixels, not of its views.
    explicit BBitmap(const BBitmap* source, bool acceptsViews = false, bool needsContiguous = false);
    // From what a deep Archive() wrote. A damaged archive, or one without pixels, yields a bitmap that is not
    // valid, whatever is wrong with it, and takes no more memory than the archive itself holds.
    explicit BBitmap(BMessage* archive);
    ~BBitmap() override;
    BBitmap(const BBitmap&) = delete;
    BBitmap& operator=(const BBitmap&) = delete;

    // Null when the archive is not one of a bitmap; a damaged one yields a bitmap that is not valid.
    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_frame" (BRect), "_cspace", "_flags" and "_rowbytes" (int32), "_view" (bool, accepts views);
    // deep, also
    // "_data" (the rows, raw). Attached views are not part of the archive. B_NO_INIT for a bitmap that is not
    // valid.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    // B_OK, B_BAD_VALUE for arguments that cannot be, B_NO_MEMORY.
    [[nodiscard]] status_t InitCheck() const { return mInitStatus; }
    bool IsValid() const { return mInitStatus == B_OK; }

    // Locks the views' side of the bitmap, recursively. False for a bitmap that accepts no views or is not
    // valid.
    bool Lock();
    void Unlock();
    bool IsLocked() const;

    // Owned by the bitmap, BitsLength() bytes; null when it is not valid.
    void* Bits() const { return mBits.get(); }
    int32 BitsLength() const { return mBitsLength; }
    int32 BytesPerRow() const { return mBytesPerRow; }
    color_space ColorSpace() const { return mSpace; }
    BRect Bounds() const { return mBounds; }
    uint32 Flags() const { return mFlags; }

    // Writes `length` bytes of picture data in the given space from byte `offset` of the bitmap on; what does
    // not fit is left out. Data of the bitmap's own space is copied as it is, padding included. Otherwise it
    // is converted: B_RGB32 stands for rows of red, green, blue bytes without padding (24 bits a pixel, also
    // where the bitmap is B_RGB32 itself), B_CMAP8 for rows without padding, and other spaces for rows padded
    // to a multiple of four bytes; `offset` then names the pixel that lies at that byte.
    void SetBits(const void* data, int32 length, int32 offset, color_space space);

    // Writes data whose rows are `bytesPerRow` apart (B_ANY_BYTES_PER_ROW: padded to four), converted pixel
    // by pixel, from the pixel on that lies at byte `offset` of the bitmap. B_BAD_VALUE for a bad offset,
    // space or row size.
    status_t ImportBits(const void* data, int32 length, int32 bytesPerRow, int32 offset, color_space space);
    // The rectangle of `width` x `height` pixels at `from` in the data goes to `to` in the bitmap, both
    // counted from the left top pixel; what lies outside of either is left out.
    status_t ImportBits(const void* data, int32 length, int32 bytesPerRow, color_space space, BPoint from,
                        BPoint to, int32 width, int32 height);
    status_t ImportBits(const BBitmap* bitmap);
    status_t ImportBits(const BBitmap* bitmap, BPoint from, BPoint to, int32 width, int32 height);

    // Views are owned by the bitmap once added, until they are removed. The view must have no parent. Does
    // nothing on a bitmap that accepts no views.
    virtual void AddChild(BView* view);
    virtual bool RemoveChild(BView* view);
    int32 CountChildren() const;
    BView* ChildAt(int32 index) const;
    BView* FindView(const char* name) const;
    BView* FindView(BPoint point) const;

    // For this kit's own use: the pixels as something to draw from or on.
    PixelSurface Surface() const;

  private:
    void Init(BRect bounds, color_space space, uint32 flags, int32 bytesPerRow);
    void Allocate();
    void InitFromArchive(BMessage& archive);

    BRect mBounds;
    color_space mSpace = B_NO_COLOR_SPACE;
    uint32 mFlags = 0;
    int32 mWidth = 0;
    int32 mHeight = 0;
    int32 mBytesPerRow = 0;
    int32 mBitsLength = 0;
    status_t mInitStatus = B_NO_INIT;
    std::unique_ptr<uint8[]> mBits;
    std::unique_ptr<BitmapViews> mViews;
};
