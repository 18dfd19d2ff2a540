#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

/// Makes the bytes of small MP3 files: MPEG-1 Layer III, 44.1 kHz, mono, 32 kbit/s, one steady tone. Any
/// decoder plays them. Nothing is encoded: a frame holds a single spectral line, the same in every frame.
namespace samples {

struct Tone {
    /// Spectral line 0..100; the pitch is (line + 0.5) * 44100 / 1152 Hz, so 11 is 440 Hz.
    int line = 11;
    /// Frames of 26.12 ms each.
    int frames = 40;
};

/// The audio frames alone; 104 bytes a frame.
std::string Frames(const Tone& tone);

/// An ID3v2.3 tag with title and artist (Latin-1 text), to stand before the frames.
std::string Id3v2Tag(const std::string& title, const std::string& artist);

/// An ID3v1 tag, 128 bytes, to stand after the frames. Longer texts are cut at 30 bytes.
std::string Id3v1Tag(const std::string& title, const std::string& artist, const std::string& album);

} // namespace samples
