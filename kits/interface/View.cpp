#include <View.h>

#include "DrawingState.h"
#include "LineArray.h"
#include "ViewHost.h"

#include <Message.h>
#include <ScrollBar.h>

#include <algorithm>
#include <string.h>

namespace {

constexpr char kFrameField[] = "_frame";
constexpr char kResizeField[] = "_resize_mode";
constexpr char kFlagsField[] = "_flags";
constexpr char kColorField[] = "_color";
constexpr char kOriginField[] = "_orig";
constexpr char kViewsField[] = "_views";

int32 ColorToInt(rgb_color color) {
    return static_cast<int32>(to_pixel(color));
}

rgb_color IntToColor(int32 value) {
    return to_color(static_cast<pixel32>(value));
}

} // namespace

REGISTER_ARCHIVABLE(BView);

BView::BView(BRect frame, const char* name, uint32 resizingMode, uint32 flags)
    : BHandler(name), mState(std::make_unique<DrawingState>()) {
    SetParts(frame, resizingMode, flags);
}

BView::BView(BMessage* archive) : BHandler(archive), mState(std::make_unique<DrawingState>()) {
    BRect frame(0, 0, 0, 0);
    int32 resizingMode = 0;
    int32 flags = 0;
    if (archive == nullptr) {
        SetParts(frame, 0, 0);
        return;
    }
    // A field that is missing leaves the value of a new view.
    (void)archive->FindRect(kFrameField, &frame);
    (void)archive->FindInt32(kResizeField, &resizingMode);
    (void)archive->FindInt32(kFlagsField, &flags);
    SetParts(frame, static_cast<uint32>(resizingMode), static_cast<uint32>(flags));
    int32 color = 0;
    if (archive->FindInt32(kColorField, 0, &color) == B_OK) {
        mState->high = IntToColor(color);
    }
    if (archive->FindInt32(kColorField, 1, &color) == B_OK) {
        mState->low = IntToColor(color);
    }
    if (archive->FindInt32(kColorField, 2, &color) == B_OK) {
        mViewColor = IntToColor(color);
    }
    BPoint origin;
    if (archive->FindPoint(kOriginField, &origin) == B_OK) {
        mState->origin = origin;
    }
    BMessage childArchive;
    for (int32 i = 0; archive->FindMessage(kViewsField, i, &childArchive) == B_OK; ++i) {
        BArchivable* const object = instantiate_object(&childArchive);
        if (auto* const child = dynamic_cast<BView*>(object); child != nullptr) {
            AddChild(child);
        } else {
            delete object;
        }
    }
}

BView::~BView() {
    for (BScrollBar* const bar : {mHorizontalScrollBar, mVerticalScrollBar}) {
        if (bar != nullptr) {
            bar->ForgetTarget();
        }
    }
    RemoveSelf();
    while (!mChildren.empty()) {
        BView* const child = mChildren.back();
        RemoveChild(child);
        delete child;
    }
}

BArchivable* BView::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BView") ? new BView(archive) : nullptr;
}

status_t BView::Archive(BMessage* archive, bool deep) const {
    status_t status = BHandler::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddRect(kFrameField, Frame());
    }
    if (status == B_OK) {
        status = archive->AddInt32(kResizeField, static_cast<int32>(mResizingMode));
    }
    if (status == B_OK) {
        status = archive->AddInt32(kFlagsField, static_cast<int32>(mFlags));
    }
    for (const rgb_color color : {mState->high, mState->low, mViewColor}) {
        if (status == B_OK) {
            status = archive->AddInt32(kColorField, ColorToInt(color));
        }
    }
    if (status == B_OK && Origin() != B_ORIGIN) {
        status = archive->AddPoint(kOriginField, Origin());
    }
    for (size_t i = 0; deep && status == B_OK && i < mChildren.size(); ++i) {
        BMessage childArchive;
        status = mChildren[i]->Archive(&childArchive, deep);
        if (status == B_OK) {
            status = archive->AddMessage(kViewsField, &childArchive);
        }
    }
    return status;
}

void BView::SetParts(BRect frame, uint32 resizingMode, uint32 flags) {
    mPosition = frame.LeftTop();
    mBounds = frame.OffsetToCopy(B_ORIGIN);
    mResizingMode = resizingMode;
    mFlags = flags;
}

void BView::AttachedToWindow() {}
void BView::AllAttached() {}
void BView::DetachedFromWindow() {}
void BView::AllDetached() {}

void BView::MessageReceived(BMessage* message) {
    if (message->what == B_MOUSE_WHEEL_CHANGED &&
        (mHorizontalScrollBar != nullptr || mVerticalScrollBar != nullptr)) {
        float turns = 0;
        if (mHorizontalScrollBar != nullptr && message->FindFloat("be:wheel_delta_x", &turns) == B_OK) {
            mHorizontalScrollBar->ScrollByWheel(turns);
        }
        if (mVerticalScrollBar != nullptr && message->FindFloat("be:wheel_delta_y", &turns) == B_OK) {
            mVerticalScrollBar->ScrollByWheel(turns);
        }
        return;
    }
    BHandler::MessageReceived(message);
}

void BView::AddChild(BView* child, BView* before) {
    if (child == nullptr || child == this || child->mParent != nullptr || child->mHost != nullptr) {
        return;
    }
    const auto place =
        before == nullptr ? mChildren.end() : std::find(mChildren.begin(), mChildren.end(), before);
    mChildren.insert(place, child);
    child->mParent = this;
    if (mHost != nullptr) {
        child->AttachTree(mHost);
        GeometryChanged();
        child->AnnounceAttached();
        child->Invalidate();
    }
}

bool BView::RemoveChild(BView* child) {
    const auto found = std::find(mChildren.begin(), mChildren.end(), child);
    if (found == mChildren.end()) {
        return false;
    }
    if (mHost != nullptr) {
        Invalidate(child->Frame());
        child->AnnounceDetached();
        child->DetachTree();
    }
    child->mParent = nullptr;
    mChildren.erase(std::find(mChildren.begin(), mChildren.end(), child));
    GeometryChanged();
    return true;
}

int32 BView::CountChildren() const {
    return static_cast<int32>(mChildren.size());
}

BView* BView::ChildAt(int32 index) const {
    return index < 0 || index >= CountChildren() ? nullptr : mChildren[static_cast<size_t>(index)];
}

BView* BView::NextSibling() const {
    if (mParent == nullptr) {
        return nullptr;
    }
    const auto& all = mParent->mChildren;
    const auto next = std::find(all.begin(), all.end(), this) + 1;
    return next == all.end() ? nullptr : *next;
}

BView* BView::PreviousSibling() const {
    if (mParent == nullptr || mParent->mChildren.front() == this) {
        return nullptr;
    }
    return *(std::find(mParent->mChildren.begin(), mParent->mChildren.end(), this) - 1);
}

BView* BView::FindView(const char* name) const {
    if (name == nullptr) {
        return nullptr;
    }
    if (Name() != nullptr && strcmp(Name(), name) == 0) {
        // The API hands out views for use, whatever it was asked through.
        return const_cast<BView*>(this);
    }
    for (const BView* child : mChildren) {
        if (BView* const found = child->FindView(name); found != nullptr) {
            return found;
        }
    }
    return nullptr;
}

void BView::Draw(BRect /*updateRect*/) {}
void BView::DrawAfterChildren(BRect /*updateRect*/) {}
void BView::MouseDown(BPoint /*where*/) {}
void BView::MouseUp(BPoint /*where*/) {}
void BView::MouseMoved(BPoint /*where*/, uint32 /*code*/, const BMessage* /*dragMessage*/) {}
void BView::WindowActivated(bool /*active*/) {}

void BView::KeyDown(const char* bytes, int32 numBytes) {
    if (mHost != nullptr) {
        // Nobody else is asked when the host has no use for it either.
        (void)mHost->UnusedKey(this, bytes, numBytes);
    }
}

void BView::KeyUp(const char* /*bytes*/, int32 /*numBytes*/) {}
void BView::Pulse() {}
void BView::FrameMoved(BPoint /*newPosition*/) {}
void BView::FrameResized(float /*newWidth*/, float /*newHeight*/) {}
void BView::TargetedByScrollView(BScrollView* /*scrollView*/) {}

void BView::Show() {
    --mHideCount;
    GeometryChanged();
    Invalidate();
}

void BView::Hide() {
    ++mHideCount;
    GeometryChanged();
    if (mParent != nullptr) {
        mParent->Invalidate(Frame());
    }
}

bool BView::IsHidden() const {
    return IsHidden(nullptr);
}

bool BView::IsHidden(const BView* lookingFrom) const {
    for (const BView* view = this; view != nullptr && view != lookingFrom; view = view->mParent) {
        if (view->mHideCount > 0) {
            return true;
        }
    }
    return false;
}

void BView::SetFlags(uint32 flags) {
    mFlags = flags;
    if (mHost != nullptr) {
        mHost->ViewFlagsChanged(this);
    }
}

void BView::SetResizingMode(uint32 mode) {
    mResizingMode = mode;
}
