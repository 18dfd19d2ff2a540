// The names of the attributes that hold a track's metadata on its file. docs/attributes.md describes how they
// lie on disk.
//
// Texts are B_STRING_TYPE with their terminator. The 64x64 cover is B_RAW_TYPE: a flattened message that
// holds the archive of a bitmap.
#pragma once

#include <cstddef>

inline constexpr char kAttributeSongname[] = "Audio:Songname";
inline constexpr char kAttributeArtist[] = "Audio:Artist";
inline constexpr char kAttributeAlbum[] = "Audio:Album";
inline constexpr char kAttributeTrackNo[] = "Audio:TrackNo";
inline constexpr char kAttributeDisc[] = "Audio:Disc";
inline constexpr char kAttributeVersion[] = "Audio:Version";
// Play time as text, whole minutes.
inline constexpr char kAttributeLength[] = "Audio:Length";
inline constexpr char kAttributeLengthUsec[] = "Audio:LengthUsec";
inline constexpr char kAttributeSamplerate[] = "Audio:Samplerate";
inline constexpr char kAttributeBitrate[] = "Audio:Bitrate";
inline constexpr char kAttributeChannels[] = "Audio:Channels";
inline constexpr char kAttributeFramerate[] = "Video:Framerate";
inline constexpr char kAttributeEncoder[] = "Media:Encoder";
inline constexpr char kAttribute64x64Cover[] = "Media:64x64CoverImage";
inline constexpr char kAttributeCoverImage[] = "Media:CoverImage";
inline constexpr char kAttributeCoverColor[] = "Media:CoverColor";

// Bytes of a text attribute that are read; a longer or unterminated text ends at the last of them.
inline constexpr size_t kTextFieldSize = 255;
// Bytes of the cover attribute that are read. A larger one is cut, and then yields an invalid cover.
inline constexpr size_t kLargestCoverValue = 10000;
