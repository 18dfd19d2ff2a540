#include "metadata/PackedMetaData.h"

#include "metadata/BrindleMetaData.h"

#include <cstring>
#include <iterator>

namespace {

template <typename Record>
auto FieldsOf(Record& record) {
    return std::array{std::data(record.mSongname),   std::data(record.mArtist),  std::data(record.mAlbum),
                      std::data(record.mTrackNo),    std::data(record.mDisc),    std::data(record.mVersion),
                      std::data(record.mLengthText), std::data(record.mEncoder), std::data(record.mFilename)};
}

} // namespace

PackedMetaData::PackedMetaData(const BrindleMetaData& record)
    : mRef(record.mRef), mIsValid(record.mIsValid), mBitrate(record.mBitrate),
      mLengthUsec(record.mLengthUsec) {
    const auto fields = FieldsOf(record);
    static_assert(fields.size() == kTextCount);
    std::array<size_t, kTextCount> sizes{};
    size_t whole = 0;
    for (size_t i = 0; i < fields.size(); ++i) {
        sizes[i] = strlen(fields[i]) + 1;
        mStarts[i] = static_cast<uint16>(whole);
        whole += sizes[i];
    }
    mTexts.reset(new char[whole]);
    for (size_t i = 0; i < fields.size(); ++i)
        memcpy(mTexts.get() + mStarts[i], fields[i], sizes[i]);
}

void PackedMetaData::Unpack(BrindleMetaData& record) const {
    record.mRef = mRef;
    record.mIsValid = mIsValid;
    record.mBitrate = mBitrate;
    record.mLengthUsec = mLengthUsec;
    const auto fields = FieldsOf(record);
    // Each text comes from such a field, so it fits.
    for (int32 i = 0; i < kTextCount; ++i) {
        const char* const text = TextOf(static_cast<Text>(i));
        memcpy(fields[static_cast<size_t>(i)], text, strlen(text) + 1);
    }
}
