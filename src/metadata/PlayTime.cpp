#include "metadata/PlayTime.h"

#include "metadata/AsciiText.h"

#include <cstdio>
#include <cstring>

namespace {

constexpr uint64 kUsecPerSecond = 1000000;
constexpr uint64 kLastSecondOfMinutesForm = 3599;

int32 LowHalf(uint64 value) {
    return static_cast<int32>(static_cast<uint32>(value));
}

int32 HighHalf(uint64 value) {
    return static_cast<int32>(static_cast<uint32>(value >> 32));
}

} // namespace

void FormatPlayTime(int64 lengthUsec, char (&text)[kPlayTimeTextSize]) {
    const uint64 seconds = static_cast<uint64>(lengthUsec) / kUsecPerSecond;
    // The leading number fills two fields, first its low and then its high half; the zeros of the stored
    // texts are that high half.
    if (seconds <= kLastSecondOfMinutesForm) {
        const uint64 minutes = seconds / 60;
        snprintf(text, sizeof(text), "%2d:%2d", LowHalf(minutes), HighHalf(minutes));
        if (text[3] == ' ')
            text[3] = '0';
        return;
    }
    const uint64 hours = seconds / 3600;
    const uint64 minutesOfHour = seconds / 60 % 60;
    snprintf(text, sizeof(text), "%3d:%2d:%2d", LowHalf(hours), HighHalf(hours), LowHalf(minutesOfHour));
    if (text[7] == ' ')
        text[7] = '0';
}

int64 ParsePlayTime(const char (&buffer)[kPlayTimeBufferSize]) {
    char text[kPlayTimeBufferSize];
    memcpy(text, buffer, sizeof(text));
    // Whatever the caller filled in, the text ends early enough for the look beyond its end.
    static_assert(kPlayTimeValueSize + 2 < kPlayTimeBufferSize);
    memset(text + kPlayTimeValueSize, 0, sizeof(text) - kPlayTimeValueSize);

    char* colon = strchr(text, ':');
    // The seconds are read from behind the end of the whole text, where the zero-filled buffer holds none.
    const size_t secondsPosition = strlen(text) + (colon ? 2 : 1);
    if (colon)
        *colon = '\0';
    const auto minutes = static_cast<uint32>(ParseAsciiNumber(text));
    const auto seconds = static_cast<uint32>(ParseAsciiNumber(text + secondsPosition));
    return static_cast<int32>((minutes * 60 + seconds) * 1000000);
}

void FormatBitrate(int32 bitsPerSecond, char (&text)[kBitrateTextSize]) {
    text[0] = '\0';
    if (bitsPerSecond >= 1000 && bitsPerSecond <= 999999)
        snprintf(text, sizeof(text), "%3d kbit", bitsPerSecond / 1000);
}
