// WindowHost: the side of a window that its views are attached to: pixels, updates, pointer and focus.
#pragma once

#include "MouseTracking.h"
#include "RectTracking.h"
#include "Shortcuts.h"
#include "UpdateRegions.h"
#include "ViewHost.h"
#include "WindowEvents.h"
#include "WindowGeometry.h"
#include "WindowTraits.h"

#include <unordered_map>

class BButton;
class BCursor;
class BMenuBar;
class KeyMenuTarget;

// Belongs to a BWindow and is used with it locked. Owns the window's views through one that fills the content
// and that nobody else gets to see.
class WindowHost : public ViewHost {
  public:
    WindowHost(BWindow& window, BRect frame, WindowTraits traits);
    ~WindowHost() override;

    // ViewHost
    PixelSurface Surface() const override;
    BWindow* Window() const override { return &mWindow; }
    const BView* RootView() const override { return mRoot; }
    const BRegion* DrawingLimit() const override { return mUpdating ? &mLimit : nullptr; }
    bool IsLocked() const override;
    BPoint ScreenOrigin() const override { return mGeometry.Frame().LeftTop(); }
    void SurfaceChanged(const clipping_rect& logical) override;
    void Invalidate(BView* view, const BRegion& region) override;
    void ContentsScrolled(BView* view, const BRegion& region, int32 dx, int32 dy) override;
    void ViewAdded(BView* view) override;
    void ViewRemoved(BView* view) override;
    void ViewFlagsChanged(BView* view) override;
    void Flush() override;
    void Sync() override;
    bool GetMouse(BView* view, BPoint* surfacePoint, uint32* buttons, bool checkMessageQueue) override;
    bool IsFocus(const BView* view) const override { return mFocus == view; }
    void SetFocus(BView* view, bool focus) override;
    status_t SetMouseEventMask(BView* view, uint32 mask, uint32 options) override;
    void EventMaskChanged(BView* view) override;
    void SetViewCursor(BView* view, const BCursor* cursor) override;
    void StartDrag(const DragStart& drag) override;
    void BeginRectTracking(BRect rect, uint32 style) override;
    void EndRectTracking() override;
    bool UnusedKey(BView* view, const char* bytes, int32 numBytes) override;
    void SetTextCaret(BView* view, BRect caret) override;

    BView& Root() { return *mRoot; }
    WindowGeometry& Geometry() { return mGeometry; }
    const WindowGeometry& Geometry() const { return mGeometry; }
    WindowTraits& Traits() { return mTraits; }
    const WindowTraits& Traits() const { return mTraits; }
    const std::shared_ptr<host::WindowPeer>& Peer() const { return mPeer; }
    WindowEvents& Events() { return *mEvents; }
    const std::shared_ptr<WindowEvents>& SharedEvents() const { return mEvents; }
    WindowGeometry::Margins Margins() const;
    // Tells the display of changed traits or limits.
    void TraitsChanged();
    // Tells the display of a changed frame, and lays the views out for it.
    void FrameWanted();
    // Takes over what the display has told. True when the frame has changed.
    bool TakeFrame();
    void TakeScale();

    void SetShown(bool shown);
    bool IsShown() const { return mShown; }

    void BeginTransaction() { ++mTransactions; }
    void EndTransaction();
    bool InTransaction() const { return mTransactions > 0; }
    bool NeedsUpdate() const { return mUpdates.IsDamaged(); }
    void Update();
    // Around the handling of a message in the window's own thread: what is drawn meanwhile is shown at its
    // end.
    void BeginMessage() { ++mMessageDepth; }
    void EndMessage();
    // kWindowUpdate has come.
    void TakeUpdate();

    // The frontmost view that shows there, or null; the point in the content's coordinates.
    BView* ViewAt(BPoint point) const;
    // The handler of a message of the pointer or the keyboard, to which "where" is added as that view has it.
    BHandler* TargetOf(BMessage& message, BHandler* handler);
    void MouseDown(BMessage& message, BHandler* handler);
    void MouseUp(BMessage& message, BHandler* handler);
    void MouseMoved(BMessage& message, BHandler* handler);
    // The drag that began here ended elsewhere, or nowhere.
    void DragEnded();
    BView* LastMouseMovedView() const { return mMouse.LastUnder(); }

    BView* Focus() const { return mFocus; }
    // A mapped key: true when it was a shortcut or moved the focus.
    bool HandleKey(const BMessage& message);
    void ModifiersChanged(const BMessage& message);
    Shortcuts& WindowShortcuts() { return mShortcuts; }
    BView* DefaultButton() const { return mDefaultButton; }
    void SetDefaultButton(BView* button) { mDefaultButton = button; }
    BMenuBar* KeyMenuBar() const { return mKeyMenuBar; }
    void SetKeyMenuBar(BMenuBar* bar, BView* view, KeyMenuTarget* target);

    void SetPulseRate(bigtime_t rate);
    bigtime_t PulseRate() const { return mPulseRate; }
    void Pulse();
    void Activated(bool active);

  private:
    class RootFiller;
    bool IsKnown(BView* view) const;
    void ResizePixels();
    void ScheduleUpdate();
    void DrawTree(BView& view, const BRegion& damage);
    void ClearBackground(const BRegion& surfaceRegion, rgb_color color);
    void RefreshPulse();
    void RefreshCursor(BView* under);
    void RefreshTextInput();
    BPoint LivePointer() const;
    void OutlineMoved(const std::vector<clipping_rect>& before);
    void TrackPointer(BPoint place);
    bool InvokeShortcut(uint32 key, uint32 modifiers);
    bool InvokeUsualShortcut(uint32 key, uint32 modifiers);
    bool MoveFocus(bool groups, bool backward);
    const BMessage* DragMessageOf(const BMessage& message);
    // Makes the message at hand the one that was dropped. False when there is nothing to drop.
    bool UnwrapDrop(BMessage& message);

    BWindow& mWindow;
    WindowGeometry mGeometry;
    WindowTraits mTraits;
    std::shared_ptr<WindowEvents> mEvents;
    std::shared_ptr<host::WindowPeer> mPeer;
    BView* mRoot = nullptr; // null while it is being made or deleted
    bool mShown = false;
    uint64 mWishes = 0;

    std::vector<uint32> mPixels;
    host::Size mPixelSize;
    double mScale = 1.0;
    UpdateRegions mUpdates;
    BRegion mLimit;
    bool mUpdating = false;
    bool mUpdatePosted = false;
    int32 mTransactions = 0;
    int32 mMessageDepth = 0;

    MouseTracking mMouse;
    RectTracking mOutline;
    // The data of the drag above the window, turned into a message once.
    int32 mDragNumber = 0;
    std::unique_ptr<BMessage> mDragMessage;
    std::shared_ptr<const OwnDrag> mOwnDrag;
    std::unordered_map<BView*, host::Cursor> mCursors;
    BView* mCursorView = nullptr;

    BView* mFocus = nullptr;
    bool mActive = false;
    Shortcuts mShortcuts;
    BView* mDefaultButton = nullptr;
    BMenuBar* mKeyMenuBar = nullptr;
    BView* mKeyMenuView = nullptr;
    KeyMenuTarget* mKeyMenuTarget = nullptr;
    // Alt is down and nothing else has been pressed since.
    bool mAltAlone = false;
    BRect mCaret;

    bigtime_t mPulseRate = 500000;
    bigtime_t mPulseAsked = 0;
    std::vector<BView*> mPulseViews;
};
