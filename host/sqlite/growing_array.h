#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <memory>
#include <new>
#include <type_traits>

namespace host {

/// A vector of plain values for large tables: grows by an eighth instead of doubling, through realloc, which
/// moves pages instead of copying them. New values are what resize() is told. One thread at a time.
template <typename Value>
class GrowingArray {
    static_assert(std::is_trivially_copyable_v<Value>);

  public:
    GrowingArray() = default;
    GrowingArray(GrowingArray&& other) noexcept { swap(other); }
    GrowingArray& operator=(GrowingArray&& other) noexcept {
        GrowingArray taken(std::move(other));
        swap(taken);
        return *this;
    }

    std::size_t size() const { return size_; }
    bool empty() const { return size_ == 0; }
    std::size_t memory_bytes() const { return capacity_ * sizeof(Value); }
    Value* data() { return values_.get(); }
    const Value* data() const { return values_.get(); }
    Value& operator[](std::size_t index) { return values_.get()[index]; }
    const Value& operator[](std::size_t index) const { return values_.get()[index]; }

    void reserve(std::size_t capacity) {
        if (capacity <= capacity_)
            return;
        auto* grown = static_cast<Value*>(std::realloc(values_.get(), capacity * sizeof(Value)));
        if (grown == nullptr)
            throw std::bad_alloc();
        (void)values_.release();
        values_.reset(grown);
        capacity_ = capacity;
    }
    void resize(std::size_t size, Value filler) {
        if (size > capacity_)
            reserve(std::max(size, capacity_ + capacity_ / 8 + 16));
        if (size > size_)
            std::fill(values_.get() + size_, values_.get() + size, filler);
        size_ = size;
    }
    void push_back(Value value) { resize(size_ + 1, value); }
    void append(const Value* values, std::size_t count) {
        if (size_ + count > capacity_)
            reserve(std::max(size_ + count, capacity_ + capacity_ / 8 + 64));
        std::copy_n(values, count, values_.get() + size_);
        size_ += count;
    }
    void shrink_to_fit() {
        if (size_ == 0 || size_ == capacity_)
            return;
        if (auto* shrunk = static_cast<Value*>(std::realloc(values_.get(), size_ * sizeof(Value)))) {
            (void)values_.release();
            values_.reset(shrunk);
            capacity_ = size_;
        }
    }

  private:
    struct Free {
        void operator()(Value* values) const { std::free(values); }
    };
    void swap(GrowingArray& other) {
        std::swap(values_, other.values_);
        std::swap(size_, other.size_);
        std::swap(capacity_, other.capacity_);
    }

    std::unique_ptr<Value, Free> values_;
    std::size_t size_ = 0;
    std::size_t capacity_ = 0;
};

} // namespace host
