#include <ListItem.h>

#include "ControlLook.h"

#include <Font.h>
#include <InterfaceDefs.h>
#include <Message.h>
#include <View.h>

#include <cmath>

namespace {

constexpr char kSelectedField[] = "_sel";
constexpr char kDisabledField[] = "_disable";
constexpr char kExpandedField[] = "_li_expanded";
constexpr char kLevelField[] = "_li_outline_level";
constexpr char kLabelField[] = "_label";

constexpr float kTextIndent = 4;

} // namespace

REGISTER_ARCHIVABLE(BStringItem);

BListItem::BListItem(uint32 outlineLevel, bool expanded) : mOutlineLevel(outlineLevel), mExpanded(expanded) {}

BListItem::BListItem(BMessage* archive) : BArchivable(archive) {
    if (archive == nullptr) {
        return;
    }
    bool flag = false;
    if (archive->FindBool(kSelectedField, &flag) == B_OK) {
        mSelected = flag;
    }
    if (archive->FindBool(kDisabledField, &flag) == B_OK) {
        mEnabled = !flag;
    }
    if (archive->FindBool(kExpandedField, &flag) == B_OK) {
        mExpanded = flag;
    }
    int32 level = 0;
    if (archive->FindInt32(kLevelField, &level) == B_OK) {
        mOutlineLevel = static_cast<uint32>(level);
    }
}

BListItem::~BListItem() = default;

status_t BListItem::Archive(BMessage* archive, bool deep) const {
    status_t status = BArchivable::Archive(archive, deep);
    if (status == B_OK && mSelected) {
        status = archive->AddBool(kSelectedField, true);
    }
    if (status == B_OK && !mEnabled) {
        status = archive->AddBool(kDisabledField, true);
    }
    if (status == B_OK) {
        status = archive->AddBool(kExpandedField, mExpanded);
    }
    if (status == B_OK) {
        status = archive->AddInt32(kLevelField, static_cast<int32>(mOutlineLevel));
    }
    return status;
}

void BListItem::Update(BView* owner, const BFont* font) {
    font_height height;
    font->GetHeight(&height);
    SetWidth(owner->Bounds().Width());
    SetHeight(std::ceil(height.ascent + height.descent + height.leading));
}

BStringItem::BStringItem(const char* text, uint32 outlineLevel, bool expanded)
    : BListItem(outlineLevel, expanded), mText(text == nullptr ? "" : text) {}

BStringItem::BStringItem(BMessage* archive) : BListItem(archive) {
    const char* text = nullptr;
    if (archive != nullptr && archive->FindString(kLabelField, &text) == B_OK) {
        mText = text;
    }
}

BStringItem::~BStringItem() = default;

BArchivable* BStringItem::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BStringItem") ? new BStringItem(archive) : nullptr;
}

status_t BStringItem::Archive(BMessage* archive, bool deep) const {
    const status_t status = BListItem::Archive(archive, deep);
    return status == B_OK ? archive->AddString(kLabelField, mText.c_str()) : status;
}

void BStringItem::DrawItem(BView* owner, BRect frame, bool complete) {
    const rgb_color high = owner->HighColor();
    const rgb_color low = owner->LowColor();
    if (IsSelected() || complete) {
        const rgb_color background = IsSelected() ? ControlLook::kSelectedRow : owner->ViewColor();
        owner->SetHighColor(background);
        owner->SetLowColor(background);
        owner->FillRect(frame);
    }
    owner->SetHighColor(IsEnabled() ? high : ControlLook::kDisabledText);
    owner->DrawString(mText.c_str(), BPoint(frame.left + kTextIndent, frame.top + mBaselineOffset));
    owner->SetHighColor(high);
    owner->SetLowColor(low);
}

void BStringItem::Update(BView* owner, const BFont* font) {
    font_height height;
    font->GetHeight(&height);
    mBaselineOffset = std::ceil(height.ascent + height.leading) + 1;
    SetWidth(std::ceil(font->StringWidth(Text())) + 2 * kTextIndent);
    SetHeight(std::ceil(height.ascent + height.descent + height.leading) + 2);
    // The owner's width does not matter: the list scrolls sideways to the widest row.
    (void)owner;
}

void BStringItem::SetText(const char* text) {
    mText = text == nullptr ? "" : text;
}
