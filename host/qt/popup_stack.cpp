#include "popup_stack.h"

#include "screen_window.h"

#include <algorithm>

namespace host {

PopupStack& PopupStack::instance() {
    static PopupStack* const stack = new PopupStack;
    return *stack;
}

void PopupStack::push(ScreenWindow* window) {
    remove(window);
    windows_.push_back(window);
    // The grab brings us the presses outside of the program's windows; which pop-up is told is decided here.
    window->setMouseGrabEnabled(true);
    window->setKeyboardGrabEnabled(true);
}

void PopupStack::remove(ScreenWindow* window) {
    const auto found = std::find(windows_.begin(), windows_.end(), window);
    if (found == windows_.end()) {
        return;
    }
    windows_.erase(found);
    window->setMouseGrabEnabled(false);
    window->setKeyboardGrabEnabled(false);
    if (!windows_.empty()) {
        windows_.back()->setMouseGrabEnabled(true);
        windows_.back()->setKeyboardGrabEnabled(true);
    }
}

ScreenWindow* PopupStack::at(const QPointF& on_screen) const {
    const auto found = std::find_if(windows_.rbegin(), windows_.rend(), [&](const ScreenWindow* window) {
        return QRectF(window->geometry()).contains(on_screen);
    });
    return found == windows_.rend() ? nullptr : *found;
}

void PopupStack::dismiss() const {
    if (!windows_.empty()) {
        windows_.front()->listener().popups_dismissed();
    }
}

} // namespace host
