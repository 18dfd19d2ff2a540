// ViewHost: what a tree of views is attached to and draws on.
#pragma once

#include "PixelSurface.h"

#include <Messenger.h>
#include <Region.h>

class BBitmap;
class BCursor;
class BMessage;
class BView;
class BWindow;

// A bitmap that accepts views, or a window. Coordinates are logical pixels of the surface, (0, 0) its left
// top corner. Called by views only, on the thread that has the host locked. Outlives the views attached to
// it.
class ViewHost {
  public:
    ViewHost() = default;
    virtual ~ViewHost();
    ViewHost(const ViewHost&) = delete;
    ViewHost& operator=(const ViewHost&) = delete;

    // Must be asked anew for every drawing operation: windows change their size.
    virtual PixelSurface Surface() const = 0;
    // Null where there is no window.
    virtual BWindow* Window() const { return nullptr; }
    // The region that drawing is limited to beyond the views' own frames: while a window updates, its damaged
    // region. Null for no limit.
    virtual const BRegion* DrawingLimit() const { return nullptr; }
    virtual bool IsLocked() const = 0;
    // Where the surface's left top corner lies on the screen.
    virtual BPoint ScreenOrigin() const { return B_ORIGIN; }

    // These pixels have been drawn.
    virtual void SurfaceChanged(const clipping_rect& /*logical*/) {}
    // This part of the view needs to be drawn again.
    virtual void Invalidate(BView* /*view*/, const BRegion& /*region*/) {}
    // The view's contents have moved by this distance within the region that it and its children show. A host
    // that does nothing else redraws all of it.
    virtual void ContentsScrolled(BView* view, const BRegion& region, int32 /*dx*/, int32 /*dy*/) {
        Invalidate(view, region);
    }
    // The view that the others lie in and that they do not know as their parent; null where there is none.
    virtual const BView* RootView() const { return nullptr; }
    // Called when the view has got the host, before its own hook is; a parent before its children.
    virtual void ViewAdded(BView* /*view*/) {}
    // Called before the view loses the host, for it and for each view below it.
    virtual void ViewRemoved(BView* /*view*/) {}

    virtual void Flush() {}
    virtual void Sync() {}

    // Live input; a host without any answers an idle pointer outside of everything, and false.
    virtual bool GetMouse(BView* view, BPoint* surfacePoint, uint32* buttons, bool checkMessageQueue);
    virtual bool IsFocus(const BView* /*view*/) const { return false; }
    virtual void SetFocus(BView* /*view*/, bool /*focus*/) {}
    virtual status_t SetMouseEventMask(BView* view, uint32 mask, uint32 options);
    virtual void EventMaskChanged(BView* /*view*/) {}
    virtual void ViewFlagsChanged(BView* /*view*/) {}
    // A key that no view had a use for, in the end. True when the host has.
    virtual bool UnusedKey(BView* /*view*/, const char* /*bytes*/, int32 /*numBytes*/) { return false; }
    // Where the focus view's text caret stands, in its coordinates, for input methods that open windows
    // there.
    virtual void SetTextCaret(BView* /*view*/, BRect /*caret*/) {}
    // Null takes the view's cursor away.
    virtual void SetViewCursor(BView* /*view*/, const BCursor* /*cursor*/) {}

    // See BView; the rectangle on the surface.
    virtual void BeginRectTracking(BRect /*rect*/, uint32 /*style*/) {}
    virtual void EndRectTracking() {}

    struct DragStart {
        const BMessage* message = nullptr;
        BRect outline;
        const BBitmap* picture = nullptr; // in the place of the outline
        BPoint offset;                    // of the pointer in the outline or picture
        BMessenger replyTo;
    };
    // Borrows everything for the call.
    virtual void StartDrag(const DragStart& /*drag*/) {}
};
