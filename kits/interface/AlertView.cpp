#include "AlertView.h"

#include "AlertIcon.h"
#include "ControlLook.h"

#include <Bitmap.h>

#include <cmath>

AlertView::AlertView(const AlertLayout& layout, alert_type type, std::vector<std::string> lines)
    : BView(layout.bounds, "alert", B_FOLLOW_ALL, B_WILL_DRAW), mLayout(layout), mLines(std::move(lines)),
      mIcon(alert_icon(type)) {
    SetViewColor(ControlLook::kPanel);
}

AlertView::~AlertView() = default;

void AlertView::Draw(BRect /*updateRect*/) {
    if (mIcon != nullptr) {
        ControlLook(this).Fill(mLayout.stripe, tint_color(ControlLook::kPanel, B_DARKEN_1_TINT));
        SetDrawingMode(B_OP_OVER);
        DrawBitmap(mIcon.get(), mLayout.icon);
    }
    BFont font;
    GetFont(&font);
    font_height height;
    font.GetHeight(&height);
    SetDrawingMode(B_OP_OVER);
    SetHighColor(ControlLook::kText);
    float top = mLayout.text.top;
    for (const std::string& line : mLines) {
        DrawString(line.c_str(), BPoint(mLayout.text.left, top + std::ceil(height.ascent)));
        top += ControlLook::LineHeight(font);
    }
    SetDrawingMode(B_OP_COPY);
}
