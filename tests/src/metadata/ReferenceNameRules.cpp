#include "ReferenceNameRules.h"

#include <cstdlib>
#include <vector>

namespace {

// A text as the pieces between its dashes: always one more than there are dashes.
std::vector<std::string> PiecesBetweenDashes(const std::string& text) {
    std::vector<std::string> pieces(1);
    for (const char character : text) {
        if (character == '-')
            pieces.emplace_back();
        else
            pieces.back() += character;
    }
    return pieces;
}

std::string Joined(const std::vector<std::string>& pieces, size_t begin, size_t end) {
    std::string text;
    for (size_t i = begin; i < end; ++i)
        text += (i == begin ? "" : "-") + pieces[i];
    return text;
}

struct Halves {
    std::string before;
    std::string after;
};

// The text before and behind its dash number `dash`, counted from 1; nothing when it has fewer.
std::optional<Halves> SplitAtDash(const std::string& text, size_t dash) {
    const auto pieces = PiecesBetweenDashes(text);
    if (pieces.size() <= dash)
        return std::nullopt;
    return Halves{Joined(pieces, 0, dash), Joined(pieces, dash, pieces.size())};
}

bool HasSpacedDash(const std::string& text) {
    return text.find(" - ") != std::string::npos;
}

std::optional<Halves> SplitAtArtistDash(const std::string& text, bool spacedDashWasSeen) {
    const auto atFirst = SplitAtDash(text, 1);
    if (!atFirst || !spacedDashWasSeen)
        return atFirst;
    if (atFirst->before.ends_with(' ') && atFirst->after.starts_with(' '))
        return atFirst;
    return SplitAtDash(text, 2);
}

std::optional<Halves> SplitAtNumberDash(const std::string& text) {
    const auto atFirst = SplitAtDash(text, 1);
    if (!atFirst || atFirst->before.empty() || atFirst->before.size() > 5)
        return std::nullopt;
    return atFirst;
}

bool IsDisc(const std::string& numberPart) {
    const std::string start = numberPart.substr(0, 2);
    return start == "cd" || start == "cD" || start == "Cd" || start == "CD";
}

bool IsTrackNumber(const std::string& numberPart) {
    return atoi(numberPart.c_str()) > 0;
}

std::string WithoutShortExtension(const std::string& name) {
    for (const size_t length : {1, 2, 3, 4}) {
        if (name.size() >= length && name[name.size() - length] == '.')
            return name.substr(0, name.size() - length);
    }
    return name;
}

bool HasLower(const std::string& text) {
    return text.find_first_of("abcdefghijklmnopqrstuvwxyz") != std::string::npos;
}

std::string Cleaned(std::string text) {
    for (char& character : text) {
        if (character == '_' || character == '[')
            character = ' ';
        else if (character == ']')
            character = '-';
    }
    return text;
}

std::string Folded(const std::string& text) {
    static const std::string upper = "ABCDEFGHIJKLMNOPQRSTUVWXYZ";
    static const std::string lower = "abcdefghijklmnopqrstuvwxyz";
    std::string result = text.substr(0, 1);
    for (size_t i = 1; i < text.size(); ++i) {
        const size_t letter = upper.find(text[i]);
        result += letter == std::string::npos ? text[i] : lower[letter];
    }
    return result;
}

std::string OneBlankLess(const std::string& text) {
    return text.starts_with(' ') ? text.substr(1) : text;
}

std::string FittingTheField(const std::string& text) {
    return text.substr(0, 254);
}

} // namespace

ReferenceTrackFields ReferenceFieldsOfFolder(const std::string& folderName) {
    const bool loud = !HasLower(folderName);
    const std::string cleaned = Cleaned(folderName);

    ReferenceTrackFields fields;
    if (const auto halves = SplitAtArtistDash(cleaned, HasSpacedDash(cleaned))) {
        const std::string artist = OneBlankLess(halves->before);
        fields.artist = OneBlankLess(loud ? Folded(artist) : artist);
        fields.album = OneBlankLess(halves->after);
    } else {
        fields.artist = OneBlankLess(folderName);
        fields.album = OneBlankLess(cleaned);
    }
    if (loud)
        fields.album = Folded(fields.album);

    fields.artist = FittingTheField(fields.artist);
    fields.album = FittingTheField(fields.album);
    return fields;
}

ReferenceTrackFields ReferenceFieldsOf(const std::string& fileName,
                                       const std::optional<std::string>& folderName) {
    const std::string stem = WithoutShortExtension(fileName);
    const bool loud = !HasLower(stem);
    std::string rest = Cleaned(stem);
    const bool spacedDashWasSeen = HasSpacedDash(rest);

    ReferenceTrackFields fields;
    auto numbered = SplitAtNumberDash(rest);
    if (numbered) {
        if (folderName)
            fields = ReferenceFieldsOfFolder(*folderName);
        if (IsDisc(numbered->before)) {
            fields.disc = numbered->before;
            rest = numbered->after;
            numbered = SplitAtNumberDash(rest);
        }
        if (numbered && IsTrackNumber(numbered->before)) {
            fields.trackNo = numbered->before;
            rest = numbered->after;
        }
    }
    rest = OneBlankLess(rest);

    std::string song = rest;
    if (const auto halves = SplitAtArtistDash(rest, spacedDashWasSeen)) {
        const std::string artist = OneBlankLess(halves->before);
        fields.artist = loud ? Folded(artist) : artist;
        song = halves->after;
    }
    fields.artist = FittingTheField(OneBlankLess(fields.artist));
    song = OneBlankLess(song);
    fields.songname = FittingTheField(loud ? Folded(song) : song);
    return fields;
}
