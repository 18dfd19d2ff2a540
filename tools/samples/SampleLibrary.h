#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace samples {

/// One file of a sample library: where it lies below the library's folder, and the tags that its bytes carry.
struct Sample {
    enum class Tags { none, before, after };

    std::string folder;
    std::string name;
    Tags tags = Tags::none;
};

/// A small collection whose names show every style that people use: dashes with and without blanks, track
/// numbers, discs, capitals, underscores, brackets, Latin-1 bytes, emoji, long extensions, and files that are
/// no MP3 by their name.
const std::vector<Sample>& SmallLibrary();

/// Writes the small library, with a cover picture "cover.ppm" (96 x 96) beside the songs of its first folder.
/// Answers an empty text, or what went wrong.
std::string WriteSmallLibrary(const std::string& root);

/// What a song of the large library holds besides its name.
struct SongContent {
    int frames = 1; ///< of 26 ms, 104 bytes each
    Sample::Tags tags = Sample::Tags::none;
};

/// Writes `count` songs without attributes, twelve to an album folder, ten albums to an artist folder. The
/// same names for the same count; tags inside the files hold what the names say. Answers an empty text, or
/// what went wrong.
std::string WriteLargeLibrary(const std::string& root, std::size_t count, const SongContent& content = {});

/// Folder and leaf name of song `number` of the large library.
Sample LargeLibrarySong(std::size_t number);

} // namespace samples
