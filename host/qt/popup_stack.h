// The pop-ups that are shown, and which of them gets an event.
#pragma once

#include <vector>

class QPointF;

namespace host {

class ScreenWindow;

// Main thread only. Holds windows without owning them; one that goes away takes itself out.
class PopupStack {
  public:
    static PopupStack& instance();

    // Takes the pointer and the keyboard for the first one.
    void push(ScreenWindow* window);
    void remove(ScreenWindow* window);
    bool empty() const { return windows_.empty(); }
    ScreenWindow* top() const { return windows_.empty() ? nullptr : windows_.back(); }
    ScreenWindow* bottom() const { return windows_.empty() ? nullptr : windows_.front(); }
    // The newest one there, or null.
    ScreenWindow* at(const QPointF& on_screen) const;
    // The program is no longer the active one.
    void dismiss() const;

  private:
    std::vector<ScreenWindow*> windows_;
};

} // namespace host
