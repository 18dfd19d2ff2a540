#include "samples/SampleLibrary.h"

#include "samples/SampleMp3.h"
#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <system_error>

namespace samples {
namespace {

namespace fs = std::filesystem;
using Tags = Sample::Tags;

std::string WriteFile(const fs::path& path, const std::string& bytes) {
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    file.close();
    return file ? std::string() : "cannot write " + path.string();
}

/// A picture that is easy to recognise when small: quarters of colour with a light disc.
std::string CoverPicture() {
    constexpr int kSide = 96;
    std::string bytes = "P6\n96 96\n255\n";
    for (int y = 0; y < kSide; ++y) {
        for (int x = 0; x < kSide; ++x) {
            const int dx = x - kSide / 2;
            const int dy = y - kSide / 2;
            const bool disc = dx * dx + dy * dy < 30 * 30;
            const std::array<int, 3> colour =
                disc ? std::array<int, 3>{250, 240, 200}
                     : std::array<int, 3>{x < kSide / 2 ? 34 : 180, y < kSide / 2 ? 34 : 120, 119};
            for (const int part : colour)
                bytes.push_back(static_cast<char>(part));
        }
    }
    return bytes;
}

} // namespace

const std::vector<Sample>& SmallLibrary() {
    static const std::vector<Sample> library = {
        {"The Lanterns - Harbour Lights", "01 - First Ferry.mp3", Tags::before},
        {"The Lanterns - Harbour Lights", "02 - Tide Table.mp3", Tags::none},
        {"The Lanterns - Harbour Lights", "03-Breakwater.mp3", Tags::none},
        {"The Lanterns - Harbour Lights", "00 - Hidden Track.mp3", Tags::none},
        {"The Lanterns - Night Trains", "CD1 - 01 - Departure.mp3", Tags::none},
        {"The Lanterns - Night Trains", "CD2 - 03 - Sleeper.mp3", Tags::after},
        {"Greatest Hits", "a-one - Take the Stairs.mp3", Tags::none},
        {"Greatest Hits", "Oak & Ash - Winter Road.mp3", Tags::none},
        {"Greatest Hits", "[Oak & Ash] Summer Road.mp3", Tags::none},
        {"LOUD_PEOPLE_-_VERY_LOUD", "07 - STILL LOUD.MP3", Tags::none},
        {"LOUD_PEOPLE_-_VERY_LOUD", "LOUD_PEOPLE_-_EVEN_LOUDER.MP3", Tags::none},
        {"Loose songs", "Whistle.mp3", Tags::none},
        {"Loose songs", "_hidden blank.mp3", Tags::none},
        {"Loose songs", "Long extension.mpeg.mp3", Tags::none},
        {"Loose songs", "Bj\xF6rn - Sj\xF6n.mp3", Tags::none},
        {"Loose songs", "Zo\xC3\xAB - D\xC3\xA9j\xC3\xA0 vu.mp3", Tags::none},
        {"Loose songs", "\xF0\x9F\x8E\xB8 Trio - Encore \xF0\x9F\x8E\xB6.mp3", Tags::none},
        {"Loose songs", "Mixed ending.Mp3", Tags::none},
        {"Loose songs", "Not by this name.mpeg", Tags::none},
    };
    return library;
}

std::string WriteSmallLibrary(const std::string& root) {
    std::error_code error;
    int line = 8;
    for (const Sample& sample : SmallLibrary()) {
        const fs::path folder = fs::path(root) / sample.folder;
        fs::create_directories(folder, error);
        if (error)
            return "cannot make " + folder.string() + ": " + error.message();
        std::string bytes = Frames({line++, 80});
        if (sample.tags == Tags::before)
            bytes = Id3v2Tag("A title in the file", "An artist in the file") + bytes;
        if (sample.tags == Tags::after)
            bytes += Id3v1Tag("A title at the end", "An artist at the end", "An album at the end");
        if (std::string problem = WriteFile(folder / sample.name, bytes); !problem.empty())
            return problem;
    }
    return WriteFile(fs::path(root) / SmallLibrary().front().folder / "cover.ppm", CoverPicture());
}

Sample LargeLibrarySong(std::size_t number) {
    static constexpr std::array<const char*, 12> kNouns = {"Harbour", "Lantern", "Meadow",  "Signal",
                                                           "Winter",  "Mirror",  "Copper",  "Thunder",
                                                           "Paper",   "Velvet",  "Station", "Orchard"};
    static constexpr std::array<const char*, 10> kVerbs = {
        "Sleeps", "Rising", "Falls", "Again", "Forever", "Calls", "Between", "Without", "Return", "Burning"};
    const std::size_t album = number / 12;
    const std::size_t artist = album / 10;
    std::array<char, 160> text{};
    std::snprintf(text.data(), text.size(), "%s Band %03zu/%s Band %03zu - %s Years %zu", kNouns[artist % 12],
                  artist, kNouns[artist % 12], artist, kVerbs[album % 10], album);
    Sample song{text.data(), {}, Tags::none};
    std::snprintf(text.data(), text.size(), "%02zu - %s %s %zu.mp3", number % 12 + 1, kNouns[number * 7 % 12],
                  kVerbs[number * 3 % 10], number);
    song.name = text.data();
    return song;
}

std::string WriteLargeLibrary(const std::string& root, std::size_t count, const SongContent& content) {
    const std::string frames = Frames({11, content.frames});
    std::error_code error;
    std::string made;
    for (std::size_t number = 0; number < count; ++number) {
        const Sample song = LargeLibrarySong(number);
        const fs::path folder = fs::path(root) / song.folder;
        if (song.folder != made) {
            fs::create_directories(folder, error);
            if (error)
                return "cannot make " + folder.string() + ": " + error.message();
            made = song.folder;
        }
        std::string bytes = frames;
        if (content.tags == Tags::before) {
            const std::string title = song.name.substr(5, song.name.size() - 9);
            bytes.insert(0, Id3v2Tag(title, song.folder.substr(0, song.folder.find('/'))));
        }
        if (std::string problem = WriteFile(folder / song.name, bytes); !problem.empty())
            return problem;
    }
    return {};
}

} // namespace samples
