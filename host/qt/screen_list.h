// The screens, as any thread may ask for them.
#pragma once

#include "host/api/display.h"
#include "host/api/thread_safety.h"

namespace host {

// Kept current by the main thread.
class ScreenList {
  public:
    static ScreenList& instance();

    // On the main thread, once: from now on changes are followed.
    void follow();
    std::vector<ScreenFacts> all() EXCLUDES(mutex_);

  private:
    void refresh() EXCLUDES(mutex_);
    void changed();

    Mutex mutex_;
    std::vector<ScreenFacts> screens_ GUARDED_BY(mutex_);
};

} // namespace host
