#include "metadata/NameParsing.h"

#include "metadata/AsciiText.h"

#include <CopyText.h>

#include <cstring>

namespace {

// A dot and up to three characters count as an extension.
constexpr size_t kLongestExtension = 4;
// A number part is followed by a dash at one of the positions 1 to 5.
constexpr size_t kLongestNumberPart = 5;

static_assert(sizeof(FileNameParts::disc) == kLongestNumberPart + 1);
static_assert(sizeof(FileNameParts::trackNo) == kLongestNumberPart + 1);

void CutShortExtension(char* name) {
    char* dot = strrchr(name, '.');
    if (dot && strlen(dot) <= kLongestExtension)
        *dot = '\0';
}

bool HasLower(const char* text) {
    for (; *text; ++text) {
        if (IsAsciiLower(*text))
            return true;
    }
    return false;
}

void CleanSeparators(char* text) {
    for (; *text; ++text) {
        if (*text == '_' || *text == '[')
            *text = ' ';
        else if (*text == ']')
            *text = '-';
    }
}

bool HasSpacedDash(const char* text) {
    return strstr(text, " - ") != nullptr;
}

void DropFront(char* text, size_t count) {
    memmove(text, text + count, strlen(text + count) + 1);
}

// The length of the part before the first dash where that is short enough to be a number part, else 0.
size_t NumberPartLength(const char* name) {
    const char* dash = strchr(name, '-');
    if (!dash)
        return 0;
    const auto length = static_cast<size_t>(dash - name);
    return length <= kLongestNumberPart ? length : 0;
}

bool NamesADisc(const char* text) {
    return (text[0] == 'c' || text[0] == 'C') && (text[1] == 'd' || text[1] == 'D');
}

// Moves a number part, without the dash after it, from the front of `name` into `field`.
void TakeNumberPart(char* name, size_t length, char (&field)[kLongestNumberPart + 1]) {
    CopyText(field, sizeof(field), name, length);
    DropFront(name, length + 1);
}

// In a name with a spaced dash somewhere, an unspaced first dash belongs to a word ("a-ha"), so the next dash
// is the artist's, and that one is not looked at any further.
char* FindArtistDash(char* text, bool hasSpacedDash) {
    char* dash = strchr(text, '-');
    if (!dash || !hasSpacedDash)
        return dash;
    const bool spaced = dash > text && dash[-1] == ' ' && dash[1] == ' ';
    return spaced ? dash : strchr(dash + 1, '-');
}

// The artist's part is folded with the blank that may still lead it, and only then loses a second one.
void TakeArtist(char (&artist)[kNameBufferSize], const char* text, size_t length, bool isLoud) {
    CopyText(artist, sizeof(artist), text, length);
    DropLeadingBlank(artist);
    if (isLoud)
        FoldLoudText(artist);
    DropLeadingBlank(artist);
}

// A title or album loses its blank before it is folded.
void TakeTitle(char (&title)[kNameBufferSize], const char* text, bool isLoud) {
    CopyText(title, text);
    DropLeadingBlank(title);
    if (isLoud)
        FoldLoudText(title);
}

} // namespace

void ParseFileName(const char* leafName, FileNameParts& parts) {
    parts = FileNameParts();
    char name[kNameBufferSize];
    CopyText(name, leafName);

    CutShortExtension(name);
    const bool isLoud = !HasLower(name);
    CleanSeparators(name);
    // Noted before the number parts go, also for a dash that goes with them.
    const bool hasSpacedDash = HasSpacedDash(name);

    size_t numberLength = NumberPartLength(name);
    if (numberLength > 0) {
        parts.asksForFolder = true;
        if (NamesADisc(name)) {
            TakeNumberPart(name, numberLength, parts.disc);
            numberLength = NumberPartLength(name);
        }
        // Reading on past the number part is harmless: its dash can end a number or make it negative, no
        // more.
        if (numberLength > 0 && ParseAsciiNumber(name) > 0)
            TakeNumberPart(name, numberLength, parts.trackNo);
    }
    DropLeadingBlank(name);

    const char* songname = name;
    if (const char* dash = FindArtistDash(name, hasSpacedDash)) {
        parts.hasArtist = true;
        TakeArtist(parts.artist, name, static_cast<size_t>(dash - name), isLoud);
        songname = dash + 1;
    }
    TakeTitle(parts.songname, songname, isLoud);
}

void ParseFolderName(char* folderName, FolderNameParts& parts) {
    CopyText(parts.artist, folderName);
    const bool isLoud = !HasLower(folderName);
    CleanSeparators(folderName);

    const char* album = folderName;
    if (const char* dash = FindArtistDash(folderName, HasSpacedDash(folderName))) {
        TakeArtist(parts.artist, folderName, static_cast<size_t>(dash - folderName), isLoud);
        album = dash + 1;
    } else {
        // Without a dash the artist is the folder's name as it is, neither cleaned nor folded.
        DropLeadingBlank(parts.artist);
    }
    TakeTitle(parts.album, album, isLoud);
}

void FoldLoudText(char* text) {
    if (!*text)
        return;
    for (char* character = text + 1; *character; ++character)
        *character = ToAsciiLower(*character);
}

void DropLeadingBlank(char* text) {
    if (*text == ' ')
        DropFront(text, 1);
}
