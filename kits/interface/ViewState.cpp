// The part of BView that keeps the drawing state.
#include <View.h>

#include "DrawingState.h"
#include "LineArray.h"
#include "Shapes.h"
#include "ViewHost.h"

#include <algorithm>

void BView::SetViewColor(uchar red, uchar green, uchar blue, uchar alpha) {
    SetViewColor(make_color(red, green, blue, alpha));
}

void BView::SetViewColor(rgb_color color) {
    if (color != mViewColor) {
        mViewColor = color;
        Invalidate();
    }
}

void BView::PushState() {
    mPushedStates.push_back(*mState);
    *mState = mState->Pushed();
}

void BView::PopState() {
    if (mPushedStates.empty()) {
        return;
    }
    *mState = std::move(mPushedStates.back());
    mPushedStates.pop_back();
    mClipKnown = false;
}

void BView::SetOrigin(float x, float y) {
    mState->origin.Set(x, y);
}

BPoint BView::Origin() const {
    return mState->origin;
}

void BView::SetScale(float scale) const {
    mState->scale = scale;
}

float BView::Scale() const {
    return mState->scale;
}

void BView::SetHighColor(uchar red, uchar green, uchar blue, uchar alpha) {
    SetHighColor(make_color(red, green, blue, alpha));
}

void BView::SetHighColor(rgb_color color) {
    mState->high = color;
}

rgb_color BView::HighColor() const {
    return mState->high;
}

void BView::SetLowColor(uchar red, uchar green, uchar blue, uchar alpha) {
    SetLowColor(make_color(red, green, blue, alpha));
}

void BView::SetLowColor(rgb_color color) {
    mState->low = color;
}

rgb_color BView::LowColor() const {
    return mState->low;
}

void BView::SetDrawingMode(drawing_mode mode) {
    mState->mode = mode;
}

drawing_mode BView::DrawingMode() const {
    return mState->mode;
}

void BView::SetBlendingMode(source_alpha alphaSource, alpha_function alphaFunction) {
    mState->alphaSource = alphaSource;
    mState->alphaFunction = alphaFunction;
}

void BView::GetBlendingMode(source_alpha* alphaSource, alpha_function* alphaFunction) const {
    if (alphaSource != nullptr) {
        *alphaSource = mState->alphaSource;
    }
    if (alphaFunction != nullptr) {
        *alphaFunction = mState->alphaFunction;
    }
}

void BView::SetPenSize(float size) {
    mState->penSize = size;
}

float BView::PenSize() const {
    return mState->penSize;
}

void BView::SetLineMode(cap_mode lineCap, join_mode lineJoin, float miterLimit) {
    mState->lineCap = lineCap;
    mState->lineJoin = lineJoin;
    mState->miterLimit = miterLimit;
}

cap_mode BView::LineCapMode() const {
    return mState->lineCap;
}

join_mode BView::LineJoinMode() const {
    return mState->lineJoin;
}

float BView::LineMiterLimit() const {
    return mState->miterLimit;
}

void BView::SetFont(const BFont* font, uint32 mask) {
    if (font == nullptr) {
        return;
    }
    BFont& own = mState->font;
    if ((mask & B_FONT_ALL) == B_FONT_ALL) {
        own = *font;
        return;
    }
    if ((mask & B_FONT_FAMILY_AND_STYLE) != 0) {
        own.SetFamilyAndStyle(font->FamilyAndStyle());
    }
    if ((mask & B_FONT_SIZE) != 0) {
        own.SetSize(font->Size());
    }
    if ((mask & B_FONT_SHEAR) != 0) {
        own.SetShear(font->Shear());
    }
    if ((mask & B_FONT_ROTATION) != 0) {
        own.SetRotation(font->Rotation());
    }
    if ((mask & B_FONT_SPACING) != 0) {
        own.SetSpacing(font->Spacing());
    }
    if ((mask & B_FONT_ENCODING) != 0) {
        own.SetEncoding(font->Encoding());
    }
    if ((mask & B_FONT_FACE) != 0) {
        own.SetFace(font->Face());
    }
    if ((mask & B_FONT_FLAGS) != 0) {
        own.SetFlags(font->Flags());
    }
}

void BView::GetFont(BFont* font) const {
    *font = mState->font;
}

void BView::SetFontSize(float size) {
    BFont font(mState->font);
    font.SetSize(size);
    SetFont(&font, B_FONT_SIZE);
}

void BView::ForceFontAliasing(bool enable) {
    mState->forceFontAliasing = enable;
}

void BView::GetFontHeight(font_height* height) const {
    mState->font.GetHeight(height);
}

void BView::ConstrainClippingRegion(BRegion* region) {
    if (region == nullptr) {
        mState->clip.reset();
    } else {
        mState->clip = mState->ToView(*region);
    }
    mClipKnown = false;
}

void BView::GetClippingRegion(BRegion* region) const {
    if (region == nullptr) {
        return;
    }
    *region = VisibleRegion(Covered::WithoutChildren);
    if (const BRegion* const limit = mHost == nullptr ? nullptr : mHost->DrawingLimit(); limit != nullptr) {
        BRegion updated = *limit;
        const BPoint origin = ConvertToSurface(B_ORIGIN);
        updated.OffsetBy(-to_pixel_coordinate(origin.x), -to_pixel_coordinate(origin.y));
        region->IntersectWith(&updated);
    }
    if (const std::optional<BRegion> own = mState->CombinedClip(); own) {
        region->IntersectWith(&*own);
    }
}

float BView::StringWidth(const char* string) const {
    return mState->font.StringWidth(string);
}

float BView::StringWidth(const char* string, int32 length) const {
    return mState->font.StringWidth(string, length);
}

void BView::GetStringWidths(char* stringArray[], int32 lengthArray[], int32 numStrings,
                            float widthArray[]) const {
    for (int32 i = 0; i < numStrings; ++i) {
        widthArray[i] = StringWidth(stringArray[i], lengthArray == nullptr ? -1 : lengthArray[i]);
    }
}

void BView::TruncateString(BString* inOut, uint32 mode, float width) const {
    mState->font.TruncateString(inOut, mode, width);
}

void BView::MovePenTo(BPoint where) {
    mState->penLocation = where;
}

void BView::MovePenBy(float x, float y) {
    mState->penLocation += BPoint(x, y);
}

BPoint BView::PenLocation() const {
    return mState->penLocation;
}
