// Any bytes as what comes in on a local connection, in pieces of any size: the frames that come out are the
// same however the bytes were cut, and what is written again from them is what was read.
#include "host/linux/frame.h"

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

namespace {

void Require(bool condition) {
    if (!condition)
        __builtin_trap();
}

struct Seen {
    std::string frames;
    bool broken = false;
    bool within = false;
};

Seen Read(std::span<const char> bytes, std::size_t piece) {
    Seen seen;
    host::FrameReader reader;
    while (!bytes.empty()) {
        std::span<const char> part = bytes.first(std::min(piece, bytes.size()));
        bytes = bytes.subspan(part.size());
        while (!part.empty()) {
            const auto state = reader.take(part);
            if (state == host::FrameReader::State::broken) {
                seen.broken = true;
                return seen;
            }
            if (state == host::FrameReader::State::needs_more) {
                Require(part.empty());
                break;
            }
            Require(reader.body().size() == reader.header().body_size);
            Require(reader.header().kind == host::FrameKind::request ||
                    reader.body().size() == host::answer_body_size);
            char header[host::frame_header_size];
            host::write_frame_header(reader.header(), header);
            seen.frames.append(header, sizeof(header));
            seen.frames.append(reader.body().data(), reader.body().size());
        }
    }
    seen.within = reader.within_frame();
    return seen;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    // The first byte says how the rest is cut.
    const std::span<const char> bytes(reinterpret_cast<const char*>(data) + 1, size - 1);
    const Seen whole = Read(bytes, bytes.size() + 1);
    const Seen pieces = Read(bytes, std::size_t{data[0]} % 64 + 1);
    Require(whole.frames == pieces.frames && whole.broken == pieces.broken && whole.within == pieces.within);
    Require(whole.frames.size() <= bytes.size());
    Require(whole.frames.empty() || std::memcmp(whole.frames.data(), bytes.data(), whole.frames.size()) == 0);
    Require(whole.broken || whole.within || whole.frames.size() == bytes.size());
    return 0;
}
