#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace host {

/// What travels on a local connection, docs/messages.md "Between processes".
enum class FrameKind : std::uint8_t { request = 1, answer = 2 };

inline constexpr std::size_t frame_header_size = 16;
inline constexpr std::size_t largest_frame_body = (std::size_t{64} << 20) + 4096;
inline constexpr std::size_t answer_body_size = 4;

struct FrameHeader {
    FrameKind kind = FrameKind::request;
    std::uint32_t sequence = 0;
    std::uint32_t body_size = 0;
};

/// Writes exactly frame_header_size bytes.
void write_frame_header(const FrameHeader& header, char* bytes);

/// Puts frames together from the pieces in which they arrive. Believes a header's size only as far as bytes
/// have come. One thread.
class FrameReader {
  public:
    enum class State {
        needs_more, ///< all bytes were taken
        complete,   ///< header() and body() hold a frame; the bytes behind it were left
        broken,     ///< these are no frames; the reader takes nothing more
    };

    /// Takes bytes off the front of `bytes`, up to the end of the frame at hand. After `complete` the next
    /// call begins another frame.
    State take(std::span<const char>& bytes);

    const FrameHeader& header() const { return header_; }
    std::span<const char> body() const { return body_; }
    /// True when the first byte of a frame has come but not its last.
    bool within_frame() const { return state_ == State::needs_more && have_ > 0; }

  private:
    bool read_header();

    State state_ = State::needs_more;
    char header_bytes_[frame_header_size] = {};
    std::size_t have_ = 0; ///< bytes of the header
    FrameHeader header_;
    std::vector<char> body_;
};

} // namespace host
