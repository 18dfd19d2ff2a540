#include "ControlLook.h"

#include <Font.h>
#include <String.h>
#include <View.h>

#include <algorithm>
#include <cmath>

ControlLook::ControlLook(BView* view)
    : mView(view), mHigh(view->HighColor()), mLow(view->LowColor()), mMode(view->DrawingMode()),
      mPenSize(view->PenSize()), mPen(view->PenLocation()) {
    mView->SetDrawingMode(B_OP_COPY);
    mView->SetPenSize(1);
}

ControlLook::~ControlLook() {
    mView->SetHighColor(mHigh);
    mView->SetLowColor(mLow);
    mView->SetDrawingMode(mMode);
    mView->SetPenSize(mPenSize);
    mView->MovePenTo(mPen);
}

void ControlLook::Fill(BRect rect, rgb_color color) {
    if (rect.IsValid()) {
        mView->SetHighColor(color);
        mView->FillRect(rect);
    }
}

BRect ControlLook::Frame(BRect rect, rgb_color color) {
    if (rect.IsValid()) {
        mView->SetHighColor(color);
        mView->StrokeRect(rect);
    }
    return rect.InsetByCopy(1, 1);
}

BRect ControlLook::Bevelled(BRect rect, Bevel bevel) {
    if (rect.IsValid()) {
        const rgb_color leftTop = bevel == Bevel::Raised ? kShine : kShadow;
        const rgb_color rightBottom = bevel == Bevel::Raised ? kShadow : kShine;
        mView->BeginLineArray(4);
        mView->AddLine(rect.LeftBottom(), rect.LeftTop(), leftTop);
        mView->AddLine(rect.LeftTop(), rect.RightTop(), leftTop);
        // The two corners where the light meets the shadow belong to the shadow's side.
        mView->AddLine(rect.RightTop(), rect.RightBottom(), rightBottom);
        mView->AddLine(rect.RightBottom(), rect.LeftBottom(), rightBottom);
        mView->EndLineArray();
    }
    return rect.InsetByCopy(1, 1);
}

BRect ControlLook::FieldFrame(BRect rect, ControlState state) {
    const BRect inside = Bevelled(rect, Bevel::Sunken);
    if (!state.enabled) {
        return Frame(inside, kDisabledFrame);
    }
    return Frame(inside, state.focused ? kFocus : kDarkFrame);
}

BRect ControlLook::ButtonFrame(BRect rect, ControlState state) {
    const bool pressed = state.enabled && state.pressed;
    const rgb_color frame = state.enabled ? kDarkFrame : kDisabledFrame;
    BRect inside = Frame(rect, frame);
    if (state.isDefault) {
        // The second line takes the place of nothing: a button is as large with it as without.
        Frame(inside, frame);
    } else {
        Fill(inside, kPanel);
    }
    inside.InsetBy(1, 1);
    Fill(inside, pressed ? kPressedPanel : kPanel);
    const BRect face = Bevelled(inside, pressed ? Bevel::Sunken : Bevel::Raised);
    if (state.enabled && state.focused) {
        Frame(face.InsetByCopy(1, 1), kFocus);
    }
    return face;
}

void ControlLook::Separator(float left, float right, float y) {
    mView->BeginLineArray(2);
    mView->AddLine(BPoint(left, y), BPoint(right, y), kShadow);
    mView->AddLine(BPoint(left, y + 1), BPoint(right, y + 1), kShine);
    mView->EndLineArray();
}

void ControlLook::LabelInColor(const char* text, BRect rect, alignment align, rgb_color color) {
    if (text == nullptr || *text == '\0' || !rect.IsValid()) {
        return;
    }
    BFont font;
    mView->GetFont(&font);
    const float available = rect.Width() + 1;
    BString shown(text);
    float width = font.StringWidth(text);
    if (width > available) {
        font.TruncateString(&shown, B_TRUNCATE_END, available);
        width = font.StringWidth(shown.String());
    }
    float x = rect.left;
    if (align == B_ALIGN_RIGHT) {
        x = rect.right + 1 - width;
    } else if (align == B_ALIGN_CENTER) {
        x = rect.left + (available - width) / 2;
    }
    mView->SetHighColor(color);
    mView->SetDrawingMode(B_OP_OVER); // mixes with whatever the label stands on
    mView->DrawString(shown.String(), BPoint(std::floor(x), Baseline(font, rect)));
    mView->SetDrawingMode(B_OP_COPY);
}

void ControlLook::Arrow(BRect rect, Direction direction, ControlState state) {
    // Rows of 1, 3, 5, .. pixels; half as many rows as the widest is wide.
    const float extent = std::min(rect.Width(), rect.Height()) + 1;
    const float rows = std::clamp(std::floor(extent / 3), 2.0F, 5.0F);
    const BPoint middle(std::floor((rect.left + rect.right) / 2), std::floor((rect.top + rect.bottom) / 2));
    const bool vertical = direction == Direction::Up || direction == Direction::Down;
    const float towards = direction == Direction::Left || direction == Direction::Up ? 1.0F : -1.0F;
    const BPoint tip = vertical ? BPoint(middle.x, middle.y - towards * std::floor(rows / 2))
                                : BPoint(middle.x - towards * std::floor(rows / 2), middle.y);
    mView->SetHighColor(TextColor(state));
    for (float row = 0; row < rows; ++row) {
        const BPoint across = vertical ? BPoint(row, 0) : BPoint(0, row);
        const BPoint along = vertical ? BPoint(0, towards * row) : BPoint(towards * row, 0);
        mView->StrokeLine(tip + along - across, tip + along + across);
    }
}

void ControlLook::CheckMark(BRect rect, ControlState state) {
    const BPoint middle(std::floor((rect.left + rect.right) / 2), std::floor((rect.top + rect.bottom) / 2));
    mView->SetHighColor(TextColor(state));
    for (float thickness = 0; thickness < 2; ++thickness) {
        const BPoint low = middle + BPoint(-1, 2 - thickness);
        mView->StrokeLine(low + BPoint(-2, -2), low);
        mView->StrokeLine(low, low + BPoint(4, -4));
    }
}

void ControlLook::RoundMark(BRect square, bool on, ControlState state) {
    const rgb_color page = state.enabled ? kDocument : kDisabledDocument;
    mView->SetHighColor(state.enabled && state.pressed ? kPressedPanel : page);
    mView->FillEllipse(square);
    mView->SetHighColor(state.enabled ? kDarkFrame : kDisabledFrame);
    mView->StrokeEllipse(square);
    if (on) {
        mView->SetHighColor(TextColor(state));
        mView->FillEllipse(square.InsetByCopy(4, 4));
    }
}

float ControlLook::LineHeight(const BFont& font) {
    font_height height;
    font.GetHeight(&height);
    return std::ceil(height.ascent) + std::ceil(height.descent);
}

float ControlLook::Baseline(const BFont& font, BRect rect) {
    font_height height;
    font.GetHeight(&height);
    const float spare = rect.Height() + 1 - LineHeight(font);
    return std::floor(rect.top + spare / 2) + std::ceil(height.ascent);
}
