// A window's pixels on their way from the thread that draws to the one that shows.
#pragma once

#include "host/api/display.h"
#include "host/api/thread_safety.h"

#include <condition_variable>
#include <cstdint>
#include <vector>

namespace host {

// The surface lock of a window: held for the copying of changed rectangles alone.
class WindowPicture {
  public:
    // Any thread. True when the picture had nothing to show before, so that the main thread must be told.
    bool put(const std::uint32_t* pixels, std::size_t stride, Size size,
             const std::vector<DeviceRect>& changed) EXCLUDES(mutex_);
    // Waits until everything put so far was taken, or the time is over.
    void wait_until_taken() EXCLUDES(mutex_);

    // For the main thread. Copies what has changed since the last call, or all of it, to `target`, a picture
    // of its own size and rows of `target_stride` pixels; what of the target is not covered becomes grey.
    // Returns the rectangles written.
    enum class Extent : std::uint8_t { changed, all };
    std::vector<DeviceRect> take(Extent extent, std::uint32_t* target, std::size_t target_stride,
                                 Size target_size) EXCLUDES(mutex_);
    bool has_changes() EXCLUDES(mutex_);
    bool is_empty() EXCLUDES(mutex_);
    // Nothing will be taken any more: nobody shall wait.
    void close() EXCLUDES(mutex_);

  private:
    Mutex mutex_;
    std::condition_variable_any taken_;
    std::vector<std::uint32_t> pixels_ GUARDED_BY(mutex_);
    Size size_ GUARDED_BY(mutex_);
    std::vector<DeviceRect> changed_ GUARDED_BY(mutex_);
    bool closed_ GUARDED_BY(mutex_) = false;
};

} // namespace host
