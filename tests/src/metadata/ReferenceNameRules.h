// The name rules a second time, for the tests alone: the same rules as src/metadata, stated over whole
// strings and sharing no code with them. A disagreement between the two is a bug in one of them.
#pragma once

#include <optional>
#include <string>

struct ReferenceTrackFields {
    std::string songname;
    std::string artist;
    std::string album;
    std::string trackNo;
    std::string disc;

    bool operator==(const ReferenceTrackFields&) const = default;
};

// What an empty record holds after the file's name was read. No folder name means that the folder could not
// be reached.
ReferenceTrackFields ReferenceFieldsOf(const std::string& fileName,
                                       const std::optional<std::string>& folderName);

// What an empty record holds after the folder's name alone was read: artist and album.
ReferenceTrackFields ReferenceFieldsOfFolder(const std::string& folderName);
