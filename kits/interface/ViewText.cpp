// The part of BView that draws text.
#include <View.h>

#include "DrawingState.h"
#include "LineArray.h"
#include "Utf8Text.h"
#include "ViewHost.h"

#include <algorithm>
#include <cmath>
#include <string.h>
#include <string_view>

namespace {

size_t LengthOf(const char* string, int32 length) {
    if (string == nullptr || length < 0) {
        return 0;
    }
    return strnlen(string, static_cast<size_t>(length));
}

// The logical pixels that text drawn here may touch, with room for overhanging letters.
clipping_rect ReachOfText(BPoint surface, double width, double size) {
    const double margin = size + 2;
    const auto at = [](double value) { return static_cast<int32>(std::clamp(value, -1.0e8, 1.0e8)); };
    return {at(surface.x - margin), at(surface.y - 2 * margin), at(surface.x + width + margin),
            at(surface.y + margin)};
}

} // namespace

void BView::DrawChar(char c) {
    DrawChar(c, mState->penLocation);
}

void BView::DrawChar(char c, BPoint location) {
    DrawText(&c, 1, location, nullptr);
}

void BView::DrawString(const char* string, escapement_delta* delta) {
    DrawString(string, mState->penLocation, delta);
}

void BView::DrawString(const char* string, BPoint location, escapement_delta* delta) {
    if (string != nullptr) {
        DrawText(string, strlen(string), location, delta);
    }
}

void BView::DrawString(const char* string, int32 length, escapement_delta* delta) {
    DrawString(string, length, mState->penLocation, delta);
}

void BView::DrawString(const char* string, int32 length, BPoint location, escapement_delta* delta) {
    if (string != nullptr) {
        DrawText(string, LengthOf(string, length), location, delta);
    }
}

void BView::DrawText(const char* string, size_t length, BPoint location, const escapement_delta* delta) {
    const std::string_view text(string, length);
    const float scale = mState->CombinedScale();
    host::FontSpec font = mState->font.Spec();
    font.size *= scale;
    if (mState->forceFontAliasing) {
        font.antialiased = false;
    }
    Painter* const painter = PreparePainter();
    const Ink ink = MakeInk(B_SOLID_HIGH);
    const auto drawPiece = [&](std::string_view piece, BPoint where) {
        const float width = host::text_width(font, piece);
        if (painter != nullptr) {
            const BPoint surface = ToSurface(where);
            painter->DrawText(font, piece, surface.x, surface.y, ink);
            Changed(*painter, ReachOfText(surface, width, font.size));
        }
        return scale == 0 ? 0.0F : width / scale;
    };
    mState->penLocation = location;
    if (delta == nullptr) {
        mState->penLocation.x += drawPiece(text, location);
        return;
    }
    for (std::string_view rest = text; !rest.empty();) {
        const std::string_view character = rest.substr(0, utf8_char_length(rest));
        mState->penLocation.x += drawPiece(character, mState->penLocation);
        mState->penLocation.x += character == " " ? delta->space : delta->nonspace;
        rest.remove_prefix(character.size());
    }
}
