// The place that the application keeps for one of its top-level windows.
#pragma once

#include <Messenger.h>

#include <atomic>

class BWindow;

// Empty, or holding a live window. The application's thread fills it, as it makes the window, and closes what
// is in it; a window that closes itself empties its slot in its own thread. All threads see these steps in
// one order, so of two windows that close at once, the second finds both slots empty.
class WindowSlot {
  public:
    WindowSlot() = default;
    WindowSlot(const WindowSlot&) = delete;
    WindowSlot& operator=(const WindowSlot&) = delete;

    // Any thread.
    bool IsEmpty() const { return mWindow.load() == nullptr; }

    // In the application's thread, while the window is made and has not been shown: once it runs, it may
    // close at any time.
    void Fill(BWindow* window);
    // By the window, in its thread, as it closes.
    void Empty(const BWindow* window);

    // In the application's thread. False when there is no window (any more).
    bool Activate();
    // In the application's thread: without asking the window. The slot is empty afterwards, also when the
    // window could not be locked. Returns when the window has gone.
    void Close();
    // In the application's thread: calls `use(window)` with the window locked, if there is one.
    template <typename Use>
    void UseLocked(Use use) {
        if (BWindow* const window = LockedWindow()) {
            use(window);
            Unlock(window);
        }
    }

  private:
    // Null when there is none, or it went away meanwhile.
    BWindow* LockedWindow();
    static void Unlock(BWindow* window);

    std::atomic<BWindow*> mWindow{nullptr};
    // Tells whether the window still lives, which its address does not. The application's thread's.
    BMessenger mMessenger;
};
