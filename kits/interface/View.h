// BView: a rectangle in a window or bitmap that draws and takes input.
#pragma once

#include <Font.h>
#include <Handler.h>
#include <InterfaceDefs.h>
#include <Rect.h>
#include <Region.h>

#include <memory>
#include <vector>

class BBitmap;
class BCursor;
class BMessage;
class BPolygon;
class BScrollBar;
class BScrollView;
class BString;
class BWindow;
class Painter;
class ViewHost;
struct DrawingState;
struct Ink;
struct PixelSurface;

// A view owns its children. Positions are given in its own coordinate system, in which Bounds() is the part
// that shows: its left top corner is (0, 0) until the view is scrolled. Whole numbers are pixel centres,
// fractions are rounded to the nearest; both ends of lines and all four edges of rectangles are drawn.
//
// Thread rule: a view that belongs to a window or bitmap may only be used by the thread that has locked it;
// one that belongs to none by one thread at a time.
//
// Drawing happens at once, in the window's or bitmap's image; it is limited to the part of the view that no
// ancestor cuts off and no child covers. Drawing on a view that belongs to nothing does nothing.
class BView : public BHandler {
  public:
    BView(BRect frame, const char* name, uint32 resizingMode, uint32 flags);
    // From what Archive() wrote; missing fields take the values of a new view.
    explicit BView(BMessage* archive);
    ~BView() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_frame" (BRect), "_resize_mode", "_flags" (int32), "_color" (int32: high, low and view colour),
    // the origin "_orig" where it is not (0, 0), and deep, the children's archives "_views".
    status_t Archive(BMessage* archive, bool deep = true) const override;

    virtual void AttachedToWindow();
    virtual void AllAttached();
    virtual void DetachedFromWindow();
    virtual void AllDetached();
    void MessageReceived(BMessage* message) override;

    // The view must have no parent; it becomes the last child, or the one before `before`, and its parent's.
    virtual void AddChild(BView* child, BView* before = nullptr);
    // The child is the caller's again. False when it is none of this view's children.
    virtual bool RemoveChild(BView* child);
    // Out of its parent, window or bitmap; false when it has none.
    bool RemoveSelf();
    int32 CountChildren() const;
    BView* ChildAt(int32 index) const;
    BView* NextSibling() const;
    BView* PreviousSibling() const;
    // Null for a window's or bitmap's topmost views.
    BView* Parent() const;
    // This view or the first below it of that name.
    BView* FindView(const char* name) const;

    // Null outside a window.
    BWindow* Window() const;

    virtual void Draw(BRect updateRect);
    virtual void DrawAfterChildren(BRect updateRect);
    virtual void MouseDown(BPoint where);
    virtual void MouseUp(BPoint where);
    // `code` is B_ENTERED_VIEW, B_INSIDE_VIEW, B_EXITED_VIEW or B_OUTSIDE_VIEW; `dragMessage` is null while
    // nothing is dragged.
    virtual void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage);
    virtual void WindowActivated(bool active);
    virtual void KeyDown(const char* bytes, int32 numBytes);
    virtual void KeyUp(const char* bytes, int32 numBytes);
    virtual void Pulse();
    virtual void FrameMoved(BPoint newPosition);
    virtual void FrameResized(float newWidth, float newHeight);
    virtual void TargetedByScrollView(BScrollView* scrollView);

    BRect Bounds() const { return mBounds; }
    // In the parent's coordinates.
    BRect Frame() const;
    BPoint LeftTop() const { return mBounds.LeftTop(); }
    void MoveBy(float dh, float dv);
    void MoveTo(BPoint where);
    void MoveTo(float x, float y);
    void ResizeBy(float dh, float dv);
    // Width and height are right - left and bottom - top. Children move and grow as their resizing modes say.
    void ResizeTo(float width, float height);
    virtual void GetPreferredSize(float* width, float* height);
    virtual void ResizeToPreferred();
    void ScrollBy(float dh, float dv);
    void ScrollTo(float x, float y) { ScrollTo(BPoint(x, y)); }
    // Makes the point the left top corner of Bounds(), and tells the scroll bars.
    virtual void ScrollTo(BPoint where);
    BScrollBar* ScrollBar(orientation posture) const;

    BPoint ConvertToParent(BPoint point) const;
    BRect ConvertToParent(BRect rect) const;
    void ConvertToParent(BPoint* point) const { *point = ConvertToParent(*point); }
    void ConvertToParent(BRect* rect) const { *rect = ConvertToParent(*rect); }
    BPoint ConvertFromParent(BPoint point) const;
    BRect ConvertFromParent(BRect rect) const;
    void ConvertFromParent(BPoint* point) const { *point = ConvertFromParent(*point); }
    void ConvertFromParent(BRect* rect) const { *rect = ConvertFromParent(*rect); }
    BPoint ConvertToScreen(BPoint point) const;
    BRect ConvertToScreen(BRect rect) const;
    void ConvertToScreen(BPoint* point) const { *point = ConvertToScreen(*point); }
    void ConvertToScreen(BRect* rect) const { *rect = ConvertToScreen(*rect); }
    BPoint ConvertFromScreen(BPoint point) const;
    BRect ConvertFromScreen(BRect rect) const;
    void ConvertFromScreen(BPoint* point) const { *point = ConvertFromScreen(*point); }
    void ConvertFromScreen(BRect* rect) const { *rect = ConvertFromScreen(*rect); }

    // Calls nest: a view is hidden as long as it or an ancestor has been hidden more often than shown.
    virtual void Show();
    virtual void Hide();
    bool IsHidden() const;
    // Without counting what hides `lookingFrom`, an ancestor, or those above it.
    bool IsHidden(const BView* lookingFrom) const;

    virtual void SetFlags(uint32 flags);
    uint32 Flags() const { return mFlags; }
    virtual void SetResizingMode(uint32 mode);
    uint32 ResizingMode() const { return mResizingMode; }
    void SetViewColor(uchar red, uchar green, uchar blue, uchar alpha = 255);
    // What the background is cleared to before Draw(); B_TRANSPARENT_COLOR leaves it as it is.
    virtual void SetViewColor(rgb_color color);
    rgb_color ViewColor() const { return mViewColor; }

    // The drawing state; PushState() keeps it until PopState(), with a new origin, scale and clipping on top
    // of the old ones. PopState() without PushState() does nothing.
    void PushState();
    void PopState();
    void SetOrigin(BPoint where) { SetOrigin(where.x, where.y); }
    void SetOrigin(float x, float y);
    BPoint Origin() const;
    void SetScale(float scale) const;
    float Scale() const;
    void SetHighColor(uchar red, uchar green, uchar blue, uchar alpha = 255);
    virtual void SetHighColor(rgb_color color);
    rgb_color HighColor() const;
    void SetLowColor(uchar red, uchar green, uchar blue, uchar alpha = 255);
    virtual void SetLowColor(rgb_color color);
    rgb_color LowColor() const;
    virtual void SetDrawingMode(drawing_mode mode);
    drawing_mode DrawingMode() const;
    void SetBlendingMode(source_alpha alphaSource, alpha_function alphaFunction);
    void GetBlendingMode(source_alpha* alphaSource, alpha_function* alphaFunction) const;
    virtual void SetPenSize(float size);
    float PenSize() const;
    void SetLineMode(cap_mode lineCap, join_mode lineJoin, float miterLimit = B_DEFAULT_MITER_LIMIT);
    cap_mode LineCapMode() const;
    join_mode LineJoinMode() const;
    float LineMiterLimit() const;
    virtual void SetFont(const BFont* font, uint32 mask = B_FONT_ALL);
    void GetFont(BFont* font) const;
    void SetFontSize(float size);
    void ForceFontAliasing(bool enable);
    void GetFontHeight(font_height* height) const;

    // In drawing coordinates; null takes the limit of this state away.
    virtual void ConstrainClippingRegion(BRegion* region);
    // What is visible and not clipped, in view coordinates; in Draw(), of what is drawn anew.
    void GetClippingRegion(BRegion* region) const;

    float StringWidth(const char* string) const;
    float StringWidth(const char* string, int32 length) const;
    void GetStringWidths(char* stringArray[], int32 lengthArray[], int32 numStrings,
                         float widthArray[]) const;
    void TruncateString(BString* inOut, uint32 mode, float width) const;

    void MovePenTo(BPoint where);
    void MovePenTo(float x, float y) { MovePenTo(BPoint(x, y)); }
    void MovePenBy(float x, float y);
    BPoint PenLocation() const;

    // Lines leave the pen at their end.
    void StrokeLine(BPoint to, pattern dots = B_SOLID_HIGH);
    void StrokeLine(BPoint from, BPoint to, pattern dots = B_SOLID_HIGH);
    // Between Begin and End, lines of colours of their own are collected; End draws them in order.
    void BeginLineArray(int32 count);
    void AddLine(BPoint from, BPoint to, rgb_color color);
    void EndLineArray();

    void StrokeRect(BRect rect, pattern dots = B_SOLID_HIGH);
    void FillRect(BRect rect, pattern dots = B_SOLID_HIGH);
    void FillRegion(BRegion* region, pattern dots = B_SOLID_HIGH);
    void InvertRect(BRect rect);
    void StrokeRoundRect(BRect rect, float xRadius, float yRadius, pattern dots = B_SOLID_HIGH);
    void FillRoundRect(BRect rect, float xRadius, float yRadius, pattern dots = B_SOLID_HIGH);
    void StrokePolygon(const BPolygon* polygon, bool closed = true, pattern dots = B_SOLID_HIGH);
    void StrokePolygon(const BPoint* points, int32 count, bool closed = true, pattern dots = B_SOLID_HIGH);
    void StrokePolygon(const BPoint* points, int32 count, BRect bounds, bool closed = true,
                       pattern dots = B_SOLID_HIGH);
    void FillPolygon(const BPolygon* polygon, pattern dots = B_SOLID_HIGH);
    void FillPolygon(const BPoint* points, int32 count, pattern dots = B_SOLID_HIGH);
    // The points are stretched from their own frame to `bounds`.
    void FillPolygon(const BPoint* points, int32 count, BRect bounds, pattern dots = B_SOLID_HIGH);
    void StrokeTriangle(BPoint a, BPoint b, BPoint c, pattern dots = B_SOLID_HIGH);
    void StrokeTriangle(BPoint a, BPoint b, BPoint c, BRect bounds, pattern dots = B_SOLID_HIGH);
    void FillTriangle(BPoint a, BPoint b, BPoint c, pattern dots = B_SOLID_HIGH);
    void FillTriangle(BPoint a, BPoint b, BPoint c, BRect bounds, pattern dots = B_SOLID_HIGH);
    void StrokeEllipse(BPoint center, float xRadius, float yRadius, pattern dots = B_SOLID_HIGH);
    void StrokeEllipse(BRect rect, pattern dots = B_SOLID_HIGH);
    void FillEllipse(BPoint center, float xRadius, float yRadius, pattern dots = B_SOLID_HIGH);
    void FillEllipse(BRect rect, pattern dots = B_SOLID_HIGH);
    // Angles in degrees, counter-clockwise from the right.
    void StrokeArc(BPoint center, float xRadius, float yRadius, float startAngle, float arcAngle,
                   pattern dots = B_SOLID_HIGH);
    void StrokeArc(BRect rect, float startAngle, float arcAngle, pattern dots = B_SOLID_HIGH);
    void FillArc(BPoint center, float xRadius, float yRadius, float startAngle, float arcAngle,
                 pattern dots = B_SOLID_HIGH);
    void FillArc(BRect rect, float startAngle, float arcAngle, pattern dots = B_SOLID_HIGH);
    void StrokeBezier(BPoint* controlPoints, pattern dots = B_SOLID_HIGH);
    void FillBezier(BPoint* controlPoints, pattern dots = B_SOLID_HIGH);

    // Copies the pixels of one rectangle of the view to another, smoothly scaled where their sizes differ.
    // What of the source is not visible cannot be copied; its place in the target is invalidated.
    void CopyBits(BRect source, BRect target);

    // `bitmapRect` is in the bitmap's coordinates. Where the sizes differ the picture is scaled to fill
    // `viewRect`: averaged where it shrinks; where it grows, interpolated, but pixels of B_CMAP8 and B_GRAY1
    // bitmaps are repeated. Transparent pixels are left out in all drawing modes but B_OP_COPY; in B_OP_OVER
    // partly transparent ones are mixed in. The Async forms need no Sync() here.
    void DrawBitmapAsync(const BBitmap* bitmap, BRect bitmapRect, BRect viewRect);
    void DrawBitmapAsync(const BBitmap* bitmap, BRect viewRect);
    void DrawBitmapAsync(const BBitmap* bitmap, BPoint where);
    void DrawBitmapAsync(const BBitmap* bitmap);
    void DrawBitmap(const BBitmap* bitmap, BRect bitmapRect, BRect viewRect);
    void DrawBitmap(const BBitmap* bitmap, BRect viewRect);
    void DrawBitmap(const BBitmap* bitmap, BPoint where);
    // At the pen's location.
    void DrawBitmap(const BBitmap* bitmap);

    // UTF-8 with its baseline at the pen, or at `location`; the pen moves to the text's end. Bytes that are
    // not valid UTF-8 are drawn as replacement characters. `delta` is added after each character.
    void DrawChar(char c);
    void DrawChar(char c, BPoint location);
    void DrawString(const char* string, escapement_delta* delta = nullptr);
    void DrawString(const char* string, BPoint location, escapement_delta* delta = nullptr);
    void DrawString(const char* string, int32 length, escapement_delta* delta = nullptr);
    void DrawString(const char* string, int32 length, BPoint location, escapement_delta* delta = nullptr);

    // Wait until all drawing can be seen, or see to it that it soon is. Without effect on a bitmap, where it
    // can be seen at once.
    void Sync() const;
    void Flush() const;

    // Have the view, or a part of it, drawn again soon. Without effect outside a window.
    void Invalidate();
    void Invalidate(BRect rect);
    void Invalidate(const BRegion* region);

    // The pointer in view coordinates. `checkMessageQueue` takes the next mouse message that waits for the
    // window, where there is one, before it looks at the pointer itself.
    void GetMouse(BPoint* location, uint32* buttons, bool checkMessageQueue = true);
    virtual void MakeFocus(bool focus = true);
    bool IsFocus() const;
    status_t SetEventMask(uint32 mask, uint32 options = 0);
    uint32 EventMask() const { return mEventMask; }
    // Until EndRectTracking(), an outline follows the pointer: B_TRACK_WHOLE_RECT moves the rectangle (in
    // view coordinates) along, B_TRACK_RECT_CORNER only its right bottom corner. It is drawn over all views
    // of the window, and not beyond it. One for each window; without effect outside of one.
    void BeginRectTracking(BRect startRect, uint32 style = B_TRACK_WHOLE_RECT);
    void EndRectTracking();
    // For the time that a button is down; only from MouseDown().
    status_t SetMouseEventMask(uint32 mask, uint32 options = 0);

    // The pointer's shape over this view and those below it that have none of their own. Null for none.
    void SetViewCursor(const BCursor* cursor, bool sync = true);
    // With a button held: what is dragged is shown as an outline (`dragRect`, in view coordinates) or as the
    // picture, `offset` being the pointer's place in it; the view's window owns the picture from here on, the
    // message stays the caller's. Views under the pointer hear of the message by MouseMoved(). Where the
    // button is let go, the view gets MouseUp() and then the message, as one that was dropped, whose replies
    // go to `replyTo`, or to this view. Other programs are offered the files of its entry_ref field "refs" to
    // copy.
    void DragMessage(BMessage* message, BRect dragRect, BHandler* replyTo = nullptr);
    void DragMessage(BMessage* message, BBitmap* picture, BPoint offset, BHandler* replyTo = nullptr);
    void DragMessage(BMessage* message, BBitmap* picture, drawing_mode mode, BPoint offset,
                     BHandler* replyTo = nullptr);

    // For the kit's own use, by what views are attached to. The host calls them for its topmost views alone.
    ViewHost* Host() const { return mHost; }
    void AttachToHost(ViewHost* host);
    void DetachFromHost();
    BPoint ConvertToSurface(BPoint point) const;
    BPoint ConvertFromSurface(BPoint point) const;
    // What this view may draw on, in view coordinates: not hidden, within all ancestors and the surface,
    // outside of children where `WithoutChildren` says so.
    enum class Covered { WithChildren, WithoutChildren };
    BRegion VisibleRegion(Covered covered) const;
    // After the host's surface or its drawing limit has changed; on a topmost view, for all below it.
    void ForgetClipping();

  private:
    friend class BScrollBar;

    struct LineArray;

    void SetParts(BRect frame, uint32 resizingMode, uint32 flags);
    void AttachTree(ViewHost* host);
    void AnnounceAttached();
    void AnnounceDetached();
    void DetachTree();
    void GeometryChanged();
    void ParentResized(float dh, float dv);
    BRegion VisibleOnSurface(Covered covered) const;
    clipping_rect FrameOnSurface() const;

    // Null when there is nothing to draw on. Valid until the next call.
    Painter* PreparePainter();
    Ink MakeInk(const pattern& dots) const;
    void FillPixels(const BRegion& surfaceRegion, const pattern& dots);
    // Tells the host what has been drawn, as far as the clip let it through.
    void Changed(const Painter& painter, const clipping_rect& surfaceRect);
    clipping_rect ToSurfaceRect(BRect drawing) const;
    BPoint ToSurface(BPoint drawing) const;
    std::vector<BPoint> ToSurface(const BPoint* points, int32 count) const;
    int32 PenWidth() const;
    void StrokePoints(const std::vector<BPoint>& surfacePoints, bool closed, const pattern& dots);
    void DrawText(const char* string, size_t length, BPoint location, const escapement_delta* delta);
    void DrawLine(Painter& painter, BPoint surfaceFrom, BPoint surfaceTo, const Ink& ink);

    BView* mParent = nullptr;
    std::vector<BView*> mChildren;
    ViewHost* mHost = nullptr;
    BPoint mPosition; // of the left top corner, in the parent's coordinates
    BRect mBounds;
    uint32 mResizingMode = 0;
    uint32 mFlags = 0;
    int32 mHideCount = 0;
    uint32 mEventMask = 0;
    rgb_color mViewColor = make_color(255, 255, 255);
    BScrollBar* mHorizontalScrollBar = nullptr;
    BScrollBar* mVerticalScrollBar = nullptr;
    std::unique_ptr<DrawingState> mState;
    std::vector<DrawingState> mPushedStates;
    std::unique_ptr<LineArray> mLineArray;
    std::unique_ptr<Painter> mPainter;
    // What the geometry alone lets through, on the surface; and whether the painter's clip is up to date.
    mutable BRegion mVisible;
    mutable bool mVisibleKnown = false;
    bool mClipKnown = false;
};
