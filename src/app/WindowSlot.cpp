#include "app/WindowSlot.h"

#include <Window.h>

void WindowSlot::Fill(BWindow* window) {
    mMessenger = BMessenger(window);
    mWindow.store(window);
}

void WindowSlot::Empty(const BWindow* window) {
    BWindow* expected = const_cast<BWindow*>(window);
    mWindow.compare_exchange_strong(expected, nullptr);
}

bool WindowSlot::Activate() {
    bool activated = false;
    UseLocked([&](BWindow* window) {
        window->Activate(true);
        activated = true;
    });
    return activated;
}

void WindowSlot::Close() {
    if (BWindow* const window = LockedWindow())
        window->Close();
    mWindow.store(nullptr);
}

BWindow* WindowSlot::LockedWindow() {
    BWindow* const window = mWindow.load();
    return window != nullptr && mMessenger.LockTarget() ? window : nullptr;
}

void WindowSlot::Unlock(BWindow* window) {
    window->Unlock();
}
