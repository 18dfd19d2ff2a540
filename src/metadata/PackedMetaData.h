// A track's metadata without the reserve of its fields.
#pragma once

#include <EntryRef.h>
#include <SupportDefs.h>

#include <array>
#include <memory>

class BrindleMetaData;

// What a record holds, but for its bitmaps, in as many bytes as it has: some hundred in place of some
// thousand. Never changes. One thread at a time.
class PackedMetaData {
  public:
    enum Text : int32 {
        kSongname,
        kArtist,
        kAlbum,
        kTrackNo,
        kDisc,
        kVersion,
        kLengthText,
        kEncoder,
        kFilename,
        kTextCount
    };

    explicit PackedMetaData(const BrindleMetaData& record);
    PackedMetaData(PackedMetaData&&) = default;

    // Into an empty record.
    void Unpack(BrindleMetaData& record) const;

    // Never null; lives as long as this.
    const char* TextOf(Text text) const { return mTexts.get() + mStarts[text]; }
    int64 LengthUsec() const { return mLengthUsec; }
    const entry_ref& Ref() const { return mRef; }

  private:
    entry_ref mRef;
    // End to end, each with its terminator.
    std::unique_ptr<char[]> mTexts;
    std::array<uint16, kTextCount> mStarts{};
    bool mIsValid;
    int32 mBitrate;
    int64 mLengthUsec;
};
