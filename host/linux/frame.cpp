#include "frame.h"

#include <algorithm>
#include <bit>
#include <cstring>

// Numbers go into frames as they lie in memory.
static_assert(std::endian::native == std::endian::little, "frames are little-endian");

namespace host {

namespace {

constexpr char magic[4] = {'B', 'K', 'F', 1};
constexpr std::size_t kind_at = 4;
constexpr std::size_t zeros_at = 5;
constexpr std::size_t zeros = 3;
constexpr std::size_t sequence_at = 8;
constexpr std::size_t body_size_at = 12;
// A large body that has been handled does not keep its memory.
constexpr std::size_t kept_capacity = std::size_t{1} << 20;

} // namespace

void write_frame_header(const FrameHeader& header, char* bytes) {
    std::memset(bytes, 0, frame_header_size);
    std::memcpy(bytes, magic, sizeof(magic));
    bytes[kind_at] = static_cast<char>(header.kind);
    std::memcpy(bytes + sequence_at, &header.sequence, sizeof(header.sequence));
    std::memcpy(bytes + body_size_at, &header.body_size, sizeof(header.body_size));
}

bool FrameReader::read_header() {
    constexpr char no_zeros[zeros] = {};
    if (std::memcmp(header_bytes_, magic, sizeof(magic)) != 0 ||
        std::memcmp(header_bytes_ + zeros_at, no_zeros, zeros) != 0)
        return false;
    std::memcpy(&header_.sequence, header_bytes_ + sequence_at, sizeof(header_.sequence));
    std::memcpy(&header_.body_size, header_bytes_ + body_size_at, sizeof(header_.body_size));
    switch (header_bytes_[kind_at]) {
    case static_cast<char>(FrameKind::request):
        header_.kind = FrameKind::request;
        return header_.body_size <= largest_frame_body;
    case static_cast<char>(FrameKind::answer):
        header_.kind = FrameKind::answer;
        return header_.body_size == answer_body_size;
    default:
        return false;
    }
}

FrameReader::State FrameReader::take(std::span<const char>& bytes) {
    if (state_ == State::broken)
        return state_;
    if (state_ == State::complete) {
        state_ = State::needs_more;
        have_ = 0;
        body_.clear();
        if (body_.capacity() > kept_capacity)
            body_.shrink_to_fit();
    }
    if (have_ < frame_header_size) {
        const std::size_t count = std::min(frame_header_size - have_, bytes.size());
        if (count > 0)
            std::memcpy(header_bytes_ + have_, bytes.data(), count);
        have_ += count;
        bytes = bytes.subspan(count);
        if (have_ < frame_header_size)
            return state_;
        if (!read_header()) {
            state_ = State::broken;
            return state_;
        }
    }
    const std::size_t count = std::min(std::size_t{header_.body_size} - body_.size(), bytes.size());
    body_.insert(body_.end(), bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(count));
    bytes = bytes.subspan(count);
    if (body_.size() == header_.body_size)
        state_ = State::complete;
    return state_;
}

} // namespace host
