#include "AlertView.h"

#include "AlertIcon.h"
#include "ControlLook.h"

#include <Bitmap.h>

AlertView::AlertView(const AlertLayout& layout, alert_type type)
    : BView(layout.bounds, "alert", B_FOLLOW_ALL, B_WILL_DRAW), mLayout(layout), mIcon(alert_icon(type)) {
    SetViewColor(ControlLook::kPanel);
}

AlertView::~AlertView() = default;

void AlertView::Draw(BRect /*updateRect*/) {
    if (mIcon != nullptr) {
        ControlLook(this).Fill(mLayout.stripe, tint_color(ControlLook::kPanel, B_DARKEN_1_TINT));
        SetDrawingMode(B_OP_OVER);
        DrawBitmap(mIcon.get(), mLayout.icon);
        SetDrawingMode(B_OP_COPY);
    }
}
