#include "playlist/PlayListItem.h"

#include "metadata/BrindleMetaData.h"

#include <Bitmap.h>
#include <Font.h>
#include <Region.h>
#include <View.h>

#include <cmath>
#include <cstring>

namespace {

constexpr float kMinRowHeight = 20;
constexpr float kTextInset = 2;
constexpr float kCoverInset = 2;
constexpr BRect kSmallCover(0, 0, 15, 15);
constexpr rgb_color kSelectedBackground = {178, 178, 178, 255};
constexpr rgb_color kBackground = {255, 255, 255, 255};
constexpr rgb_color kTextColor = {0, 0, 0, 255};

} // namespace

PlayListItem::PlayListItem(entry_ref* ref)
    : CLVListItem(0, false, false, kMinRowHeight), mMetaData(std::make_unique<BrindleMetaData>(ref)) {}

PlayListItem::~PlayListItem() {
    // The record leaves its small cover to whoever shows it.
    delete mMetaData->mCover16x16bitmap;
    mMetaData->mCover16x16bitmap = nullptr;
}

void PlayListItem::GetRef(entry_ref* out) const {
    *out = mMetaData->mRef;
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
        return mMetaData->mTrackNo;
    case kColumnTime:
        return mMetaData->mLengthText;
    case kColumnSongname:
        return mMetaData->mSongname;
    case kColumnArtist:
        return mMetaData->mArtist;
    case kColumnAlbum:
        return mMetaData->mAlbum;
    default:
        return nullptr;
    }
}

int PlayListItem::CompareFunc(const CLVListItem* a, const CLVListItem* b, long sortKey) {
    const BrindleMetaData& first = static_cast<const PlayListItem*>(a)->MetaData();
    const BrindleMetaData& second = static_cast<const PlayListItem*>(b)->MetaData();
    switch (sortKey) {
    case kColumnCover:
        return 0;
    case kColumnTrackNo: {
        const int albums = strcmp(first.mAlbum, second.mAlbum);
        return albums != 0 ? albums : strcmp(first.mTrackNo, second.mTrackNo);
    }
    case kColumnTime:
        return static_cast<int32>(static_cast<uint32>(first.mLengthUsec) -
                                  static_cast<uint32>(second.mLengthUsec));
    case kColumnSongname:
        return strcmp(first.mSongname, second.mSongname);
    case kColumnArtist:
        return strcmp(first.mArtist, second.mArtist);
    case kColumnAlbum:
        return strcmp(first.mAlbum, second.mAlbum);
    default:
        return static_cast<int>(sortKey);
    }
}
