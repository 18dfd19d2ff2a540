// The rules that cut a track's fields out of a file's and a folder's name. Pure text: no files, no locale, no
// allocation. Any thread.
//
// A name is a leaf name: at most 255 bytes, of which only the ASCII ones mean anything to the rules. Where a
// rule keeps a blank, it keeps it on purpose: trailing blanks are never removed, and of leading ones never
// more than stated.
#pragma once

#include <cstddef>

inline constexpr size_t kNameBufferSize = 256;

// What a file's name says. Texts that were not found are empty.
struct FileNameParts {
    // The part before an early dash, taken for a disc: "CD2 ".
    char disc[6] = "";
    // The part before an early dash, taken for a track number: "01 ".
    char trackNo[6] = "";
    // The first dash stood early enough for a number part, whatever that part held: the folder's name is to
    // be read, before `artist` is looked at.
    bool asksForFolder = false;
    // There was an artist's dash: `artist` (which may be empty) takes the place of the folder's.
    bool hasArtist = false;
    char artist[kNameBufferSize] = "";
    char songname[kNameBufferSize] = "";
};

// What a folder's name says.
struct FolderNameParts {
    char artist[kNameBufferSize] = "";
    char album[kNameBufferSize] = "";
};

// Both fill `parts` anew. Names longer than 255 bytes are cut there.
void ParseFileName(const char* leafName, FileNameParts& parts);
// Cleans `folderName` in place: '_' and '[' become blanks, ']' becomes '-'.
void ParseFolderName(char* folderName, FolderNameParts& parts);

// Lower-cases every ASCII letter but the first character. For texts without any lower-case letter.
void FoldLoudText(char* text);
// Removes one blank from the front, if there is one.
void DropLeadingBlank(char* text);
