#include "samples/SampleMp3.h"

#include <algorithm>

namespace samples {
namespace {

/// Most significant bit first, as MPEG audio has it.
class BitWriter {
  public:
    void Put(std::uint32_t value, int bits) {
        for (int bit = bits - 1; bit >= 0; --bit) {
            if (mCount % 8 == 0)
                mBytes.push_back('\0');
            if ((value >> bit) & 1u) {
                auto last = static_cast<unsigned char>(mBytes.back());
                mBytes.back() = static_cast<char>(last | (0x80u >> (mCount % 8)));
            }
            ++mCount;
        }
    }
    std::string Take(std::size_t size) {
        mBytes.resize(size, '\0');
        return std::move(mBytes);
    }

  private:
    std::string mBytes;
    std::size_t mCount = 0;
};

constexpr std::size_t kFrameSize = 104; // 144 * 32000 / 44100, no padding
constexpr std::uint32_t kGain = 202;

} // namespace

std::string Frames(const Tone& tone) {
    const int line = std::clamp(tone.line, 0, 100);
    const int pairs = line / 2 + 1;
    // Huffman table 1: (0,0) is 1, (1,0) is 01, (0,1) is 001; a sign bit follows each value that is not 0.
    const bool second = line % 2 == 1;
    const int bits = (pairs - 1) + (second ? 3 : 2) + 1;

    BitWriter frame;
    frame.Put(0xFFFB, 16); // sync, MPEG-1, Layer III, no checksum
    frame.Put(0x10C0, 16); // 32 kbit/s, 44.1 kHz, no padding, one channel
    frame.Put(0, 9);       // main data begins here
    frame.Put(0, 5 + 4);
    for (int granule = 0; granule < 2; ++granule) {
        frame.Put(static_cast<std::uint32_t>(bits), 12);
        frame.Put(static_cast<std::uint32_t>(pairs), 9);
        frame.Put(kGain, 8);
        frame.Put(0, 4 + 1); // no scale factors, one long window
        frame.Put(1, 5);     // table 1 in all three regions
        frame.Put(1, 5);
        frame.Put(1, 5);
        frame.Put(15, 4);
        frame.Put(7, 3);
        frame.Put(0, 3);
    }
    for (int granule = 0; granule < 2; ++granule) {
        for (int pair = 1; pair < pairs; ++pair)
            frame.Put(1, 1);
        frame.Put(1, second ? 3 : 2);
        frame.Put(0, 1);
    }
    const std::string one = frame.Take(kFrameSize);

    std::string all;
    all.reserve(kFrameSize * static_cast<std::size_t>(std::max(tone.frames, 0)));
    for (int i = 0; i < tone.frames; ++i)
        all += one;
    return all;
}

std::string Id3v2Tag(const std::string& title, const std::string& artist) {
    const auto big_endian = [](std::size_t value) {
        std::string bytes;
        for (int shift = 24; shift >= 0; shift -= 8)
            bytes.push_back(static_cast<char>((value >> shift) & 0xFF));
        return bytes;
    };
    const auto text_frame = [&](const char* id, const std::string& text) {
        return id + big_endian(text.size() + 1) + std::string(3, '\0') + text;
    };
    const std::string frames = text_frame("TIT2", title) + text_frame("TPE1", artist);
    std::string size;
    for (int shift = 21; shift >= 0; shift -= 7)
        size.push_back(static_cast<char>((frames.size() >> shift) & 0x7F));
    return std::string("ID3\3\0\0", 6) + size + frames;
}

std::string Id3v1Tag(const std::string& title, const std::string& artist, const std::string& album) {
    const auto field = [](std::string text) {
        text.resize(30, '\0');
        return text;
    };
    std::string tag = "TAG" + field(title) + field(artist) + field(album);
    tag.resize(127, '\0');
    tag.push_back('\x11');
    return tag;
}

} // namespace samples
