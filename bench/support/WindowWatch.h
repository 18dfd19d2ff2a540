#pragma once

#include <string>
#include <sys/types.h>

struct xcb_connection_t;

namespace bench {

/// A virtual display of its own (Xvfb, no window manager), made the DISPLAY of this process and its children,
/// and a look at what is shown on it. Ends the program when it cannot be made.
class WindowWatch {
  public:
    WindowWatch();
    ~WindowWatch();
    WindowWatch(const WindowWatch&) = delete;
    WindowWatch& operator=(const WindowWatch&) = delete;

    /// Waits until a window of that title is on the screen with a white list at its left side. False when it
    /// is not in time. Looks a thousand times a second.
    bool WaitForWindow(const std::string& title, double seconds);

  private:
    bool IsShown(const std::string& title) const;

    pid_t mServer = -1;
    xcb_connection_t* mConnection = nullptr;
};

} // namespace bench
