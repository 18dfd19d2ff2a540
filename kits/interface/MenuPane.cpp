#include "MenuPane.h"

#include <algorithm>

MenuPane::MenuPane(BRect frame, float contentHeight, Border border)
    : mFrame(frame), mContentHeight(contentHeight), mBorder(border == Border::Drawn ? kBorder : 0) {}

float MenuPane::InnerHeight() const {
    return mFrame.Height() - 2 * mBorder;
}

bool MenuPane::Scrolls() const {
    return mContentHeight > InnerHeight();
}

BRect MenuPane::ItemArea() const {
    BRect area = mFrame.InsetByCopy(mBorder, mBorder);
    if (Scrolls()) {
        area.InsetBy(0, kStripHeight);
    }
    return area;
}

BRect MenuPane::UpStrip() const {
    if (!Scrolls()) {
        return {};
    }
    const BRect inner = mFrame.InsetByCopy(mBorder, mBorder);
    return {inner.left, inner.top, inner.right, inner.top + kStripHeight - 1};
}

BRect MenuPane::DownStrip() const {
    if (!Scrolls()) {
        return {};
    }
    const BRect inner = mFrame.InsetByCopy(mBorder, mBorder);
    return {inner.left, inner.bottom - kStripHeight + 1, inner.right, inner.bottom};
}

float MenuPane::GreatestOffset() const {
    return Scrolls() ? std::max(mContentHeight - ItemArea().Height(), 0.0F) : 0;
}

MenuPane::Zone MenuPane::ZoneAt(BPoint where) const {
    if (!mFrame.Contains(where)) {
        return Zone::Outside;
    }
    if (ItemArea().Contains(where)) {
        return Zone::Items;
    }
    if (UpStrip().Contains(where)) {
        return Zone::ScrollUp;
    }
    return DownStrip().Contains(where) ? Zone::ScrollDown : Zone::Border;
}

BPoint MenuPane::ToMenu(BPoint where) const {
    const BRect area = ItemArea();
    return {where.x - area.left, where.y - area.top + mOffset};
}

BRect MenuPane::ToScreen(BRect inTheMenu) const {
    const BRect area = ItemArea();
    return inTheMenu.OffsetByCopy(area.left, area.top - mOffset);
}

bool MenuPane::ScrollBy(float distance) {
    const float before = mOffset;
    mOffset = std::clamp(mOffset + distance, 0.0F, GreatestOffset());
    return mOffset != before;
}

bool MenuPane::Reveal(BRect inTheMenu) {
    if (inTheMenu.top < mOffset) {
        return ScrollBy(inTheMenu.top - mOffset);
    }
    const float lowest = mOffset + ItemArea().Height();
    return inTheMenu.bottom > lowest && ScrollBy(inTheMenu.bottom - lowest);
}
