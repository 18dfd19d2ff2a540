#pragma once

#include "host/api/file_system.h"
#include "host/api/result.h"
#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

namespace host {

/// Attributes of an open file: see docs/attributes.md for how they lie on disk. Works on a plain descriptor
/// (not one opened with O_PATH) of a file on `device`, which says where values too large for the file system
/// go. Nothing here tells the index of a change: Node does. Any thread; concurrent writers of one attribute
/// leave one of the written values.
struct AttributeFile {
    int descriptor = -1;
    DeviceId device = 0;
};

/// ENOENT: no such attribute, or its bytes are missing or damaged. ENAMETOOLONG: over 247 bytes. EINVAL:
/// empty name.
Result<AttributeInfo> attribute_info(const AttributeFile& file, const char* name);
Result<std::size_t> read_attribute(const AttributeFile& file, const char* name, std::int64_t offset,
                                   void* buffer, std::size_t size);
/// See Node::write_attribute. EFBIG: over kLargestAttribute.
Status write_attribute(const AttributeFile& file, const char* name, std::uint32_t type, std::int64_t offset,
                       const void* data, std::size_t size);
Status remove_attribute(const AttributeFile& file, const char* name);
Status rename_attribute(const AttributeFile& file, const char* from, const char* to);
Result<std::vector<std::string>> attribute_names(const AttributeFile& file);

inline constexpr std::size_t kLongestAttributeName = 247;
inline constexpr std::int64_t kLargestAttribute = 256 * 1024 * 1024;

/// One attribute as AttributeScanner hands it out; views are valid during the call only.
struct ScannedAttribute {
    std::string_view name;
    std::uint32_t type = 0; ///< 0 when the value is larger than the scanner takes and not spilled
    /// The whole value, or empty when it is larger than the scanner takes (`complete` is false then).
    std::span<const std::byte> bytes;
    bool complete = true;
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

  private:
    using Callback = void (*)(void* target, const ScannedAttribute& attribute);
    Status scan_erased(const AttributeFile& file, Callback callback, void* target);

    std::size_t largest_value_ = 0;
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

/// Name of the directory at a volume's root that holds spilled values; never walked, never listed by a query.
inline constexpr std::string_view kBlobDirectoryName = ".be-attributes";

} // namespace host
