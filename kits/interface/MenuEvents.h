// What happens to open menus, on its way from the windows that hear of it to the thread that follows it.
#pragma once

#include <OS.h>
#include <Point.h>
#include <ThreadSafety.h>

#include <deque>
#include <functional>
#include <optional>
#include <string>

struct MenuEvent {
    enum class Kind { Moved, Pressed, Released, Wheel, Key, LayoutChanged, Dismissed };
    Kind kind = Kind::Dismissed;
    BPoint where; // on the screen
    float lines = 0;
    std::string bytes; // of a key
    bigtime_t when = 0;
};

// Any thread may post and wait.
class MenuEvents {
  public:
    void Post(MenuEvent event);
    // The oldest event; of moves that follow each other the last one. None when `until` (system_time()) has
    // come before one.
    std::optional<MenuEvent> Wait(bigtime_t until);
    // Whether one of those that wait is so; they go on waiting.
    bool Any(const std::function<bool(const MenuEvent&)>& isSo);

  private:
    GuardMutex mMutex;
    std::condition_variable mArrived;
    std::deque<MenuEvent> mEvents GUARDED_BY(mMutex);
};
