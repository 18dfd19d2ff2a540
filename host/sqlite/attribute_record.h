#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

namespace host {

/// One attribute as a row holds it (docs/index.md). Borrows its bytes.
struct RecordedAttribute {
    std::uint32_t id = 0; ///< number in the attribute table
    bool cut = false;     ///< the bytes are not the whole value: read it from the file
    std::span<const std::byte> bytes;
};

inline constexpr std::size_t kLongestRecordedValue = 255;

/// Appends one entry. `bytes` is at most kLongestRecordedValue long.
void append_recorded_attribute(std::vector<std::byte>& record, const RecordedAttribute& attribute);

/// Takes entries off the front of a record, one after another. Malformed ends are passed over: a row is
/// disposable, a crash is not.
class RecordReader {
  public:
    explicit RecordReader(std::span<const std::byte> record) : rest_(record) {}
    /// False at the end.
    bool next(RecordedAttribute& attribute);

  private:
    std::span<const std::byte> rest_;
};

} // namespace host
