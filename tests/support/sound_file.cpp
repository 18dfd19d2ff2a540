#include "support/sound_file.h"

#include "support/temporary_environment.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <numbers>

namespace test {

namespace {

constexpr int kRate = 44100;

std::string little_endian(std::uint32_t value, int bytes) {
    std::string text;
    for (int at = 0; at < bytes; ++at)
        text += static_cast<char>(value >> (8 * at) & 0xff);
    return text;
}

std::uint32_t number_at(const std::string& bytes, std::size_t at, int count) {
    std::uint32_t value = 0;
    for (int byte = 0; byte < count; ++byte)
        value |= std::uint32_t{static_cast<unsigned char>(bytes[at + static_cast<std::size_t>(byte)])}
                 << (8 * byte);
    return value;
}

} // namespace

double Sound::seconds() const {
    return rate == 0 ? 0 : static_cast<double>(samples.size()) / rate;
}

double Sound::peak() const {
    int largest = 0;
    for (const int sample : samples)
        largest = std::max(largest, std::abs(sample));
    return largest / 32768.0;
}

double Sound::frequency() const {
    int crossings = 0;
    for (std::size_t at = 1; at < samples.size(); ++at)
        crossings += samples[at - 1] < 0 && samples[at] >= 0;
    return samples.empty() ? 0 : crossings / seconds();
}

void write_tone(const std::string& path, double seconds, double frequency, double peak) {
    const auto count = static_cast<std::uint32_t>(std::lround(seconds * kRate));
    std::string samples;
    samples.reserve(count * std::size_t{2});
    for (std::uint32_t at = 0; at < count; ++at) {
        const double angle = 2 * std::numbers::pi * frequency * at / kRate;
        const long sample = std::lround(peak * 32767 * std::sin(angle));
        samples += little_endian(static_cast<std::uint32_t>(sample), 2);
    }
    write_file(path, "RIFF" + little_endian(36 + count * 2, 4) + "WAVEfmt " + little_endian(16, 4) +
                         little_endian(1, 2) + little_endian(1, 2) + little_endian(kRate, 4) +
                         little_endian(kRate * 2, 4) + little_endian(2, 2) + little_endian(16, 2) + "data" +
                         little_endian(count * 2, 4) + samples);
}

Sound read_sound(const std::string& path) {
    const std::string bytes = read_file(path);
    Sound sound;
    if (bytes.size() < 12 || bytes.compare(0, 4, "RIFF") != 0)
        return sound;
    for (std::size_t at = 12; at + 8 <= bytes.size();) {
        const std::size_t size = number_at(bytes, at + 4, 4);
        const std::size_t content = at + 8;
        if (bytes.compare(at, 4, "fmt ") == 0 && content + 16 <= bytes.size()) {
            if (number_at(bytes, content + 2, 2) != 1 || number_at(bytes, content + 14, 2) != 16)
                return sound;
            sound.rate = static_cast<int>(number_at(bytes, content + 4, 4));
        } else if (bytes.compare(at, 4, "data") == 0) {
            for (std::size_t sample = content; sample + 2 <= std::min(bytes.size(), content + size);
                 sample += 2)
                sound.samples.push_back(static_cast<std::int16_t>(number_at(bytes, sample, 2)));
        }
        at = content + size + size % 2;
    }
    return sound;
}

} // namespace test
