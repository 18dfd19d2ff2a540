#pragma once

#include <utility>

namespace host {

/// Owns one open file descriptor; -1 means none. Movable, closed when destroyed; errno is left alone.
class Descriptor {
  public:
    Descriptor() = default;
    explicit Descriptor(int descriptor) : descriptor_(descriptor) {}
    ~Descriptor() { reset(); }
    Descriptor(Descriptor&& other) noexcept : descriptor_(std::exchange(other.descriptor_, -1)) {}
    Descriptor& operator=(Descriptor&& other) noexcept {
        if (this != &other) {
            reset();
            descriptor_ = std::exchange(other.descriptor_, -1);
        }
        return *this;
    }

    bool valid() const { return descriptor_ >= 0; }
    int get() const { return descriptor_; }
    /// Gives up ownership.
    [[nodiscard]] int release() { return std::exchange(descriptor_, -1); }
    void reset();

  private:
    int descriptor_ = -1;
};

} // namespace host
