#pragma once

#include <cstdint>
#include <string>
#include <sys/types.h>
#include <vector>

namespace test {

/// A screen of a test's own: Xvfb, with or without a window manager, and the hands to work on it. Sets
/// DISPLAY and takes WAYLAND_DISPLAY and QT_QPA_PLATFORM away, for this process and those it starts. One a
/// process, made before anything connects to a display.
class Desktop {
  public:
    enum class WindowManager { none, openbox };

    explicit Desktop(WindowManager manager);
    ~Desktop();
    Desktop(const Desktop&) = delete;
    Desktop& operator=(const Desktop&) = delete;

    /// False when the screen could not be made; the reason is on standard error.
    bool works() const { return works_; }
    const std::string& display() const { return display_; }

    /// xdotool with these words; what it has written, without the last line's end.
    std::string tool(const std::vector<std::string>& words) const;
    void move_pointer(int x, int y) const;
    void press(int button = 1) const;
    void release(int button = 1) const;
    void click(int x, int y, int button = 1) const;
    /// Press here, some steps, let go there; `pause` milliseconds between the steps.
    void drag(int from_x, int from_y, int to_x, int to_y, int pause = 20) const;
    void key(const std::string& name) const;
    /// The X number of the visible window with this title, waiting up to `seconds` for it; empty when there
    /// is none.
    std::string window(const std::string& title, int seconds = 10) const;

    /// 0xRRGGBB, as shown at the moment.
    std::uint32_t pixel(int x, int y) const;
    /// Whether the pixel gets that colour within half a minute or so.
    bool becomes(int x, int y, std::uint32_t color) const;
    void screenshot(const std::string& path) const;

  private:
    bool works_ = false;
    std::string display_;
    pid_t server_ = -1;
    pid_t manager_ = -1;
};

} // namespace test
