#include <Bitmap.h>

#include "BitmapViews.h"
#include "PixelSurface.h"

#include <Message.h>
#include <TypeConstants.h>
#include <View.h>

#include <algorithm>
#include <cmath>
#include <new>
#include <string.h>
#include <vector>

namespace {

constexpr int64 kMaxSide = 32767;
constexpr int64 kMaxBitsLength = int64{512} << 20;

constexpr char kFrameField[] = "_frame";
constexpr char kSpaceField[] = "_cspace";
constexpr char kFlagsField[] = "_flags";
constexpr char kRowBytesField[] = "_rowbytes";
constexpr char kViewField[] = "_view";
constexpr char kDataField[] = "_data";

// Flags that say where the memory lies; here it always lies in this program.
constexpr uint32 kKeptFlags = B_BITMAP_CLEAR_TO_WHITE | B_BITMAP_ACCEPTS_VIEWS | B_BITMAP_IS_CONTIGUOUS;

// The pixels that fit into this many bytes.
int64 PixelsIn(color_space space, int64 bytes) {
    return bytes * 8 / bits_per_pixel(space);
}

uint32 FlagsFor(bool acceptsViews, bool needsContiguous) {
    return (acceptsViews ? static_cast<uint32>(B_BITMAP_ACCEPTS_VIEWS) : 0U) |
           (needsContiguous ? static_cast<uint32>(B_BITMAP_IS_CONTIGUOUS) : 0U);
}

// A rectangle of pixels, in the bytes of one picture or another.
struct SourceRows {
    const uint8* data;
    int64 length;
    int64 bytesPerRow;
    color_space space;
};

// Copies one row's pixels x .. x + count - 1 from one space to another; false when the data ends before that.
bool ConvertRow(const SourceRows& source, int64 sourceX, int64 sourceY, const PixelSurface& target,
                int32 targetX, int32 targetY, int64 count, std::vector<pixel32>& scratch) {
    const int64 start = sourceY * source.bytesPerRow;
    if (start >= source.length) {
        return false;
    }
    const int64 available =
        std::min(PixelsIn(source.space, source.bytesPerRow), PixelsIn(source.space, source.length - start));
    count = std::min({count, available - sourceX, static_cast<int64>(target.width) - targetX});
    if (count > 0) {
        scratch.resize(static_cast<size_t>(count));
        load_pixels(source.space, source.data + start, static_cast<int32>(sourceX), static_cast<int32>(count),
                    scratch.data());
        store_pixels(target.space, target.Row(targetY), targetX, static_cast<int32>(count), scratch.data());
    }
    return true;
}

} // namespace

REGISTER_ARCHIVABLE(BBitmap);

BBitmap::BBitmap(BRect bounds, uint32 flags, color_space space, int32 bytesPerRow, screen_id /*screen*/) {
    Init(bounds, space, flags, bytesPerRow);
}

BBitmap::BBitmap(BRect bounds, color_space space, bool acceptsViews, bool needsContiguous) {
    Init(bounds, space, FlagsFor(acceptsViews, needsContiguous), B_ANY_BYTES_PER_ROW);
}

BBitmap::BBitmap(const BBitmap* source, bool acceptsViews, bool needsContiguous) {
    if (source == nullptr || !source->IsValid()) {
        mInitStatus = B_BAD_VALUE;
        return;
    }
    Init(source->mBounds, source->mSpace, FlagsFor(acceptsViews, needsContiguous), source->mBytesPerRow);
    if (IsValid()) {
        memcpy(mBits.get(), source->mBits.get(), static_cast<size_t>(mBitsLength));
    }
}

BBitmap::BBitmap(BMessage* archive) : BArchivable(archive) {
    if (archive == nullptr) {
        mInitStatus = B_BAD_VALUE;
        return;
    }
    InitFromArchive(*archive);
}

BBitmap::~BBitmap() = default;

void BBitmap::Init(BRect bounds, color_space space, uint32 flags, int32 bytesPerRow) {
    mBounds = bounds;
    mSpace = space;
    mFlags = flags & kKeptFlags;
    mInitStatus = B_BAD_VALUE;
    // Written so that a NaN on any edge fails.
    if (!(bounds.left <= bounds.right && bounds.top <= bounds.bottom) || !is_supported_space(space) ||
        !(bounds.Width() < static_cast<float>(kMaxSide)) ||
        !(bounds.Height() < static_cast<float>(kMaxSide))) {
        return;
    }
    const auto width = static_cast<int64>(std::ceil(bounds.Width())) + 1;
    const auto height = static_cast<int64>(std::ceil(bounds.Height())) + 1;
    const int64 least = padded_row_size(space, width);
    const int64 rowBytes = bytesPerRow == B_ANY_BYTES_PER_ROW ? least : bytesPerRow;
    if (rowBytes < least || rowBytes % 4 != 0 || rowBytes * height > kMaxBitsLength) {
        return;
    }
    mWidth = static_cast<int32>(width);
    mHeight = static_cast<int32>(height);
    mBytesPerRow = static_cast<int32>(rowBytes);
    mBitsLength = static_cast<int32>(rowBytes * height);
    Allocate();
}

void BBitmap::Allocate() {
    mBits.reset(new (std::nothrow) uint8[static_cast<size_t>(mBitsLength)]());
    if (mBits == nullptr) {
        mInitStatus = B_NO_MEMORY;
        mBitsLength = 0;
        return;
    }
    mInitStatus = B_OK;
    if ((mFlags & B_BITMAP_ACCEPTS_VIEWS) != 0) {
        mViews = std::make_unique<BitmapViews>(*this);
    }
    if ((mFlags & (B_BITMAP_ACCEPTS_VIEWS | B_BITMAP_CLEAR_TO_WHITE)) != 0) {
        const std::vector<pixel32> white(static_cast<size_t>(mWidth), to_pixel(make_color(255, 255, 255)));
        const PixelSurface surface = Surface();
        for (int32 y = 0; y < mHeight; ++y) {
            store_pixels(mSpace, surface.Row(y), 0, mWidth, white.data());
        }
    }
}

void BBitmap::InitFromArchive(BMessage& archive) {
    mInitStatus = B_BAD_VALUE;
    BRect frame;
    int32 space = 0;
    int32 flags = 0;
    int32 rowBytes = 0;
    const void* data = nullptr;
    ssize_t length = 0;
    if (archive.FindRect(kFrameField, &frame) != B_OK || archive.FindInt32(kSpaceField, &space) != B_OK ||
        archive.FindInt32(kRowBytesField, &rowBytes) != B_OK ||
        archive.FindData(kDataField, B_RAW_TYPE, &data, &length) != B_OK) {
        return;
    }
    // Archives may leave these out.
    archive.FindInt32(kFlagsField, &flags);
    bool acceptsViews = false;
    if (archive.FindBool(kViewField, &acceptsViews) == B_OK && acceptsViews) {
        flags |= B_BITMAP_ACCEPTS_VIEWS;
    }
    // Nothing is allocated before the data itself has shown that the frame is true.
    const float rows = frame.Height() + 1;
    if (rowBytes <= 0 || !(rows >= 1) || !(rows <= static_cast<float>(kMaxSide)) ||
        static_cast<int64>(std::ceil(rows)) * rowBytes != static_cast<int64>(length)) {
        return;
    }
    Init(frame, static_cast<color_space>(space), static_cast<uint32>(flags), rowBytes);
    if (IsValid()) {
        memcpy(mBits.get(), data, static_cast<size_t>(mBitsLength));
    }
}

BArchivable* BBitmap::Instantiate(BMessage* archive) {
    if (!validate_instantiation(archive, "BBitmap")) {
        return nullptr;
    }
    return new BBitmap(archive);
}

status_t BBitmap::Archive(BMessage* archive, bool deep) const {
    if (!IsValid()) {
        return B_NO_INIT;
    }
    status_t status = BArchivable::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddRect(kFrameField, mBounds);
    }
    if (status == B_OK) {
        status = archive->AddInt32(kSpaceField, static_cast<int32>(mSpace));
    }
    if (status == B_OK) {
        status = archive->AddInt32(kFlagsField, static_cast<int32>(mFlags));
    }
    if (status == B_OK) {
        status = archive->AddInt32(kRowBytesField, mBytesPerRow);
    }
    if (status == B_OK) {
        status = archive->AddBool(kViewField, (mFlags & B_BITMAP_ACCEPTS_VIEWS) != 0);
    }
    if (status == B_OK && deep) {
        status = archive->AddData(kDataField, B_RAW_TYPE, mBits.get(), mBitsLength);
    }
    return status;
}

bool BBitmap::Lock() {
    return mViews != nullptr && mViews->Lock();
}

void BBitmap::Unlock() {
    if (mViews != nullptr) {
        mViews->Unlock();
    }
}

bool BBitmap::IsLocked() const {
    return mViews != nullptr && mViews->IsLocked();
}

void BBitmap::SetBits(const void* data, int32 length, int32 offset, color_space space) {
    if (!IsValid() || data == nullptr || length <= 0 || offset < 0 || offset >= mBitsLength ||
        !is_supported_space(space)) {
        return;
    }
    if (space == mSpace && space != B_RGB32) {
        const int32 fitting = std::min(length, mBitsLength - offset);
        memcpy(mBits.get() + offset, data, static_cast<size_t>(fitting));
        return;
    }
    const color_space layout = space == B_RGB32 ? B_RGB24_BIG : space;
    const bool padded = layout != B_RGB24_BIG && layout != B_CMAP8;
    const int64 rowBytes = padded ? padded_row_size(layout, mWidth) : row_size(layout, mWidth);
    // Cannot fail: everything that ImportBits() refuses has been looked at.
    (void)ImportBits(data, length, static_cast<int32>(rowBytes), offset, layout);
}

status_t BBitmap::ImportBits(const void* data, int32 length, int32 bytesPerRow, int32 offset,
                             color_space space) {
    if (!IsValid()) {
        return B_NO_INIT;
    }
    if (offset < 0 || offset >= mBitsLength) {
        return B_BAD_VALUE;
    }
    const auto x = static_cast<int32>(PixelsIn(mSpace, offset % mBytesPerRow));
    const BPoint to(static_cast<float>(x), static_cast<float>(offset / mBytesPerRow));
    return ImportBits(data, length, bytesPerRow, space, B_ORIGIN, to, mWidth, mHeight);
}

status_t BBitmap::ImportBits(const void* data, int32 length, int32 bytesPerRow, color_space space,
                             BPoint from, BPoint to, int32 width, int32 height) {
    if (!IsValid()) {
        return B_NO_INIT;
    }
    if (data == nullptr || length < 0 || !is_supported_space(space) || width < 0 || height < 0) {
        return B_BAD_VALUE;
    }
    for (const float coordinate : {from.x, from.y, to.x, to.y}) {
        if (!(std::abs(coordinate) <= static_cast<float>(kMaxSide))) {
            return B_BAD_VALUE;
        }
    }
    if (bytesPerRow == B_ANY_BYTES_PER_ROW) {
        bytesPerRow = static_cast<int32>(padded_row_size(space, width));
    }
    if (bytesPerRow <= 0) {
        return B_BAD_VALUE;
    }
    auto sourceX = static_cast<int32>(from.x);
    auto sourceY = static_cast<int32>(from.y);
    auto targetX = static_cast<int32>(to.x);
    auto targetY = static_cast<int32>(to.y);
    const int32 cutX = std::max({0, -sourceX, -targetX});
    const int32 cutY = std::max({0, -sourceY, -targetY});
    sourceX += cutX;
    targetX += cutX;
    sourceY += cutY;
    targetY += cutY;
    const int64 columns = static_cast<int64>(width) - cutX;
    const int64 rows = std::min(static_cast<int64>(height) - cutY, static_cast<int64>(mHeight) - targetY);
    const SourceRows source = {static_cast<const uint8*>(data), length, bytesPerRow, space};
    const PixelSurface surface = Surface();
    std::vector<pixel32> scratch;
    for (int32 row = 0; row < rows; ++row) {
        if (!ConvertRow(source, sourceX, static_cast<int64>(sourceY) + row, surface, targetX, targetY + row,
                        columns, scratch)) {
            break;
        }
    }
    return B_OK;
}

status_t BBitmap::ImportBits(const BBitmap* bitmap) {
    if (bitmap == nullptr || !bitmap->IsValid() || bitmap->mWidth != mWidth || bitmap->mHeight != mHeight) {
        return B_BAD_VALUE;
    }
    return ImportBits(bitmap->Bits(), bitmap->mBitsLength, bitmap->mBytesPerRow, 0, bitmap->mSpace);
}

status_t BBitmap::ImportBits(const BBitmap* bitmap, BPoint from, BPoint to, int32 width, int32 height) {
    if (bitmap == nullptr || !bitmap->IsValid()) {
        return B_BAD_VALUE;
    }
    // Padding is no part of the picture.
    width =
        std::min<int32>(width, bitmap->mWidth - static_cast<int32>(std::clamp(from.x, -32767.0F, 32767.0F)));
    if (width <= 0) {
        return B_OK;
    }
    return ImportBits(bitmap->Bits(), bitmap->mBitsLength, bitmap->mBytesPerRow, bitmap->mSpace, from, to,
                      width, height);
}

void BBitmap::AddChild(BView* view) {
    if (mViews != nullptr) {
        mViews->AddChild(view);
    }
}

bool BBitmap::RemoveChild(BView* view) {
    return mViews != nullptr && mViews->RemoveChild(view);
}

int32 BBitmap::CountChildren() const {
    return mViews == nullptr ? 0 : static_cast<int32>(mViews->Children().size());
}

BView* BBitmap::ChildAt(int32 index) const {
    if (index < 0 || index >= CountChildren()) {
        return nullptr;
    }
    return mViews->Children()[static_cast<size_t>(index)];
}

BView* BBitmap::FindView(const char* name) const {
    for (int32 i = 0; i < CountChildren(); ++i) {
        if (BView* const found = ChildAt(i)->FindView(name); found != nullptr) {
            return found;
        }
    }
    return nullptr;
}

BView* BBitmap::FindView(BPoint point) const {
    for (int32 i = CountChildren() - 1; i >= 0; --i) {
        BView* const view = ChildAt(i);
        if (!view->IsHidden() && view->Frame().Contains(point)) {
            return view;
        }
    }
    return nullptr;
}

PixelSurface BBitmap::Surface() const {
    PixelSurface surface;
    if (IsValid()) {
        surface.bits = mBits.get();
        surface.bytesPerRow = mBytesPerRow;
        surface.width = mWidth;
        surface.height = mHeight;
        surface.space = mSpace;
    }
    return surface;
}
