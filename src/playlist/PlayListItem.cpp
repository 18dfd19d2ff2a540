#include "playlist/PlayListItem.h"

#include "metadata/BrindleMetaData.h"

#include <Bitmap.h>
#include <Font.h>
#include <Region.h>
#include <View.h>

#include <cmath>
#include <cstring>
#include <utility>

namespace {

constexpr float kMinRowHeight = 20;
constexpr float kTextInset = 2;
constexpr float kCoverInset = 2;
constexpr BRect kSmallCover(0, 0, 15, 15);
constexpr rgb_color kSelectedBackground = {178, 178, 178, 255};
constexpr rgb_color kBackground = {255, 255, 255, 255};
constexpr rgb_color kTextColor = {0, 0, 0, 255};

} // namespace

PlayListItem::PlayListItem(entry_ref* ref) : CLVListItem(0, false, false, kMinRowHeight) {
    BrindleMetaData record(ref);
    mPacked.emplace(record);
    if (record.mCover64x64bitmap == nullptr && record.mCover16x16bitmap == nullptr)
        return;
    BrindleMetaData& kept = MetaData();
    std::swap(kept.mCover64x64bitmap, record.mCover64x64bitmap);
    std::swap(kept.mCover16x16bitmap, record.mCover16x16bitmap);
}

PlayListItem::~PlayListItem() {
    if (mMetaData == nullptr)
        return;
    // The record leaves its small cover to whoever shows it.
    delete mMetaData->mCover16x16bitmap;
    mMetaData->mCover16x16bitmap = nullptr;
}

BrindleMetaData& PlayListItem::MetaData() {
    if (mMetaData == nullptr) {
        mMetaData = std::make_unique<BrindleMetaData>();
        mPacked->Unpack(*mMetaData);
        mPacked.reset();
    }
    return *mMetaData;
}

void PlayListItem::GetRef(entry_ref* out) const {
    *out = mPacked ? mPacked->Ref() : mMetaData->mRef;
}

void PlayListItem::Update(BView* owner, const BFont* font) {
    CLVListItem::Update(owner, font);
    mTextOffset = CenteredBaseline();
}

void PlayListItem::DrawItemColumn(BView* owner, BRect columnRect, int32 columnIndex, bool complete) {
    const rgb_color background = IsSelected() ? kSelectedBackground : kBackground;
    owner->SetLowColor(background);
    owner->SetDrawingMode(B_OP_COPY);
    if (IsSelected() || complete) {
        owner->SetHighColor(background);
        owner->FillRect(columnRect, B_SOLID_HIGH);
    }

    BRegion cell(columnRect);
    owner->ConstrainClippingRegion(&cell);
    owner->SetHighColor(kTextColor);
    owner->SetFontSize(kTextSize);
    if (columnIndex == kColumnCover) {
        DrawCovers(owner, columnRect);
    } else if (const char* const text = TextOf(columnIndex); text != nullptr) {
        owner->DrawString(text, BPoint(columnRect.left + kTextInset, columnRect.top + mTextOffset));
    }
    owner->ConstrainClippingRegion(nullptr);
}

void PlayListItem::DrawCovers(BView* owner, BRect rect) const {
    if (mMetaData == nullptr)
        return;
    const BBitmap* const small = mMetaData->mCover16x16bitmap;
    if (small != nullptr && small->IsValid()) {
        rect.left += kCoverInset;
        rect.right = rect.left + kSmallCover.Width();
        rect.top += kCoverInset;
        if (Height() > kMinRowHeight)
            rect.top += std::ceil((Height() - kMinRowHeight) / 2);
        rect.bottom = rect.top + kSmallCover.Height();
        owner->SetDrawingMode(B_OP_OVER);
        owner->DrawBitmap(small, kSmallCover, rect);
        owner->SetDrawingMode(B_OP_COPY);
    }
    // The large one goes over it; alone it takes the whole cell.
    if (mMetaData->mCover64x64bitmap != nullptr)
        owner->DrawBitmap(mMetaData->mCover64x64bitmap, rect);
}

const char* PlayListItem::TextOf(int32 columnIndex) const {
    switch (columnIndex) {
    case kColumnTrackNo:
        return mPacked ? mPacked->TextOf(PackedMetaData::kTrackNo) : mMetaData->mTrackNo;
    case kColumnTime:
        return mPacked ? mPacked->TextOf(PackedMetaData::kLengthText) : mMetaData->mLengthText;
    case kColumnSongname:
        return mPacked ? mPacked->TextOf(PackedMetaData::kSongname) : mMetaData->mSongname;
    case kColumnArtist:
        return mPacked ? mPacked->TextOf(PackedMetaData::kArtist) : mMetaData->mArtist;
    case kColumnAlbum:
        return mPacked ? mPacked->TextOf(PackedMetaData::kAlbum) : mMetaData->mAlbum;
    default:
        return nullptr;
    }
}

int64 PlayListItem::LengthUsec() const {
    return mPacked ? mPacked->LengthUsec() : mMetaData->mLengthUsec;
}

int PlayListItem::CompareFunc(const CLVListItem* a, const CLVListItem* b, long sortKey) {
    const auto& first = *static_cast<const PlayListItem*>(a);
    const auto& second = *static_cast<const PlayListItem*>(b);
    const auto compareTexts = [&](int32 column) {
        return strcmp(first.TextOf(column), second.TextOf(column));
    };
    switch (sortKey) {
    case kColumnCover:
        return 0;
    case kColumnTrackNo: {
        const int albums = compareTexts(kColumnAlbum);
        return albums != 0 ? albums : compareTexts(kColumnTrackNo);
    }
    case kColumnTime:
        return static_cast<int32>(static_cast<uint32>(first.LengthUsec()) -
                                  static_cast<uint32>(second.LengthUsec()));
    case kColumnSongname:
    case kColumnArtist:
    case kColumnAlbum:
        return compareTexts(static_cast<int32>(sortKey));
    default:
        return static_cast<int>(sortKey);
    }
}
