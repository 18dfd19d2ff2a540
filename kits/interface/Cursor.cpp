#include <Cursor.h>

#include "PixelSurface.h"

#include <Bitmap.h>

#include "host/api/display.h"

namespace {

constexpr int kSide = 16;

host::CursorShape ShapeOf(BCursorID id) {
    switch (id) {
    case B_CURSOR_ID_CONTEXT_MENU:
        return host::CursorShape::menu;
    case B_CURSOR_ID_COPY:
        return host::CursorShape::copy;
    case B_CURSOR_ID_CREATE_LINK:
        return host::CursorShape::link;
    case B_CURSOR_ID_CROSS_HAIR:
        return host::CursorShape::cross;
    case B_CURSOR_ID_FOLLOW_LINK:
        return host::CursorShape::hand;
    case B_CURSOR_ID_GRAB:
        return host::CursorShape::grab;
    case B_CURSOR_ID_GRABBING:
        return host::CursorShape::grabbing;
    case B_CURSOR_ID_HELP:
        return host::CursorShape::help;
    case B_CURSOR_ID_I_BEAM:
        return host::CursorShape::text;
    case B_CURSOR_ID_MOVE:
        return host::CursorShape::move;
    case B_CURSOR_ID_NO_CURSOR:
        return host::CursorShape::blank;
    case B_CURSOR_ID_NOT_ALLOWED:
        return host::CursorShape::forbidden;
    case B_CURSOR_ID_PROGRESS:
        return host::CursorShape::progress;
    case B_CURSOR_ID_RESIZE_NORTH_SOUTH:
        return host::CursorShape::size_vertical;
    case B_CURSOR_ID_RESIZE_EAST_WEST:
        return host::CursorShape::size_horizontal;
    case B_CURSOR_ID_RESIZE_NORTH_EAST_SOUTH_WEST:
        return host::CursorShape::size_up;
    case B_CURSOR_ID_RESIZE_NORTH_WEST_SOUTH_EAST:
        return host::CursorShape::size_down;
    case B_CURSOR_ID_SYSTEM_DEFAULT:
        break;
    }
    return host::CursorShape::arrow;
}

bool IsSet(const unsigned char* rows, int x, int y) {
    return (rows[y * 2 + x / 8] & (0x80U >> (x % 8))) != 0;
}

} // namespace

BCursor::BCursor(const void* cursorData) : mCursor(std::make_unique<host::Cursor>()) {
    const auto* const data = static_cast<const unsigned char*>(cursorData);
    if (data == nullptr || data[0] != kSide || data[1] != 1) {
        return;
    }
    const unsigned char* const colors = data + 4;
    const unsigned char* const mask = colors + kSide * 2;
    mCursor->shape = host::CursorShape::custom;
    mCursor->hot_spot = {data[3], data[2]};
    mCursor->picture.width = kSide;
    mCursor->picture.height = kSide;
    for (int y = 0; y < kSide; ++y) {
        for (int x = 0; x < kSide; ++x) {
            const uint32 color = IsSet(colors, x, y) ? 0xff000000U : 0xffffffffU;
            mCursor->picture.pixels.push_back(IsSet(mask, x, y) ? color : 0U);
        }
    }
}

BCursor::BCursor(BCursorID id) : mCursor(std::make_unique<host::Cursor>()) {
    mCursor->shape = ShapeOf(id);
}

BCursor::BCursor(const BBitmap* bitmap, const BPoint& hotspot) : mCursor(std::make_unique<host::Cursor>()) {
    if (bitmap == nullptr || !bitmap->IsValid()) {
        return;
    }
    const PixelSurface surface = bitmap->Surface();
    mCursor->shape = host::CursorShape::custom;
    mCursor->hot_spot = {static_cast<int>(hotspot.x), static_cast<int>(hotspot.y)};
    mCursor->picture.width = surface.width;
    mCursor->picture.height = surface.height;
    mCursor->picture.pixels.resize(static_cast<size_t>(surface.width) * static_cast<size_t>(surface.height));
    for (int32 y = 0; y < surface.height; ++y) {
        load_pixels(surface.space, surface.Row(y), 0, surface.width,
                    mCursor->picture.pixels.data() + static_cast<ptrdiff_t>(y) * surface.width);
    }
}

BCursor::BCursor(const BCursor& other)
    : BArchivable(other), mCursor(std::make_unique<host::Cursor>(*other.mCursor)) {}

BCursor::BCursor(BMessage* data) : BArchivable(data), mCursor(std::make_unique<host::Cursor>()) {}

BCursor::~BCursor() = default;

BCursor& BCursor::operator=(const BCursor& other) {
    *mCursor = *other.mCursor;
    return *this;
}

bool BCursor::operator==(const BCursor& other) const {
    return mCursor->shape == other.mCursor->shape && mCursor->hot_spot == other.mCursor->hot_spot &&
           mCursor->picture.width == other.mCursor->picture.width &&
           mCursor->picture.pixels == other.mCursor->picture.pixels;
}

status_t BCursor::Archive(BMessage* /*archive*/, bool /*deep*/) const {
    return B_UNSUPPORTED;
}

BArchivable* BCursor::Instantiate(BMessage* /*archive*/) {
    return nullptr;
}

namespace {

const BCursor sSystemDefault(B_CURSOR_ID_SYSTEM_DEFAULT);
const BCursor sIBeam(B_CURSOR_ID_I_BEAM);

} // namespace

const BCursor* B_CURSOR_SYSTEM_DEFAULT = &sSystemDefault;
const BCursor* B_CURSOR_I_BEAM = &sIBeam;
