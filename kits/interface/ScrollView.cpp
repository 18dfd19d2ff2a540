#include <ScrollView.h>

#include "ControlLook.h"

#include <Message.h>
#include <ScrollBar.h>
#include <Window.h>

#include <algorithm>

namespace {

constexpr char kStyleField[] = "_style";
constexpr char kTargetField[] = "_target";

float BorderWidth(border_style border) {
    switch (border) {
    case B_FANCY_BORDER:
        return ControlLook::kFieldFrameWidth;
    case B_PLAIN_BORDER:
        return 1;
    case B_NO_BORDER:
        break;
    }
    return 0;
}

BRect FrameAround(const BView* target, bool horizontal, bool vertical, border_style border) {
    BRect frame = target == nullptr ? BRect(0, 0, 16, 16) : target->Frame();
    frame.right += vertical ? B_V_SCROLL_BAR_WIDTH + 1 : 0;
    frame.bottom += horizontal ? B_H_SCROLL_BAR_HEIGHT + 1 : 0;
    const float width = BorderWidth(border);
    return frame.InsetByCopy(-width, -width);
}

} // namespace

REGISTER_ARCHIVABLE(BScrollView);

BScrollView::BScrollView(const char* name, BView* target, uint32 resizingMode, uint32 flags, bool horizontal,
                         bool vertical, border_style border)
    : BView(FrameAround(target, horizontal, vertical, border), name, resizingMode,
            flags | B_WILL_DRAW | B_FRAME_EVENTS),
      mBorder(border), mKnownBounds(Bounds()) {
    SetViewColor(ControlLook::kPanel);
    const float width = BorderWidth(border);
    BRect inside = Bounds().InsetByCopy(width, width);
    inside.right -= vertical ? B_V_SCROLL_BAR_WIDTH + 1 : 0;
    inside.bottom -= horizontal ? B_H_SCROLL_BAR_HEIGHT + 1 : 0;
    if (horizontal) {
        const BRect frame(inside.left, inside.bottom + 1, inside.right,
                          inside.bottom + 1 + B_H_SCROLL_BAR_HEIGHT);
        mHorizontal = new BScrollBar(frame, "_HSB_", nullptr, 0, 0, B_HORIZONTAL);
        AddChild(mHorizontal);
    }
    if (vertical) {
        const BRect frame(inside.right + 1, inside.top, inside.right + 1 + B_V_SCROLL_BAR_WIDTH,
                          inside.bottom);
        mVertical = new BScrollBar(frame, "_VSB_", nullptr, 0, 0, B_VERTICAL);
        AddChild(mVertical);
    }
    if (target != nullptr) {
        target->MoveTo(inside.LeftTop());
        target->SetResizingMode(B_FOLLOW_ALL);
        AddChild(target);
        Adopt(target);
    }
}

BScrollView::BScrollView(BMessage* archive) : BView(archive), mKnownBounds(Bounds()) {
    int32 value = 0;
    if (archive != nullptr && archive->FindInt32(kStyleField, &value) == B_OK && value >= B_PLAIN_BORDER &&
        value <= B_NO_BORDER) {
        mBorder = static_cast<border_style>(value);
    }
    for (int32 i = 0; i < CountChildren(); ++i) {
        if (auto* const bar = dynamic_cast<BScrollBar*>(ChildAt(i)); bar != nullptr) {
            (bar->Orientation() == B_HORIZONTAL ? mHorizontal : mVertical) = bar;
        }
    }
    if (archive != nullptr && archive->FindInt32(kTargetField, &value) == B_OK) {
        BView* const target = ChildAt(value);
        if (target != nullptr && target != mHorizontal && target != mVertical) {
            Adopt(target);
        }
    }
}

BScrollView::~BScrollView() {
    if (mTarget != nullptr) {
        mTarget->TargetedByScrollView(nullptr);
    }
}

BArchivable* BScrollView::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BScrollView") ? new BScrollView(archive) : nullptr;
}

status_t BScrollView::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddInt32(kStyleField, mBorder);
    }
    for (int32 i = 0; status == B_OK && mTarget != nullptr && i < CountChildren(); ++i) {
        if (ChildAt(i) == mTarget) {
            status = archive->AddInt32(kTargetField, i);
        }
    }
    return status;
}

void BScrollView::Adopt(BView* target) {
    mTarget = target;
    if (mHorizontal != nullptr) {
        mHorizontal->SetTarget(target);
    }
    if (mVertical != nullptr) {
        mVertical->SetTarget(target);
    }
    target->TargetedByScrollView(this);
}

void BScrollView::SetTarget(BView* target) {
    if (target == mTarget || (target != nullptr && target->Parent() != nullptr)) {
        return;
    }
    const float width = BorderWidth(mBorder);
    BRect inside = Bounds().InsetByCopy(width, width);
    inside.right -= mVertical != nullptr ? B_V_SCROLL_BAR_WIDTH + 1 : 0;
    inside.bottom -= mHorizontal != nullptr ? B_H_SCROLL_BAR_HEIGHT + 1 : 0;
    if (mTarget != nullptr) {
        RemoveChild(mTarget);
    }
    if (target != nullptr) {
        target->MoveTo(inside.LeftTop());
        target->ResizeTo(inside.Width(), inside.Height());
        target->SetResizingMode(B_FOLLOW_ALL);
        AddChild(target);
        Adopt(target);
    }
}

bool BScrollView::RemoveChild(BView* child) {
    if (child == mTarget && child != nullptr) {
        mTarget = nullptr;
        child->TargetedByScrollView(nullptr);
    } else if (child == mHorizontal) {
        mHorizontal = nullptr;
    } else if (child == mVertical) {
        mVertical = nullptr;
    }
    return BView::RemoveChild(child);
}

BScrollBar* BScrollView::ScrollBar(orientation posture) const {
    return posture == B_HORIZONTAL ? mHorizontal : mVertical;
}

void BScrollView::AttachedToWindow() {
    BView::AttachedToWindow();
    mKnownBounds = Bounds();
}

void BScrollView::WindowActivated(bool active) {
    BView::WindowActivated(active);
    if (mHighlighted) {
        InvalidateBorder();
    }
}

void BScrollView::SetBorder(border_style border) {
    if (border != mBorder) {
        mBorder = border;
        Invalidate();
    }
}

status_t BScrollView::SetBorderHighlighted(bool highlighted) {
    if (mBorder != B_FANCY_BORDER) {
        return B_ERROR;
    }
    if (highlighted != mHighlighted) {
        mHighlighted = highlighted;
        InvalidateBorder();
    }
    return B_OK;
}

void BScrollView::InvalidateBorder() {
    const float width = BorderWidth(mBorder);
    BRegion border(Bounds());
    border.Exclude(Bounds().InsetByCopy(width, width));
    Invalidate(&border);
}

void BScrollView::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    // Where the border was is panel or child now, and it has a new place.
    const float width = BorderWidth(mBorder);
    BRegion before(mKnownBounds);
    before.Exclude(mKnownBounds.InsetByCopy(width, width));
    Invalidate(&before);
    InvalidateBorder();
    mKnownBounds = Bounds();
}

void BScrollView::Draw(BRect /*updateRect*/) {
    ControlLook look(this);
    if (mBorder == B_FANCY_BORDER) {
        const bool active = Window() == nullptr || Window()->IsActive();
        look.FieldFrame(Bounds(), {.focused = mHighlighted && active});
    } else if (mBorder == B_PLAIN_BORDER) {
        look.Frame(Bounds(), ControlLook::kShadow);
    }
}

void BScrollView::GetPreferredSize(float* width, float* height) {
    *width = Bounds().Width();
    *height = Bounds().Height();
    if (mTarget != nullptr) {
        float targetWidth = 0;
        float targetHeight = 0;
        mTarget->GetPreferredSize(&targetWidth, &targetHeight);
        *width += targetWidth - mTarget->Bounds().Width();
        *height += targetHeight - mTarget->Bounds().Height();
    }
}
