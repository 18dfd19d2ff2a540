// BrindleMetaData: reading and writing a track's attributes, and taking covers from an image.
#include "metadata/BrindleMetaData.h"

#include "metadata/PlayTime.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <File.h>
#include <Message.h>
#include <Node.h>
#include <NodeInfo.h>
#include <TranslationUtils.h>
#include <TypeConstants.h>
#include <View.h>

#include <cstdio>
#include <cstring>
#include <memory>

namespace {

// True when there is such an attribute. The value may be of any type, lack its terminator or be longer than
// the field: what is kept ends within it. A missing attribute leaves the field as it was.
bool ReadText(BNode& node, const char* name, char (&field)[kTextFieldSize]) {
    char value[kTextFieldSize];
    const ssize_t size = node.ReadAttr(name, B_STRING_TYPE, 0, value, sizeof(value));
    if (size < 0)
        return false;
    CopyText(field, sizeof(field), value, static_cast<size_t>(size));
    return true;
}

void WriteText(BNode& node, const char* name, const char* text) {
    node.WriteAttr(name, B_STRING_TYPE, 0, text, strlen(text) + 1);
}

// Part of reading a track: every attribute is looked at once, and nothing is kept of it.
void TouchAttributes(BNode& node) {
    char name[B_ATTR_NAME_LENGTH];
    attr_info info;
    node.RewindAttrs();
    while (node.GetNextAttrName(name) == B_OK)
        node.GetAttrInfo(name, &info);
}

} // namespace

status_t BrindleMetaData::ReadMetaAttributes(BNode* node) {
    TouchAttributes(*node);
    if (!ReadText(*node, kAttributeSongname, mSongname)) {
        ReadPlayTimeAttribute(node);
        mIsValid = true;
        return -1;
    }
    ReadText(*node, kAttributeSongname, mSongname);
    ReadText(*node, kAttributeArtist, mArtist);
    ReadText(*node, kAttributeAlbum, mAlbum);
    ReadText(*node, kAttributeTrackNo, mTrackNo);
    ReadText(*node, kAttributeDisc, mDisc);
    ReadText(*node, kAttributeVersion, mVersion);
    ReadText(*node, kAttributeEncoder, mEncoder);
    ReadCoverAttribute(node);
    return 0;
}

void BrindleMetaData::ReadCoverAttribute(BNode* node) {
    delete mCover64x64bitmap;
    mCover64x64bitmap = nullptr;

    char value[kLargestCoverValue];
    const ssize_t size = node->ReadAttr(kAttribute64x64Cover, B_RAW_TYPE, 0, value, sizeof(value));
    if (size <= 0)
        return;
    // What cannot be unflattened gives an empty archive, and that an invalid bitmap, which is kept all the
    // same.
    BMessage archive;
    archive.Unflatten(value, static_cast<size_t>(size));
    mCover64x64bitmap = new BBitmap(&archive);
}

void BrindleMetaData::ReadPlayTimeAttribute(BNode* node) {
    char value[kPlayTimeBufferSize] = {};
    const ssize_t size = node->ReadAttr(kAttributeLength, B_STRING_TYPE, 0, value, kPlayTimeValueSize);
    // A missing attribute is treated as an empty text, an existing but empty one as nothing to do.
    if (size != 0) {
        CopyText(mLengthText, value);
        mLengthUsec = ParsePlayTime(value);
    }
    char bitrate[kPlayTimeValueSize];
    node->ReadAttr(kAttributeBitrate, B_STRING_TYPE, 0, bitrate, sizeof(bitrate));
}

void BrindleMetaData::WriteMetaAttributes(BNode* node) {
    WriteText(*node, kAttributeSongname, mSongname);
    WriteText(*node, kAttributeArtist, mArtist);
    WriteText(*node, kAttributeAlbum, mAlbum);
    WriteText(*node, kAttributeTrackNo, mTrackNo);
    WriteText(*node, kAttributeDisc, mDisc);
    WriteText(*node, kAttributeVersion, mVersion);

    char playTime[kPlayTimeTextSize];
    FormatPlayTime(mLengthUsec, playTime);
    WriteText(*node, kAttributeLength, playTime);

    // Formed and left at that: no attribute holds the bit rate.
    char bitrate[kBitrateTextSize];
    FormatBitrate(mBitrate, bitrate);

    if (mCover64x64bitmap)
        WriteCoverAttribute(node);
    if (!mCover16x16bitmap)
        return;
    if (mCover16x16bitmap->IsValid()) {
        BNodeInfo nodeInfo(node);
        nodeInfo.SetIcon(mCover16x16bitmap, B_MINI_ICON);
    } else {
        printf("WriteAttr: mCover16x16bitmap isn't valid, skipped\n");
    }
}

void BrindleMetaData::WriteCoverAttribute(BNode* node) {
    if (!mCover64x64bitmap->Lock())
        return;
    BMessage archive;
    mCover64x64bitmap->Archive(&archive, true);
    mCover64x64bitmap->Unlock();

    const ssize_t size = archive.FlattenedSize();
    if (size <= 0)
        return;
    const auto buffer = std::make_unique<char[]>(static_cast<size_t>(size));
    if (archive.Flatten(buffer.get(), size) == B_OK)
        node->WriteAttr(kAttribute64x64Cover, B_RAW_TYPE, 0, buffer.get(), static_cast<size_t>(size));
}

status_t BrindleMetaData::SetTrackPicture(entry_ref* imageRef) {
    BFile file(imageRef, B_READ_ONLY);
    delete mPicture;
    mPicture = BTranslationUtils::GetBitmap(&file);
    if (!mPicture) {
        printf("Can't read bitmap\n");
        return -1;
    }
    printf("Reading bitmap succeeded\n");

    delete mCover64x64bitmap;
    mCover64x64bitmap = MakeBitmap(BRect(0, 0, 64, 64), mPicture);
    delete mCover16x16bitmap;
    mCover16x16bitmap = MakeBitmap(BRect(0, 0, 16, 16), mPicture);

    BNode node(&mRef);
    WriteMetaAttributes(&node);
    return 0;
}

BBitmap* BrindleMetaData::MakeBitmap(BRect frame, BBitmap* source) {
    auto* bitmap = new BBitmap(frame, B_RGB16, true, false);
    // The bitmap owns the view from here on.
    auto* view = new BView(frame, "", 0, 0);
    bitmap->AddChild(view);
    if (bitmap->Lock()) {
        view->DrawBitmap(source, frame);
        view->Sync();
        bitmap->Unlock();
    }
    return bitmap;
}
