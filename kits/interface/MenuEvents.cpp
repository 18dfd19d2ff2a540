#include "MenuEvents.h"

#include <algorithm>
#include <chrono>
#include <utility>

void MenuEvents::Post(MenuEvent event) {
    GuardLock guard(mMutex);
    const bool replaces = event.kind == MenuEvent::Kind::Moved && !mEvents.empty() &&
                          mEvents.back().kind == MenuEvent::Kind::Moved;
    if (replaces) {
        mEvents.back() = std::move(event);
    } else {
        mEvents.push_back(std::move(event));
    }
    mArrived.notify_one();
}

bool MenuEvents::Any(const std::function<bool(const MenuEvent&)>& isSo) {
    GuardLock guard(mMutex);
    return std::any_of(mEvents.begin(), mEvents.end(), isSo);
}

std::optional<MenuEvent> MenuEvents::Wait(bigtime_t until) {
    constexpr bigtime_t kForEver = bigtime_t{100} * 365 * 24 * 3600 * 1000000;
    const bigtime_t left =
        std::clamp(until == B_INFINITE_TIMEOUT ? kForEver : until - system_time(), bigtime_t{0}, kForEver);
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::microseconds(left);
    GuardLock guard(mMutex);
    while (mEvents.empty()) {
        if (mArrived.wait_until(guard.Native(), deadline) == std::cv_status::timeout && mEvents.empty()) {
            return std::nullopt;
        }
    }
    MenuEvent event = std::move(mEvents.front());
    mEvents.pop_front();
    return event;
}
