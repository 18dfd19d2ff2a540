#include "host/sqlite/attribute_record.h"

namespace host {

void append_recorded_attribute(std::vector<std::byte>& record, const RecordedAttribute& attribute) {
    std::uint64_t key = std::uint64_t{attribute.id} * 2 + (attribute.cut ? 1 : 0);
    for (; key >= 0x80; key >>= 7)
        record.push_back(static_cast<std::byte>(0x80 | (key & 0x7f)));
    record.push_back(static_cast<std::byte>(key));
    record.push_back(static_cast<std::byte>(attribute.bytes.size()));
    record.insert(record.end(), attribute.bytes.begin(), attribute.bytes.end());
}

bool RecordReader::next(RecordedAttribute& attribute) {
    std::uint64_t key = 0;
    std::size_t used = 0;
    for (int shift = 0;; shift += 7) {
        if (used == rest_.size() || shift > 35)
            return false;
        const auto byte = static_cast<std::uint64_t>(rest_[used++]);
        key |= (byte & 0x7f) << shift;
        if ((byte & 0x80) == 0)
            break;
    }
    if (used == rest_.size())
        return false;
    const auto length = static_cast<std::size_t>(rest_[used++]);
    if (rest_.size() - used < length)
        return false;
    attribute.id = static_cast<std::uint32_t>(key >> 1);
    attribute.cut = (key & 1) != 0;
    attribute.bytes = rest_.subspan(used, length);
    rest_ = rest_.subspan(used + length);
    return true;
}

} // namespace host
