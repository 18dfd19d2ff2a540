#pragma once

#include "host/linux/attribute_store.h"
#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string_view>
#include <type_traits>
#include <vector>

namespace host {

struct AttributeMarker;

/// One attribute as AttributeScanner hands it out; views are valid during the call only.
struct ScannedAttribute {
    std::string_view name;
    std::uint32_t type = 0; ///< 0 when the value is larger than the scanner takes and not spilled
    /// The whole value, or empty when it is larger than the scanner takes (`complete` is false then).
    std::span<const std::byte> bytes;
    bool complete = true;
    bool spilled = false; ///< the value lies in a blob
};

/// Reads all attributes of one file after another, for the indexer: one flistxattr and one fgetxattr per
/// attribute, no allocation once its buffers have grown. One thread at a time.
class AttributeScanner {
  public:
    /// Values over `largest_value` bytes are handed out without their bytes.
    explicit AttributeScanner(std::size_t largest_value);

    /// Calls `visit(const ScannedAttribute&)` for each attribute, in the file system's order. Attributes that
    /// vanish meanwhile, malformed and damaged ones are passed over. ENOTSUP, EBADF (O_PATH) ... when the
    /// file cannot have any.
    template <typename Visitor>
    Status scan(const AttributeFile& file, Visitor&& visit) {
        using Target = std::remove_reference_t<Visitor>;
        return scan_erased(
            file,
            [](void* target, const ScannedAttribute& attribute) {
                (*static_cast<Target*>(target))(attribute);
            },
            &visit);
    }

    /// The last scan passed over an attribute that the file lists.
    bool passed_over() const { return passed_over_; }

  private:
    using Callback = void (*)(void* target, const ScannedAttribute& attribute);
    Status scan_erased(const AttributeFile& file, Callback callback, void* target);
    bool read_spilled(const AttributeFile& file, const AttributeMarker& marker, ScannedAttribute& attribute);

    std::size_t largest_value_ = 0;
    bool passed_over_ = false;
    std::vector<char> names_;
    std::vector<std::byte> value_;
    std::vector<std::byte> spilled_;
};

/// Reads all attributes with a scanner of the calling thread's own.
template <typename Visitor>
Status read_all_attributes(const AttributeFile& file, std::size_t largest_value, Visitor&& visit) {
    AttributeScanner scanner(largest_value);
    return scanner.scan(file, std::forward<Visitor>(visit));
}

} // namespace host
