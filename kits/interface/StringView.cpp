#include <StringView.h>

#include "ControlLook.h"

#include <Message.h>

#include <cmath>

namespace {

constexpr char kTextField[] = "_text";
constexpr char kAlignmentField[] = "_align";

} // namespace

REGISTER_ARCHIVABLE(BStringView);

BStringView::BStringView(BRect frame, const char* name, const char* text, uint32 resizingMode, uint32 flags)
    : BView(frame, name, resizingMode, flags), mText(text == nullptr ? "" : text) {}

BStringView::BStringView(BMessage* archive) : BView(archive) {
    if (archive == nullptr) {
        return;
    }
    const char* text = nullptr;
    if (archive->FindString(kTextField, &text) == B_OK) {
        mText = text;
    }
    int32 align = 0;
    if (archive->FindInt32(kAlignmentField, &align) == B_OK && align >= B_ALIGN_LEFT &&
        align <= B_ALIGN_CENTER) {
        mAlignment = static_cast<alignment>(align);
    }
}

BStringView::~BStringView() = default;

BArchivable* BStringView::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BStringView") ? new BStringView(archive) : nullptr;
}

status_t BStringView::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddString(kTextField, mText.c_str());
    }
    return status == B_OK ? archive->AddInt32(kAlignmentField, mAlignment) : status;
}

void BStringView::AttachedToWindow() {
    if (Parent() != nullptr) {
        SetViewColor(Parent()->ViewColor());
        SetLowColor(Parent()->ViewColor());
    }
    BView::AttachedToWindow();
}

void BStringView::Draw(BRect /*updateRect*/) {
    ControlLook(this).LabelInColor(mText.c_str(), Bounds(), mAlignment, HighColor());
}

void BStringView::SetFont(const BFont* font, uint32 mask) {
    BView::SetFont(font, mask);
    Invalidate();
}

void BStringView::SetText(const char* text) {
    const std::string wanted = text == nullptr ? "" : text;
    if (wanted != mText) {
        mText = wanted;
        Invalidate();
    }
}

void BStringView::SetAlignment(alignment align) {
    if (align != mAlignment) {
        mAlignment = align;
        Invalidate();
    }
}

void BStringView::GetPreferredSize(float* width, float* height) {
    BFont font;
    GetFont(&font);
    *width = std::ceil(font.StringWidth(mText.c_str()));
    *height = ControlLook::LineHeight(font) - 1;
}
