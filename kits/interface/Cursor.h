// BCursor: a shape for the mouse pointer.
#pragma once

#include <Archivable.h>
#include <Point.h>
#include <SupportDefs.h>

#include <memory>

class BBitmap;
namespace host {
struct Cursor;
}

enum BCursorID {
    B_CURSOR_ID_SYSTEM_DEFAULT = 1,
    B_CURSOR_ID_CONTEXT_MENU = 3,
    B_CURSOR_ID_COPY = 4,
    B_CURSOR_ID_CREATE_LINK = 29,
    B_CURSOR_ID_CROSS_HAIR = 5,
    B_CURSOR_ID_FOLLOW_LINK = 6,
    B_CURSOR_ID_GRAB = 7,
    B_CURSOR_ID_GRABBING = 8,
    B_CURSOR_ID_HELP = 9,
    B_CURSOR_ID_I_BEAM = 2,
    B_CURSOR_ID_MOVE = 12,
    B_CURSOR_ID_NO_CURSOR = 13,
    B_CURSOR_ID_NOT_ALLOWED = 14,
    B_CURSOR_ID_PROGRESS = 15,
    B_CURSOR_ID_RESIZE_NORTH_SOUTH = 24,
    B_CURSOR_ID_RESIZE_EAST_WEST = 25,
    B_CURSOR_ID_RESIZE_NORTH_EAST_SOUTH_WEST = 26,
    B_CURSOR_ID_RESIZE_NORTH_WEST_SOUTH_EAST = 27
};

// A value; any thread may make one, one thread at a time uses it. BView::SetViewCursor() copies it.
class BCursor : public BArchivable {
  public:
    // 68 bytes: side 16, bits a pixel 1, hot spot's row and column; then 16 rows of two bytes each for the
    // colour (set bits are black) and again for the mask (set bits show). Other data give the default cursor.
    explicit BCursor(const void* cursorData);
    explicit BCursor(BCursorID id);
    // Copies the bitmap's pixels.
    BCursor(const BBitmap* bitmap, const BPoint& hotspot);
    BCursor(const BCursor& other);
    explicit BCursor(BMessage* data);
    ~BCursor() override;
    BCursor& operator=(const BCursor& other);
    bool operator==(const BCursor& other) const;
    bool operator!=(const BCursor& other) const { return !(*this == other); }

    // B_UNSUPPORTED: cursors are not archived.
    status_t Archive(BMessage* archive, bool deep = true) const override;
    static BArchivable* Instantiate(BMessage* archive);

    // For the kit's own use.
    const host::Cursor& ForHost() const { return *mCursor; }

  private:
    std::unique_ptr<host::Cursor> mCursor;
};

extern const BCursor* B_CURSOR_SYSTEM_DEFAULT;
extern const BCursor* B_CURSOR_I_BEAM;
