#pragma once

#include "host/api/file_system.h"
#include "host/api/result.h"
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace host {

class AttributeSnapshot;

/// Attributes of an open file: see docs/attributes.md for how they lie on disk. Works on a plain descriptor
/// (not one opened with O_PATH) of a file on `device`, which says where values too large for the file system
/// go. Nothing here tells the index of a change: Node does. Any thread; concurrent writers of one attribute
/// leave one of the written values.
struct AttributeFile {
    int descriptor = -1;
    DeviceId device = 0;
    /// Where given, reading asks it first and leaves in it what it finds. Must outlive the call.
    AttributeSnapshot* recent = nullptr;
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

/// Name of the directory at a volume's root that holds spilled values; never walked, never listed by a query.
inline constexpr std::string_view kBlobDirectoryName = ".be-attributes";

} // namespace host
