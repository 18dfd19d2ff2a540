#pragma once

#include <string>
#include <vector>

namespace test {

/// A sound of one channel, 16 bits a sample.
struct Sound {
    int rate = 0; ///< samples a second; 0 when there is none
    std::vector<int> samples;

    double seconds() const;
    /// The largest sample, as a part of the largest one possible.
    double peak() const;
    /// Of a tone: how often a second it goes from below zero to above.
    double frequency() const;
};

/// A WAV file with a tone of that length, frequency and peak (1 is the largest).
void write_tone(const std::string& path, double seconds, double frequency, double peak = 0.5);
/// A WAV file of one channel and 16 bits a sample.
Sound read_sound(const std::string& path);

} // namespace test
