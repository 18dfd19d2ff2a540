#include <ScrollBar.h>

#include "ControlLook.h"

#include <MessageRunner.h>
#include <Window.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr char kRangeField[] = "_range";
constexpr char kStepsField[] = "_steps";
constexpr char kValueField[] = "_val";
constexpr char kProportionField[] = "_prop";
constexpr char kOrientationField[] = "_orient";

constexpr uint32 kRepeat = 'SbRp';
constexpr bigtime_t kFirstRepeat = 300000;
constexpr bigtime_t kNextRepeats = 50000;

constexpr float kStepsPerWheelTurn = 3;

uint32 FollowFor(orientation direction) {
    return direction == B_VERTICAL ? B_FOLLOW_TOP_BOTTOM | B_FOLLOW_RIGHT
                                   : B_FOLLOW_LEFT_RIGHT | B_FOLLOW_BOTTOM;
}

} // namespace

REGISTER_ARCHIVABLE(BScrollBar);

BScrollBar::BScrollBar(BRect frame, const char* name, BView* target, float min, float max,
                       orientation direction)
    : BView(frame, name, FollowFor(direction), B_WILL_DRAW | B_FULL_UPDATE_ON_RESIZE | B_FRAME_EVENTS),
      mOrientation(direction) {
    SetViewColor(B_TRANSPARENT_COLOR);
    SetRange(min, max);
    SetTarget(target);
}

BScrollBar::BScrollBar(BMessage* archive) : BView(archive), mOrientation(B_VERTICAL) {
    if (archive == nullptr) {
        return;
    }
    int32 direction = 0;
    if (archive->FindInt32(kOrientationField, &direction) == B_OK && direction == B_HORIZONTAL) {
        mOrientation = B_HORIZONTAL;
    }
    float first = 0;
    float second = 0;
    if (archive->FindFloat(kRangeField, 0, &first) == B_OK &&
        archive->FindFloat(kRangeField, 1, &second) == B_OK) {
        SetRange(first, second);
    }
    if (archive->FindFloat(kStepsField, 0, &first) == B_OK &&
        archive->FindFloat(kStepsField, 1, &second) == B_OK) {
        SetSteps(first, second);
    }
    if (archive->FindFloat(kProportionField, &first) == B_OK) {
        SetProportion(first);
    }
    if (archive->FindFloat(kValueField, &first) == B_OK) {
        SetValue(first);
    }
}

BScrollBar::~BScrollBar() {
    SetTarget(static_cast<BView*>(nullptr));
}

BArchivable* BScrollBar::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BScrollBar") ? new BScrollBar(archive) : nullptr;
}

status_t BScrollBar::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    const auto add = [&](const char* name, float value) {
        if (status == B_OK) {
            status = archive->AddFloat(name, value);
        }
    };
    add(kRangeField, mLayout.min);
    add(kRangeField, mLayout.max);
    add(kStepsField, mSmallStep);
    add(kStepsField, mLargeStep);
    add(kProportionField, mLayout.proportion);
    add(kValueField, mLayout.value);
    return status == B_OK ? archive->AddInt32(kOrientationField, mOrientation) : status;
}

void BScrollBar::SetValue(float value) {
    value = std::clamp(std::round(value), mLayout.min, mLayout.max);
    if (value != mLayout.value) {
        mLayout.value = value;
        Invalidate();
        ValueChanged(value);
    }
}

void BScrollBar::ValueChanged(float newValue) {
    if (mTarget == nullptr) {
        return;
    }
    BPoint leftTop = mTarget->Bounds().LeftTop();
    (mOrientation == B_HORIZONTAL ? leftTop.x : leftTop.y) = newValue;
    if (leftTop != mTarget->Bounds().LeftTop()) {
        mTarget->ScrollTo(leftTop);
    }
}

void BScrollBar::TargetScrolledTo(float value) {
    // A target may be scrolled to where the bar does not reach; it stays there.
    const float nearest = std::clamp(value, mLayout.min, mLayout.max);
    if (nearest == mLayout.value) {
        return;
    }
    mLayout.value = nearest;
    Invalidate();
    if (nearest == value) {
        ValueChanged(value);
    }
}

void BScrollBar::SetProportion(float proportion) {
    proportion = std::max(0.0F, proportion);
    if (proportion != mLayout.proportion) {
        const ScrollBarLayout before = CurrentLayout();
        mLayout.proportion = proportion;
        InvalidateUnlessItLooksLike(before);
    }
}

void BScrollBar::SetRange(float min, float max) {
    min = std::round(min);
    max = std::round(max);
    if (min > max || (min == mLayout.min && max == mLayout.max)) {
        return;
    }
    const ScrollBarLayout before = CurrentLayout();
    mLayout.min = min;
    mLayout.max = max;
    InvalidateUnlessItLooksLike(before);
    SetValue(mLayout.value);
}

// A list that grows changes its bar with each row, and seldom by a pixel.
void BScrollBar::InvalidateUnlessItLooksLike(const ScrollBarLayout& before) {
    if (!CurrentLayout().LooksLike(before)) {
        Invalidate();
    }
}

void BScrollBar::GetRange(float* min, float* max) const {
    if (min != nullptr) {
        *min = mLayout.min;
    }
    if (max != nullptr) {
        *max = mLayout.max;
    }
}

void BScrollBar::SetSteps(float smallStep, float largeStep) {
    mSmallStep = std::round(smallStep);
    mLargeStep = std::round(largeStep);
}

void BScrollBar::GetSteps(float* smallStep, float* largeStep) const {
    if (smallStep != nullptr) {
        *smallStep = mSmallStep;
    }
    if (largeStep != nullptr) {
        *largeStep = mLargeStep;
    }
}

void BScrollBar::SetTarget(BView* target) {
    const auto barOf = [this](BView* view) -> BScrollBar*& {
        return mOrientation == B_HORIZONTAL ? view->mHorizontalScrollBar : view->mVerticalScrollBar;
    };
    if (mTarget != nullptr) {
        barOf(mTarget) = nullptr;
    }
    mTarget = target;
    mTargetName.clear();
    if (target == nullptr) {
        return;
    }
    if (BScrollBar* const other = barOf(target); other != nullptr) {
        other->ForgetTarget();
    }
    barOf(target) = this;
    TargetScrolledTo(AlongBar(target->Bounds().LeftTop()));
}

void BScrollBar::SetTarget(const char* targetName) {
    SetTarget(static_cast<BView*>(nullptr));
    mTargetName = targetName == nullptr ? "" : targetName;
    if (Window() != nullptr && !mTargetName.empty()) {
        SetTarget(Window()->FindView(mTargetName.c_str()));
    }
}

void BScrollBar::AttachedToWindow() {
    BView::AttachedToWindow();
    if (!mTargetName.empty()) {
        SetTarget(std::string(mTargetName).c_str());
    }
}

void BScrollBar::DetachedFromWindow() {
    StopPressing();
    BView::DetachedFromWindow();
}

void BScrollBar::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    Invalidate();
}

void BScrollBar::GetPreferredSize(float* width, float* height) {
    *width = mOrientation == B_VERTICAL ? B_V_SCROLL_BAR_WIDTH : Bounds().Width();
    *height = mOrientation == B_VERTICAL ? Bounds().Height() : B_H_SCROLL_BAR_HEIGHT;
}

ScrollBarLayout BScrollBar::CurrentLayout() const {
    ScrollBarLayout layout = mLayout;
    const int32 width = Bounds().IntegerWidth() + 1;
    const int32 height = Bounds().IntegerHeight() + 1;
    layout.length = mOrientation == B_HORIZONTAL ? width : height;
    layout.breadth = mOrientation == B_HORIZONTAL ? height : width;
    return layout;
}

BRect BScrollBar::PartRect(int32 start, int32 length) const {
    BRect rect = Bounds();
    const auto first = static_cast<float>(start);
    const auto last = static_cast<float>(start + length - 1);
    if (mOrientation == B_HORIZONTAL) {
        rect.left = first;
        rect.right = last;
    } else {
        rect.top = first;
        rect.bottom = last;
    }
    return rect;
}

void BScrollBar::Draw(BRect /*updateRect*/) {
    const ScrollBarLayout layout = CurrentLayout();
    const int32 button = layout.ButtonLength();
    ControlLook look(this);
    look.Fill(Bounds(), layout.CanScroll() ? ControlLook::kScrollBarTrough : ControlLook::kPanel);
    look.Frame(Bounds(), ControlLook::kShadow);
    DrawButton(PartRect(0, button), false);
    DrawButton(PartRect(layout.length - button, button), true);
    if (layout.ThumbLength() > 0) {
        const BRect thumb =
            look.Frame(PartRect(layout.ThumbStart(), layout.ThumbLength()), ControlLook::kDarkFrame);
        look.Fill(thumb, ControlLook::kPanel);
        look.Bevelled(thumb, ControlLook::Bevel::Raised);
    }
}

void BScrollBar::DrawButton(BRect rect, bool isMore) {
    typedef ControlLook::Direction Direction;
    const bool pressed = mPressed == (isMore ? Part::MoreButton : Part::LessButton);
    ControlLook look(this);
    const BRect face = look.Frame(rect, ControlLook::kShadow);
    look.Fill(face, pressed ? ControlLook::kPressedPanel : ControlLook::kPanel);
    look.Bevelled(face, pressed ? ControlLook::Bevel::Sunken : ControlLook::Bevel::Raised);
    const Direction less = mOrientation == B_HORIZONTAL ? Direction::Left : Direction::Up;
    const Direction more = mOrientation == B_HORIZONTAL ? Direction::Right : Direction::Down;
    look.Arrow(rect, isMore ? more : less, {.enabled = mLayout.CanScroll()});
}

void BScrollBar::MouseDown(BPoint where) {
    if (!mLayout.CanScroll()) {
        return;
    }
    const ScrollBarLayout layout = CurrentLayout();
    mPointer = AlongBar(where);
    mPressed = layout.PartAt(static_cast<int32>(std::floor(mPointer)));
    if (mPressed == Part::None) {
        return;
    }
    // A host without a pointer never sends the events, and never a press either.
    (void)SetMouseEventMask(B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
    if (mPressed == Part::Thumb) {
        mGrabOffset = mPointer - static_cast<float>(layout.ThumbStart());
        return;
    }
    Step();
    StartRepeating();
    Invalidate();
}

void BScrollBar::MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) {
    BView::MouseMoved(where, code, dragMessage);
    mPointer = AlongBar(where);
    if (mPressed == Part::Thumb) {
        SetValue(CurrentLayout().ValueForThumbAt(static_cast<int32>(std::lround(mPointer - mGrabOffset))));
    }
}

void BScrollBar::MouseUp(BPoint where) {
    StopPressing();
    BView::MouseUp(where);
}

void BScrollBar::Step() {
    // The thumb stops where the pointer waits for it, because the pointer then is on another part.
    if (CurrentLayout().PartAt(static_cast<int32>(std::floor(mPointer))) != mPressed) {
        return;
    }
    const float step = mPressed == Part::LessButton || mPressed == Part::MoreButton ? mSmallStep : mLargeStep;
    const bool forward = mPressed == Part::MoreButton || mPressed == Part::TroughBehind;
    SetValue(Value() + (forward ? step : -step));
}

void BScrollBar::StartRepeating() {
    if (Looper() != nullptr) {
        const BMessage repeat(kRepeat);
        mRepeater = std::make_unique<BMessageRunner>(BMessenger(this), &repeat, kFirstRepeat);
    }
}

void BScrollBar::StopPressing() {
    mRepeater.reset();
    if (mPressed != Part::None) {
        mPressed = Part::None;
        Invalidate();
    }
}

void BScrollBar::MessageReceived(BMessage* message) {
    if (message->what == kRepeat) {
        // The last one may have been on its way when the button came up.
        if (mRepeater != nullptr) {
            Step();
            (void)mRepeater->SetInterval(kNextRepeats);
        }
        return;
    }
    float turns = 0;
    const bool vertical =
        message->what == B_MOUSE_WHEEL_CHANGED && message->FindFloat("be:wheel_delta_y", &turns) == B_OK;
    if (vertical && turns != 0) {
        ScrollByWheel(turns);
        return;
    }
    BView::MessageReceived(message);
}

void BScrollBar::ScrollByWheel(float turns) {
    SetValue(Value() + turns * kStepsPerWheelTurn * mSmallStep);
}
