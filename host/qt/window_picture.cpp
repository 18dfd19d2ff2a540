#include "window_picture.h"

#include <algorithm>
#include <chrono>
#include <cstring>

namespace host {

namespace {

// Beyond this, one rectangle around all of them costs less than keeping them apart.
constexpr std::size_t max_rectangles = 32;
constexpr std::uint32_t uncovered_color = 0xffd8d8d8U;

DeviceRect cut(const DeviceRect& rect, Size size) {
    return {std::max(rect.left, 0), std::max(rect.top, 0), std::min(rect.right, size.width),
            std::min(rect.bottom, size.height)};
}

bool is_empty_rect(const DeviceRect& rect) {
    return rect.left >= rect.right || rect.top >= rect.bottom;
}

bool covers(const DeviceRect& outer, const DeviceRect& inner) {
    return outer.left <= inner.left && outer.top <= inner.top && outer.right >= inner.right &&
           outer.bottom >= inner.bottom;
}

void include(std::vector<DeviceRect>& rects, const DeviceRect& rect) {
    if (std::any_of(rects.begin(), rects.end(), [&](const DeviceRect& r) { return covers(r, rect); })) {
        return;
    }
    rects.push_back(rect);
    if (rects.size() <= max_rectangles) {
        return;
    }
    DeviceRect all = rects.front();
    for (const DeviceRect& r : rects) {
        all = {std::min(all.left, r.left), std::min(all.top, r.top), std::max(all.right, r.right),
               std::max(all.bottom, r.bottom)};
    }
    rects.assign(1, all);
}

void copy_rect(const std::uint32_t* from, std::size_t from_stride, std::uint32_t* to, std::size_t to_stride,
               const DeviceRect& rect) {
    const auto count = static_cast<std::size_t>(rect.right - rect.left);
    for (int y = rect.top; y < rect.bottom; ++y) {
        std::memcpy(to + static_cast<std::size_t>(y) * to_stride + rect.left,
                    from + static_cast<std::size_t>(y) * from_stride + rect.left,
                    count * sizeof(std::uint32_t));
    }
}

void fill_rect(std::uint32_t* to, std::size_t stride, const DeviceRect& rect) {
    for (int y = rect.top; y < rect.bottom; ++y) {
        std::fill_n(to + static_cast<std::size_t>(y) * stride + rect.left,
                    std::max(rect.right - rect.left, 0), uncovered_color);
    }
}

} // namespace

bool WindowPicture::put(const std::uint32_t* pixels, std::size_t stride, Size size,
                        const std::vector<DeviceRect>& changed) {
    const MutexLock lock(mutex_);
    const bool was_clean = changed_.empty();
    const auto width = static_cast<std::size_t>(size.width);
    if (size != size_) {
        size_ = size;
        pixels_.resize(width * static_cast<std::size_t>(size.height));
        changed_.assign(1, {0, 0, size.width, size.height});
        copy_rect(pixels, stride, pixels_.data(), width, changed_.front());
        return was_clean;
    }
    for (const DeviceRect& wanted : changed) {
        const DeviceRect rect = cut(wanted, size);
        if (!is_empty_rect(rect)) {
            copy_rect(pixels, stride, pixels_.data(), width, rect);
            include(changed_, rect);
        }
    }
    return was_clean && !changed_.empty();
}

void WindowPicture::wait_until_taken() {
    MutexLock lock(mutex_);
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(100);
    while (!changed_.empty() && !closed_) {
        if (taken_.wait_until(lock, deadline) == std::cv_status::timeout) {
            return;
        }
    }
}

std::vector<DeviceRect> WindowPicture::take(Extent extent, std::uint32_t* target, std::size_t target_stride,
                                            Size target_size) {
    const MutexLock lock(mutex_);
    std::vector<DeviceRect> written;
    const auto width = static_cast<std::size_t>(size_.width);
    if (extent == Extent::all) {
        changed_.assign(1, {0, 0, size_.width, size_.height});
        written.push_back({0, 0, target_size.width, target_size.height});
        fill_rect(target, target_stride,
                  cut({size_.width, 0, target_size.width, target_size.height}, target_size));
        fill_rect(target, target_stride,
                  cut({0, size_.height, size_.width, target_size.height}, target_size));
    }
    for (const DeviceRect& wanted : changed_) {
        const DeviceRect rect = cut(cut(wanted, size_), target_size);
        if (!is_empty_rect(rect)) {
            copy_rect(pixels_.data(), width, target, target_stride, rect);
            if (extent == Extent::changed) {
                written.push_back(rect);
            }
        }
    }
    changed_.clear();
    taken_.notify_all();
    return written;
}

bool WindowPicture::has_changes() {
    const MutexLock lock(mutex_);
    return !changed_.empty();
}

bool WindowPicture::is_empty() {
    const MutexLock lock(mutex_);
    return size_.width == 0 || size_.height == 0;
}

void WindowPicture::close() {
    const MutexLock lock(mutex_);
    closed_ = true;
    taken_.notify_all();
}

} // namespace host
