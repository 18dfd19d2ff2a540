#pragma once

#include <string>
#include <sys/types.h>

namespace test {

/// A Wayland screen of a test's own: Weston without a real output. Nobody can press or type on it, but what
/// it shows can be looked at. Sets WAYLAND_DISPLAY and takes DISPLAY and QT_QPA_PLATFORM away, for this
/// process and those it starts. Made after XDG_RUNTIME_DIR is what it shall be.
class WaylandDesktop {
  public:
    /// Why there can be none on this machine; empty when there can.
    static std::string problem();

    WaylandDesktop();
    ~WaylandDesktop();
    WaylandDesktop(const WaylandDesktop&) = delete;
    WaylandDesktop& operator=(const WaylandDesktop&) = delete;

    /// False when it does not start.
    bool works() const { return works_; }
    /// What the screen shows, as a PNG file. False when that could not be had.
    bool screenshot(const std::string& path) const;
    /// How many pixels of the screen have the colour 0xRRGGBB at the moment; -1 when that could not be had.
    long count_pixels(unsigned color) const;

  private:
    bool works_ = false;
    std::string folder_;
    pid_t compositor_ = -1;
};

} // namespace test
