#include <Box.h>

#include "ControlLook.h"

#include <Message.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr char kStyleField[] = "_style";
constexpr char kLabelField[] = "_label";
constexpr char kLabelViewField[] = "_lblview";

constexpr float kLabelLeft = 10;
constexpr float kLabelRoom = 3;

} // namespace

REGISTER_ARCHIVABLE(BBox);

BBox::BBox(BRect frame, const char* name, uint32 resizingMode, uint32 flags, border_style border)
    : BView(frame, name, resizingMode, flags | B_FRAME_EVENTS), mBorder(border), mKnownBounds(Bounds()) {}

BBox::BBox(BMessage* archive) : BView(archive), mKnownBounds(Bounds()) {
    if (archive == nullptr) {
        return;
    }
    const int32 style = archive->GetInt32(kStyleField, B_FANCY_BORDER);
    if (style >= B_PLAIN_BORDER && style <= B_NO_BORDER) {
        mBorder = static_cast<border_style>(style);
    }
    const char* label = nullptr;
    if (archive->FindString(kLabelField, &label) == B_OK) {
        SetLabel(label);
    }
    mLabelView = ChildAt(archive->GetInt32(kLabelViewField, -1));
}

BBox::~BBox() = default;

BArchivable* BBox::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BBox") ? new BBox(archive) : nullptr;
}

status_t BBox::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddInt32(kStyleField, mBorder);
    }
    if (status == B_OK && mHasLabel) {
        status = archive->AddString(kLabelField, mLabel.c_str());
    }
    for (int32 i = 0; status == B_OK && mLabelView != nullptr && i < CountChildren(); ++i) {
        if (ChildAt(i) == mLabelView) {
            status = archive->AddInt32(kLabelViewField, i);
        }
    }
    return status;
}

void BBox::AttachedToWindow() {
    if (Parent() != nullptr) {
        SetViewColor(Parent()->ViewColor());
        SetLowColor(Parent()->ViewColor());
    }
    BView::AttachedToWindow();
    mKnownBounds = Bounds();
}

void BBox::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    // The frame's right and lower sides, where they were and where they are.
    for (const BRect& bounds : {mKnownBounds, Bounds()}) {
        Invalidate(BRect(bounds.right - 1, bounds.top, bounds.right, bounds.bottom));
        Invalidate(BRect(bounds.left, bounds.bottom - 1, bounds.right, bounds.bottom));
    }
    mKnownBounds = Bounds();
}

BRect BBox::FrameRect() const {
    BRect frame = Bounds();
    if (mLabelView != nullptr) {
        frame.top += std::floor(mLabelView->Bounds().Height() / 2);
    } else if (mHasLabel) {
        BFont font;
        GetFont(&font);
        frame.top += std::floor(ControlLook::LineHeight(font) / 2);
    }
    return frame;
}

BRect BBox::InnerFrame() const {
    const float width = mBorder == B_NO_BORDER ? 0.0F : (mBorder == B_PLAIN_BORDER ? 1.0F : 2.0F);
    BRect inner = FrameRect().InsetByCopy(width, width);
    // The lower half of the label reaches into the frame.
    inner.top = std::max(inner.top, 2 * FrameRect().top);
    return inner;
}

void BBox::Draw(BRect /*updateRect*/) {
    const BRect frame = FrameRect();
    const rgb_color textColor = HighColor();
    ControlLook look(this);
    if (mBorder == B_FANCY_BORDER) {
        // A groove.
        look.Bevelled(look.Bevelled(frame, ControlLook::Bevel::Sunken), ControlLook::Bevel::Raised);
    } else if (mBorder == B_PLAIN_BORDER) {
        look.Frame(frame, ControlLook::kShadow);
    }
    if (mHasLabel) {
        BFont font;
        GetFont(&font);
        const float left = Bounds().left + kLabelLeft;
        const float right =
            std::min(left + std::ceil(font.StringWidth(mLabel.c_str())) - 1, Bounds().right - kLabelLeft);
        const BRect label(left, Bounds().top, right, Bounds().top + ControlLook::LineHeight(font) - 1);
        look.Fill(label.InsetByCopy(-kLabelRoom, 0), ViewColor());
        look.LabelInColor(mLabel.c_str(), label, B_ALIGN_LEFT, textColor);
    }
}

void BBox::SetBorder(border_style border) {
    if (border != mBorder) {
        mBorder = border;
        Invalidate();
    }
}

void BBox::ForgetLabel() {
    BView* const view = mLabelView;
    mLabelView = nullptr;
    mHasLabel = false;
    mLabel.clear();
    delete view;
}

void BBox::SetLabel(const char* label) {
    ForgetLabel();
    mHasLabel = label != nullptr;
    mLabel = label == nullptr ? "" : label;
    Invalidate();
}

status_t BBox::SetLabel(BView* label) {
    if (label != nullptr && label->Parent() != nullptr) {
        return B_BAD_VALUE;
    }
    ForgetLabel();
    if (label != nullptr) {
        label->MoveTo(Bounds().left + kLabelLeft, Bounds().top);
        AddChild(label);
        mLabelView = label;
    }
    Invalidate();
    return B_OK;
}

bool BBox::RemoveChild(BView* child) {
    if (child == mLabelView) {
        mLabelView = nullptr;
    }
    return BView::RemoveChild(child);
}
