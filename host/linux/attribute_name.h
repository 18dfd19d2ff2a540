#pragma once

#include "host/linux/attribute_store.h"
#include <cerrno>
#include <cstring>
#include <string_view>

namespace host {

/// What stands before an attribute's name in its extended attribute's name.
inline constexpr std::string_view kAttributePrefix = "user.be.";

/// The extended attribute's name for an attribute, built without allocating.
class AttributeName {
  public:
    explicit AttributeName(const char* name) {
        const std::size_t length = ::strnlen(name, kLongestAttributeName + 1);
        if (length == 0 || length > kLongestAttributeName) {
            error_ = length == 0 ? EINVAL : ENAMETOOLONG;
            return;
        }
        std::memcpy(text_, kAttributePrefix.data(), kAttributePrefix.size());
        std::memcpy(text_ + kAttributePrefix.size(), name, length);
        text_[kAttributePrefix.size() + length] = '\0';
    }

    /// 0, EINVAL for an empty name, ENAMETOOLONG.
    int error() const { return error_; }
    const char* text() const { return text_; }

  private:
    int error_ = 0;
    char text_[kAttributePrefix.size() + kLongestAttributeName + 1];
};

/// Calls `visit(const char* extended_name, std::string_view attribute_name)` for each of our attributes in a
/// list as flistxattr gives it; others' are passed over.
template <typename Visitor>
void for_each_attribute(const char* list, std::size_t size, Visitor&& visit) {
    for (const char* at = list; at < list + size;) {
        const std::string_view name(at, ::strnlen(at, static_cast<std::size_t>(list + size - at)));
        if (name.size() > kAttributePrefix.size() && name.starts_with(kAttributePrefix))
            visit(at, name.substr(kAttributePrefix.size()));
        at += name.size() + 1;
    }
}

} // namespace host
