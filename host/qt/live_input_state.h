// The pointer and the modifier keys as the program's windows have last heard of them.
#pragma once

#include "host/api/display.h"
#include "host/api/thread_safety.h"

namespace host {

// Written by the main thread, read by any.
class LiveInputState {
  public:
    static LiveInputState& instance();

    LiveInput get() EXCLUDES(mutex_);
    void pointer_at(PointerPosition on_screen, std::uint32_t buttons) EXCLUDES(mutex_);
    void buttons_are(std::uint32_t buttons) EXCLUDES(mutex_);
    void modifiers_are(std::uint32_t modifiers) EXCLUDES(mutex_);

  private:
    Mutex mutex_;
    LiveInput now_ GUARDED_BY(mutex_);
};

} // namespace host
