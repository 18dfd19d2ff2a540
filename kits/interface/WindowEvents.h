// WindowEvents: what the display tells of a window, turned into messages to it.
#pragma once

#include "DragSession.h"

#include <ThreadSafety.h>

#include "host/api/display.h"

#include <atomic>
#include <memory>
#include <optional>

class BLooper;
class LooperState;

// Messages that the display's thread posts to a window, beside the platform's own. Those of the pointer carry
// "screen_where", "window_where" (BPoint), "buttons", "modifiers" (int32), "when" (int64), and "be:drag"
// (int32), the number of the drag, while something is dragged.
inline constexpr uint32 kWindowAreaChanged = '_WAR';
inline constexpr uint32 kWindowScaleChanged = '_WSL';
inline constexpr uint32 kWindowMarginsChanged = '_WMC';
inline constexpr uint32 kWindowStateChanged = '_WST'; // "state" int32, of host::WindowState
inline constexpr uint32 kWindowDragEnded = '_WDE';    // the drag that the window began is over
// Posted by a window to itself: draw what is damaged, show what was drawn.
inline constexpr uint32 kWindowUpdate = '_UPD';

// The display's side runs in the display's thread and does nothing but post and remember; it takes no
// looper's lock. The other calls are for the window's thread.
class WindowEvents : public host::WindowListener {
  public:
    // The looper must be alive; it may go away later.
    explicit WindowEvents(const BLooper* window);

    struct AreaNews {
        host::Area content;
        uint64 wishes = 0;
    };
    // The newest area that has not been taken yet.
    std::optional<AreaNews> TakeArea();
    double Scale();
    host::FrameMargins Margins();
    // A pulse was handled: the next one may come.
    void PulseTaken() { mPulseWaits = false; }
    // The data of the drag of that number; nothing when a later one has come.
    struct Dragged {
        int32 number = 0;
        std::shared_ptr<const OwnDrag> own;
        std::shared_ptr<const host::DataFormats> foreign;
    };
    Dragged DragOf(int32 number);

    void area_changed(host::Area content, std::uint64_t wishes) override;
    void scale_changed(double scale) override;
    void margins_changed(host::FrameMargins margins) override;
    void activated(bool active) override;
    void state_changed(host::WindowState state) override;
    void close_requested() override;
    void pointer(const host::PointerInput& input) override;
    void wheel(const host::WheelInput& input) override;
    void key(const host::KeyInput& input) override;
    void text_committed(const std::string& text) override;
    void text_composed(const std::string& text, int caret) override;
    void drag(const host::DragInput& input) override;
    void drag_ended(bool accepted) override;
    void popups_dismissed() override;
    void screens_changed() override;
    void pulse() override;

  private:
    void Post(const BMessage& message);
    // In the place of a move that nobody has seen yet, so that moves do not pile up.
    void PostMove(const BMessage& message);

    const std::shared_ptr<LooperState> mWindow;
    std::atomic<bool> mPulseWaits{false};
    GuardMutex mMutex;
    AreaNews mArea GUARDED_BY(mMutex);
    bool mAreaWaits GUARDED_BY(mMutex) = false;
    double mScale GUARDED_BY(mMutex) = 1.0;
    host::FrameMargins mMargins GUARDED_BY(mMutex);
    Dragged mDragged GUARDED_BY(mMutex);
};
