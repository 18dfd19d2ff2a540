// The texts of "Audio:Length" and of bit rates. Pure text, any thread.
#pragma once

#include <SupportDefs.h>

#include <cstddef>

// Bytes of an "Audio:Length" attribute that are read.
inline constexpr size_t kPlayTimeValueSize = 20;
// What a value is read into: zero-filled before, since the seconds are looked for beyond the end of the text.
inline constexpr size_t kPlayTimeBufferSize = 32;
// Holds any text that FormatPlayTime makes, with its terminator.
inline constexpr size_t kPlayTimeTextSize = 40;
inline constexpr size_t kBitrateTextSize = 16;

// Writes the stored form of a play time: whole minutes ("12:00") up to 3599 seconds, beyond that hours, a
// zero and the minutes within the hour ("  1: 0:02"). The layout is a file format and stays as it is, blanks
// and zeros included. A negative time counts as the very large unsigned one with the same bits.
void FormatPlayTime(int64 lengthUsec, char (&text)[kPlayTimeTextSize]);

// The microseconds that a stored text stands for. Text that FormatPlayTime made gives whole minutes. The
// arithmetic is that of 32 bits: times from 2148 seconds on wrap around, as intended.
int64 ParsePlayTime(const char (&buffer)[kPlayTimeBufferSize]);

// "128 kbit" for 1000 to 999999 bits per second, an empty text for anything else.
void FormatBitrate(int32 bitsPerSecond, char (&text)[kBitrateTextSize]);
