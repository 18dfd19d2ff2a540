#pragma once

#include <cerrno>
#include <optional>
#include <utility>

namespace host {

/// Outcome of a call into the host: 0, or an errno value (<cerrno>) that says what went wrong.
/// ENOENT always means "not there"; ENOTSUP "this file system cannot do that".
class [[nodiscard]] Status {
  public:
    constexpr Status() = default;
    constexpr Status(int error) : error_(error) {}

    constexpr bool ok() const { return error_ == 0; }
    constexpr explicit operator bool() const { return ok(); }
    constexpr int error() const { return error_; }

  private:
    int error_ = 0;
};

/// A value, or the errno value that says why there is none. Reading the value of a failed result is a
/// programming error.
template <typename Value>
class [[nodiscard]] Result {
  public:
    Result(Value value) : value_(std::move(value)) {}
    Result(Status failure) : error_(failure.ok() ? EINVAL : failure.error()) {}

    bool ok() const { return value_.has_value(); }
    explicit operator bool() const { return ok(); }
    int error() const { return error_; }
    Status status() const { return Status(error_); }

    Value& operator*() & { return *value_; }
    const Value& operator*() const& { return *value_; }
    Value&& operator*() && { return *std::move(value_); }
    Value* operator->() { return &*value_; }
    const Value* operator->() const { return &*value_; }

  private:
    std::optional<Value> value_;
    int error_ = 0;
};

} // namespace host
