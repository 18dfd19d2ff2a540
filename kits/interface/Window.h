// BWindow: a window on the screen, with a looper thread of its own.
#pragma once

#include <InterfaceDefs.h>
#include <Looper.h>
#include <Rect.h>

#include <memory>

class BMenuBar;
class BMenuItem;
class BButton;
class BView;
class BCursor;
class WindowHost;

enum window_type {
    B_UNTYPED_WINDOW = 0,
    B_TITLED_WINDOW = 1,
    B_MODAL_WINDOW = 3,
    B_DOCUMENT_WINDOW = 11,
    B_BORDERED_WINDOW = 20,
    B_FLOATING_WINDOW = 21
};

enum window_look {
    B_TITLED_WINDOW_LOOK = 1,
    B_MODAL_WINDOW_LOOK = 3,
    B_FLOATING_WINDOW_LOOK = 7,
    B_DOCUMENT_WINDOW_LOOK = 11,
    B_NO_BORDER_WINDOW_LOOK = 19,
    B_BORDERED_WINDOW_LOOK = 20
};

enum window_feel : int32 {
    B_NORMAL_WINDOW_FEEL = 0,
    B_MODAL_APP_WINDOW_FEEL = 1,
    B_MODAL_SUBSET_WINDOW_FEEL = 2,
    B_MODAL_ALL_WINDOW_FEEL = 3,
    B_FLOATING_APP_WINDOW_FEEL = 4,
    B_FLOATING_SUBSET_WINDOW_FEEL = 5,
    B_FLOATING_ALL_WINDOW_FEEL = 6
};

// Flags.
enum : uint32 {
    B_NOT_MOVABLE = 0x00000001,
    B_NOT_RESIZABLE = 0x00000002,
    B_NOT_H_RESIZABLE = 0x00000004,
    B_NOT_V_RESIZABLE = 0x00000008,
    B_WILL_ACCEPT_FIRST_CLICK = 0x00000010,
    B_NOT_CLOSABLE = 0x00000020,
    B_NOT_ZOOMABLE = 0x00000040,
    B_AVOID_FRONT = 0x00000080,
    B_NO_WORKSPACE_ACTIVATION = 0x00000100,
    B_OUTLINE_RESIZE = 0x00001000,
    B_AVOID_FOCUS = 0x00002000,
    B_NOT_MINIMIZABLE = 0x00004000,
    B_NOT_ANCHORED_ON_ACTIVATE = 0x00020000,
    B_ASYNCHRONOUS_CONTROLS = 0x00080000,
    // The application is asked to quit when this window has quit.
    B_QUIT_ON_WINDOW_CLOSE = 0x00100000
};

inline constexpr uint32 B_CURRENT_WORKSPACE = 0;
inline constexpr uint32 B_ALL_WORKSPACES = 0xffffffff;

// A looper: see there for its life. It is hidden at first; the first Show() starts its thread and gives up
// the constructor's lock. It ends by Quit(), Close(), or B_QUIT_REQUESTED, which the close box and Control+W
// (unless that is a shortcut of the window's own) post to it; then it deletes itself and its views.
//
// Frame() is the rectangle of the content in screen coordinates, as with views: its width is right - left,
// one less than its pixels. The title and border lie around it. Setting a frame that was read before puts the
// window back to where it was.
//
// Drawing: what Invalidate() or the desktop has damaged is drawn in the window's thread, after the messages
// that were waiting: all views in one go, the background cleared to the view's colour first. What is drawn
// outside of that is seen after the message at hand, or at once with Flush().
//
// Workspaces are the window manager's matter: the calls for them are not offered.
class BWindow : public BLooper {
  public:
    BWindow(BRect frame, const char* title, window_type type, uint32 flags,
            uint32 workspaces = B_CURRENT_WORKSPACE);
    BWindow(BRect frame, const char* title, window_look look, window_feel feel, uint32 flags,
            uint32 workspaces = B_CURRENT_WORKSPACE);
    explicit BWindow(BMessage* archive);
    ~BWindow() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_frame", "_title", "_wlook", "_wfeel", "_flags", "_sizel" (four floats), "_zooml" (two floats),
    // "_pulse" and, deep, the views in "_views".
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void Quit() override;
    void Close() { Quit(); }
    bool QuitRequested() override;
    thread_id Run() override;

    // The view must have no parent. Its positions are the content's, (0, 0) the left top corner.
    void AddChild(BView* child, BView* before = nullptr);
    bool RemoveChild(BView* child);
    int32 CountChildren() const;
    BView* ChildAt(int32 index) const;
    BView* FindView(const char* name) const;
    // The frontmost view there that is not hidden.
    BView* FindView(BPoint point) const;
    BView* CurrentFocus() const;

    void DispatchMessage(BMessage* message, BHandler* handler) override;
    void MessageReceived(BMessage* message) override;

    // Hooks, called in the window's thread.
    virtual void FrameMoved(BPoint newPosition);
    virtual void FrameResized(float newWidth, float newHeight);
    virtual void WorkspacesChanged(uint32 oldWorkspaces, uint32 newWorkspaces);
    virtual void WorkspaceActivated(int32 workspace, bool state);
    virtual void WindowActivated(bool state);
    virtual void ScreenChanged(BRect screenSize, color_space depth);
    virtual void MenusBeginning();
    virtual void MenusEnded();

    // Called with B_MINIMIZE and B_ZOOM as well.
    virtual void Minimize(bool minimize);
    // The application's Zoom() calls the hook with the largest frame that the screen and the limits allow, or
    // the one before the last zoom; the hook moves and resizes.
    void Zoom();
    virtual void Zoom(BPoint leftTop, float width, float height);
    void SetZoomLimits(float maxWidth, float maxHeight);

    // What a key with B_COMMAND_KEY (Control counts as it, and it is always added) means, before the focus
    // gets to see it: a shortcut of the window, an item of the key menu bar, or else one of those every
    // window has: W closes the window, Q ends the application, X, C, V, A and Z send B_CUT, B_COPY, B_PASTE,
    // B_SELECT_ALL and B_UNDO to the focus view. `message` belongs to the window from here on; it goes to the
    // window, or to `target`, with a null target to the focus view. A null message makes the key mean
    // nothing.
    void AddShortcut(uint32 key, uint32 modifiers, BMessage* message);
    void AddShortcut(uint32 key, uint32 modifiers, BMessage* message, BHandler* target);
    bool HasShortcut(uint32 key, uint32 modifiers);
    void RemoveShortcut(uint32 key, uint32 modifiers);
    void SetDefaultButton(BButton* button);
    BButton* DefaultButton() const;
    // The menu bar that Alt opens: the first one that was attached, unless set.
    void SetKeyMenuBar(BMenuBar* bar);
    BMenuBar* KeyMenuBar() const;

    // Draws what waits to be drawn, now.
    void UpdateIfNeeded();
    bool NeedsUpdate() const;
    // While calls are nested, nothing is brought to the screen.
    void BeginViewTransaction();
    void EndViewTransaction();
    void DisableUpdates() { BeginViewTransaction(); }
    void EnableUpdates() { EndViewTransaction(); }
    bool InViewTransaction() const;
    void Flush() const;
    // Flush(), and wait until it can be seen, a tenth of a second at most.
    void Sync() const;

    // Pulse messages, for views with B_PULSE_NEEDED, every so many microseconds; 500000 at first, 0 for none.
    // At most one waits at a time.
    void SetPulseRate(bigtime_t rate);
    bigtime_t PulseRate() const;

    void ConvertToScreen(BPoint* point) const;
    BPoint ConvertToScreen(BPoint point) const;
    void ConvertFromScreen(BPoint* point) const;
    BPoint ConvertFromScreen(BPoint point) const;
    void ConvertToScreen(BRect* rect) const;
    BRect ConvertToScreen(BRect rect) const;
    void ConvertFromScreen(BRect* rect) const;
    BRect ConvertFromScreen(BRect rect) const;

    void MoveBy(float dh, float dv);
    void MoveTo(BPoint leftTop);
    void MoveTo(float x, float y);
    void ResizeBy(float dh, float dv);
    void ResizeTo(float width, float height);
    void CenterIn(const BRect& rect);
    void CenterOnScreen();
    void MoveOnScreen();

    // Calls nest as with views. The first Show() runs the window. A window whose title would be out of reach
    // above the screen is shown as much lower as it takes.
    virtual void Show();
    virtual void Hide();
    bool IsHidden() const;
    bool IsMinimized() const;

    // To the front and active; false sends it behind all others.
    void Activate(bool active = true);
    // Behind all other windows for null, else right behind that one, which comes to the front with it; where
    // the window manager lets us. B_BAD_VALUE for this window.
    status_t SendBehind(const BWindow* window);
    bool IsFront() const;
    bool IsActive() const;
    bool IsModal() const;
    bool IsFloating() const;

    BRect Bounds() const;
    BRect Frame() const;
    // The frame with the title and border around it, as far as the window manager has told.
    BRect DecoratorFrame() const;
    const char* Title() const;
    void SetTitle(const char* title);
    void SetSizeLimits(float minWidth, float maxWidth, float minHeight, float maxHeight);
    void GetSizeLimits(float* minWidth, float* maxWidth, float* minHeight, float* maxHeight);

    status_t SetType(window_type type);
    window_type Type() const;
    status_t SetLook(window_look look);
    window_look Look() const;
    status_t SetFeel(window_feel feel);
    window_feel Feel() const;
    status_t SetFlags(uint32 flags);
    uint32 Flags() const;
    // A window of a subset feel stays above these. B_BAD_VALUE for a window that has none.
    status_t AddToSubset(BWindow* window);
    status_t RemoveFromSubset(BWindow* window);

    BView* LastMouseMovedView() const;
    status_t GetSupportedSuites(BMessage* data) override;

    // For the kit's own use.
    WindowHost* Host() const { return mHost.get(); }

  private:
    BHandler* HandlerFor(BMessage* message, BHandler* target) override;
    void Initialise(BRect frame, const char* title, window_look look, window_feel feel, uint32 flags);
    void DispatchOwn(BMessage* message, BHandler* handler);
    void TakeFrame();
    void TellFrame();
    void SetFrame(BRect frame);
    void KeepTitleInReach();

    std::unique_ptr<WindowHost> mHost;
    int32 mShowLevel = 0;
    bool mMinimized = false;
    bool mActive = false;
    // Shown, and what the window manager puts around it is not known yet.
    bool mTitleToCheck = false;
    // What FrameMoved() and FrameResized() were last called for.
    BRect mToldFrame;
};
