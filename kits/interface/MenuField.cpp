#include <MenuField.h>

#include "ControlLook.h"
#include "MenuFieldBar.h"

#include <Window.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr float kLabelRoom = 4;
// Above and below the text, inside the frame.
constexpr float kHeadRoom = 1;
// Beside the text: the frame, the insets and the arrow.
constexpr float kSideRoom = 28;

} // namespace

BMenuField::BMenuField(BRect frame, const char* name, const char* label, BMenu* menu, uint32 resizingMode,
                       uint32 flags)
    : BMenuField(frame, name, label, menu, false, resizingMode, flags) {}

BMenuField::BMenuField(BRect frame, const char* name, const char* label, BMenu* menu, bool fixedSize,
                       uint32 resizingMode, uint32 flags)
    : BView(frame, name, resizingMode, flags | B_FRAME_EVENTS), mLabel(label == nullptr ? "" : label),
      mMenu(menu), mDivider(label == nullptr ? 0.0F : std::floor(frame.Width() / 2)), mFixedSize(fixedSize) {
    SetViewColor(ControlLook::kPanel);
    SetLowColor(ControlLook::kPanel);
    mBar = new MenuFieldBar(BRect(0, 0, 10, 10), this);
    mBar->AddItem(new MenuFieldItem(menu, this));
    AddChild(mBar);
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceBar();
}

BMenuField::~BMenuField() = default;

BMenuBar* BMenuField::MenuBar() const {
    return mBar;
}

BMenuItem* BMenuField::MenuItem() const {
    return mBar->ItemAt(0);
}

void BMenuField::AttachedToWindow() {
    BView::AttachedToWindow();
    if (Parent() != nullptr) {
        SetViewColor(Parent()->ViewColor());
    }
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceBar();
}

float BMenuField::NeededHeight() const {
    BFont font;
    GetFont(&font);
    return ControlLook::LineHeight(font) + 2 * (kHeadRoom + ControlLook::kButtonFrameWidth) - 1;
}

float BMenuField::FieldWidthFor(const char* text) const {
    BFont font;
    GetFont(&font);
    return std::ceil(font.StringWidth(text)) + kSideRoom;
}

BRect BMenuField::FieldRect() const {
    BRect field = Bounds();
    field.left = std::min(field.left + mDivider, field.right);
    if (!mFixedSize) {
        // As wide as the widest of what it may show.
        float width = FieldWidthFor(MenuItem()->Label());
        for (int32 i = 0; mMenu->IsLabelFromMarked() && i < mMenu->CountItems(); ++i) {
            width = std::max(width, FieldWidthFor(mMenu->ItemAt(i)->Label()));
        }
        field.right = std::min(field.right, field.left + width);
    }
    return field;
}

void BMenuField::PlaceBar() {
    const BRect field = FieldRect();
    mBar->MoveTo(field.LeftTop());
    mBar->ResizeTo(field.Width(), field.Height());
    mBar->InvalidateLayout();
}

bool BMenuField::ShowsFocus() const {
    return IsFocus() && (Window() == nullptr || Window()->IsActive());
}

void BMenuField::Draw(BRect /*updateRect*/) {
    if (mDivider <= 0) {
        return;
    }
    const BRect label(0, 0, mDivider - 1 - kLabelRoom, Bounds().bottom);
    ControlLook(this).Label(Label(), label, mAlignment, {.enabled = mEnabled});
}

void BMenuField::MouseDown(BPoint where) {
    // On the label, or beside the menu.
    if (!mEnabled) {
        return;
    }
    if (!IsFocus() && (Flags() & B_NAVIGABLE) != 0) {
        MakeFocus();
    }
    if (where.x < mDivider) {
        OpenMenu();
    }
}

void BMenuField::KeyDown(const char* bytes, int32 numBytes) {
    const char key = numBytes == 1 ? *bytes : '\0';
    if (mEnabled && (key == B_SPACE || key == B_RETURN || key == B_DOWN_ARROW)) {
        OpenMenu();
        return;
    }
    BView::KeyDown(bytes, numBytes);
}

void BMenuField::OpenMenu() {
    if (Window() != nullptr && mBar->mSession == nullptr) {
        mBar->StartByKey(MenuItem(), true);
    }
}

void BMenuField::MakeFocus(bool focus) {
    const bool before = IsFocus();
    BView::MakeFocus(focus);
    if (IsFocus() != before) {
        mBar->Invalidate();
    }
}

void BMenuField::WindowActivated(bool active) {
    BView::WindowActivated(active);
    mBar->Invalidate();
}

void BMenuField::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    PlaceBar();
    Invalidate();
}

void BMenuField::SetFont(const BFont* font, uint32 mask) {
    BView::SetFont(font, mask);
    mBar->SetFont(font, mask);
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceBar();
    Invalidate();
}

void BMenuField::GetPreferredSize(float* width, float* height) {
    BFont font;
    GetFont(&font);
    const float label = mLabel.empty() ? 0.0F : std::ceil(font.StringWidth(Label())) + kLabelRoom;
    float field = FieldWidthFor(MenuItem()->Label());
    for (int32 i = 0; i < mMenu->CountItems(); ++i) {
        field = std::max(field, FieldWidthFor(mMenu->ItemAt(i)->Label()));
    }
    *width = std::max(mDivider, label) + field;
    *height = NeededHeight();
}

void BMenuField::SetLabel(const char* label) {
    mLabel = label == nullptr ? "" : label;
    Invalidate();
}

void BMenuField::SetEnabled(bool enabled) {
    if (enabled == mEnabled) {
        return;
    }
    mEnabled = enabled;
    MenuItem()->SetEnabled(enabled);
    if (!enabled && IsFocus()) {
        MakeFocus(false);
    }
    Invalidate();
    mBar->Invalidate();
}

void BMenuField::SetAlignment(alignment label) {
    mAlignment = label;
    Invalidate();
}

void BMenuField::SetDivider(float position) {
    position = std::round(std::max(0.0F, position));
    if (position != mDivider) {
        mDivider = position;
        PlaceBar();
        Invalidate();
    }
}

void BMenuField::SetMarkerShown(bool shown) {
    mMarkerShown = shown;
    mBar->Invalidate();
}
