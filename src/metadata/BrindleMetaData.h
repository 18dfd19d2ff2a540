// One track's metadata: its texts, play time, bit rate, cover pictures and the file that it belongs to.
#pragma once

#include "metadata/MusicAttributes.h"

#include <EntryRef.h>
#include <Rect.h>
#include <StorageDefs.h>
#include <SupportDefs.h>

class BBitmap;
class BEntry;
class BMessage;
class BNode;

// The record is filled from a file (its attributes, else its and its folder's names) or from a message, and
// goes back to either. No member function reports more than is said here, and nothing throws.
//
// Not locked: one thread at a time. Never copied, as it owns bitmaps. A text holds at most 254 bytes and is
// always terminated; longer ones are cut.
class BrindleMetaData {
  public:
    // Empty and invalid.
    BrindleMetaData();
    // Filled by ReadMetaDataFromRef().
    explicit BrindleMetaData(entry_ref* ref);
    // Filled from the form that SaveIntoMessage() makes; fields that the message lacks stay empty. A null
    // message gives an empty record. Says on standard output what it finds of the covers.
    explicit BrindleMetaData(BMessage* message);
    // Deletes mCover64x64bitmap and mPicture. mCover16x16bitmap outlives the record.
    ~BrindleMetaData();
    BrindleMetaData(const BrindleMetaData&) = delete;
    BrindleMetaData& operator=(const BrindleMetaData&) = delete;

    // Empties every field but mRef and mLengthText. The bitmap pointers become null without their bitmaps
    // being deleted: who owns them deletes them before.
    void ClearData();

    // Prints the record on standard output, for debugging. Answers what the last printf answered.
    int PrintToStream() const;

    // Appends the record to the message, empty texts included: "IsValid", the texts under their attributes'
    // names, "Audio:LengthUsec", the covers that there are as "cover64x64" and "cover16x16" (bitmap archives;
    // empty ones for bitmaps that could not be locked) and "filename". mRef, mLengthText, mBitrate and
    // mPicture stay behind. Null is ignored.
    void SaveIntoMessage(BMessage* message) const;

    // Empties the record and fills it from a file: from its attributes, else from the names of the file and
    // its folder, which are then written to the file's attributes. 0 and valid, or -1 and invalid when the
    // file cannot be opened. Bitmaps that the record held before are deleted.
    status_t ReadMetaDataFromRef(entry_ref* ref);

    // No reader for tags inside the file exists: always -1, and invalid.
    status_t ReadMetaID3Tag(entry_ref* ref);

    // Fills the record from the names of the file and its folder and writes the attributes. Always 0.
    status_t ReadMetaFilename(entry_ref* ref);

    // Fills mArtist and mAlbum from a folder's name, which is cleaned in place.
    void ParseDirName(char* folderName);

    // Lower-cases all but the first character, in place.
    void LessLoud(char* text);

    // Reads the attributes of an open track file. 0 when it has "Audio:Songname"; the texts of attributes
    // that it lacks are left as they were. Otherwise -1, after reading the play time, which is read in that
    // case only.
    status_t ReadMetaAttributes(BNode* node);

    // Writes the texts (empty ones too), the play time as whole minutes and the covers that there are. Errors
    // are ignored, and nothing is removed from the file.
    void WriteMetaAttributes(BNode* node);

    // Takes the covers from an image file and writes them, with all else, to the attributes of mRef. 0, or -1
    // with the covers and the track's file unchanged when the image cannot be read. Says which on standard
    // output.
    status_t SetTrackPicture(entry_ref* imageRef);

    // A new bitmap of `frame` (an inclusive rectangle of pixels) in B_RGB16, filled by the scaled source;
    // blank when it could not be drawn. The caller owns it.
    BBitmap* MakeBitmap(BRect frame, BBitmap* source);

    // True once a file or its name has given the data.
    bool mIsValid = false;
    char mSongname[kTextFieldSize] = "";
    char mArtist[kTextFieldSize] = "";
    char mAlbum[kTextFieldSize] = "";
    // Text as cut from the name, blanks included: "01 ".
    char mTrackNo[kTextFieldSize] = "";
    // "CD1 ".
    char mDisc[kTextFieldSize] = "";
    char mVersion[kTextFieldSize] = "";
    // The play time as it stood in the attribute.
    char mLengthText[kTextFieldSize] = "";
    int64 mLengthUsec = 0;
    // Only the fifth of these words has a meaning; the others stay zero.
    union {
        int32 mNumeric[6] = {};
        struct {
            int32 mIdleNumeric[4];
            // Bits per second.
            int32 mBitrate;
            int32 mLastIdleNumeric;
        };
    };
    char mEncoder[kTextFieldSize] = "";
    // The picture in full size, from SetTrackPicture(). Owned; null when none.
    BBitmap* mPicture = nullptr;
    // The cover, 65 by 65 pixels. Owned; null when none. An unreadable cover attribute leaves an invalid
    // bitmap here.
    BBitmap* mCover64x64bitmap = nullptr;
    // The small cover, 17 by 17 pixels. Null when none.
    BBitmap* mCover16x16bitmap = nullptr;
    entry_ref mRef;
    char mFilename[B_FILE_NAME_LENGTH] = "";
    // Reserved: nothing but ClearData() touches it.
    struct Spare {
        int32 words[3] = {};
        char text[kTextFieldSize] = "";
        uint8 byte = 0;
        char texts[5][kTextFieldSize] = {};
    };
    Spare mSpare;

  private:
    void DeleteOwnedBitmaps();
    void ReadCoverAttribute(BNode* node);
    void ReadPlayTimeAttribute(BNode* node);
    void DeriveFromNames(const entry_ref& ref);
    void ReadFolderName(const BEntry& entry);
    void WriteCoverAttribute(BNode* node);
};
