#include "gui/ColumnListView/CLVColumn.h"

#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/ColumnLayout.h"
#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/PixelMove.h"
#include "gui/ColumnListView/TruncatedString.h"

#include <Font.h>
#include <View.h>
#include <Window.h>

#include <algorithm>
#include <vector>

namespace {

constexpr float kExpanderWidth = 20;
constexpr float kNarrowest = 4;
constexpr unsigned long kKeptByExpander =
    CLV_COLUMN_NOT_MOVABLE | CLV_COLUMN_LOCK_AT_START | CLV_COLUMN_HIDDEN | CLV_COLUMN_LOCK_WITH_RIGHT;
constexpr unsigned long kForcedOnExpander =
    CLV_COLUMN_NOT_RESIZABLE | CLV_COLUMN_MERGE_WITH_RIGHT | CLV_COLUMN_EXPANDER;

// From a header cell's left edge to its label, and what both sides of it take.
constexpr float kLabelIndent = 8;
constexpr float kLabelMargins = 15;
constexpr BRect kNowhere(-1, -1, -1, -1);
constexpr rgb_color kLabelBlack = {0, 0, 0, 255};
constexpr rgb_color kLabelPressed = {0, 0, 229, 255};

std::string Truncated(const std::string& label, float columnWidth) {
    std::vector<char> out(label.size() + 3);
    GetTruncatedString(label.c_str(), out.data(), columnWidth - kLabelMargins);
    return out.data();
}

// The bytes that two labels begin with in common, no character divided.
size_t CommonBeginning(const std::string& a, const std::string& b) {
    auto length =
        static_cast<size_t>(std::mismatch(a.begin(), a.end(), b.begin(), b.end()).first - a.begin());
    while (length > 0 && length < a.size() && (static_cast<unsigned char>(a[length]) & 0xC0) == 0x80) {
        --length;
    }
    return length;
}

void InvalidateStrip(BView* view, float left, float right) {
    const BRect bounds = view->Bounds();
    const BRect strip(std::max(left, bounds.left), bounds.top, std::min(right, bounds.right), bounds.bottom);
    if (strip.IsValid()) {
        view->Invalidate(strip);
    }
}

void InvalidateIfValid(BView* view, BRect rect) {
    if (rect.IsValid()) {
        view->Invalidate(rect);
    }
}

// Whether everything is drawn, as the columns lie now.
bool BringUpToDate(BWindow* window) {
    if (window == nullptr) {
        return true;
    }
    window->UpdateIfNeeded();
    return !window->NeedsUpdate();
}

void MovePixels(BView* view, float oldEnd, float growth, bool upToDate) {
    if (!upToDate) {
        // What is not drawn yet must not be moved away from where it will be.
        InvalidateStrip(view, std::min(oldEnd, oldEnd + growth) + 1, view->Bounds().right);
        return;
    }
    const PixelMove move = PixelMoveFor(view->Bounds(), oldEnd, growth);
    if (move.target.IsValid()) {
        view->CopyBits(move.source, move.target);
    }
    InvalidateIfValid(view, move.exposed);
    InvalidateIfValid(view, move.rightEdge);
}

} // namespace

CLVColumn::CLVColumn(const char* label, float width, unsigned long flags, float min_width)
    : mWidth(width), mMinWidth(min_width), mFlags(flags) {
    if ((flags & CLV_COLUMN_EXPANDER) != 0) {
        // What else an expander is given is dropped on purpose: it is no sort key, keeps its width, and is
        // never locked at the end.
        label = nullptr;
        mWidth = kExpanderWidth;
        mMinWidth = kExpanderWidth;
        mFlags = (flags & kKeptByExpander) | kForcedOnExpander;
    }
    mMinWidth = std::max(mMinWidth, kNarrowest);
    mWidth = std::max(mWidth, mMinWidth);
    if (label != nullptr) {
        mHasLabel = true;
        mLabel = label;
        mTruncatedLabel = Truncated(mLabel, mWidth);
    }
}

CLVColumn::~CLVColumn() {
    if (mParent != nullptr) {
        mParent->AssertWindowLocked();
        mParent->RemoveColumn(this);
    }
}

BView* CLVColumn::GetHeaderView() const {
    return mParent == nullptr ? nullptr : mParent->HeaderView();
}

BRect CLVColumn::TruncateText(float column_width) {
    const std::string truncated = Truncated(mLabel, column_width);
    if (!mHasLabel || truncated == mTruncatedLabel) {
        return kNowhere;
    }
    BRect changed = mHeaderFrame;
    if (changed != kNowhere) {
        const std::string kept = truncated.substr(0, CommonBeginning(truncated, mTruncatedLabel));
        const BView* const header = GetHeaderView();
        changed.left += kLabelIndent + (header == nullptr ? be_plain_font->StringWidth(kept.c_str())
                                                          : header->StringWidth(kept.c_str()));
    }
    mTruncatedLabel = truncated;
    return changed;
}

void CLVColumn::SetWidth(float new_width) {
    if (mParent != nullptr) {
        mParent->AssertWindowLocked();
    }
    new_width = std::max(new_width, mMinWidth);
    if (new_width == mWidth) {
        return;
    }
    const float growth = new_width - mWidth;
    mWidth = new_width;
    if (mParent == nullptr) {
        return;
    }
    if (IsShown()) {
        ShowWidthChange(growth);
    }
    mParent->ColumnWidthChanged(mParent->IndexOfColumn(this), new_width);
}

void CLVColumn::ShowWidthChange(float growth) {
    CLVColumnLabelView* const header = mParent->HeaderView();
    // Once for both views: what the first has moved must not be drawn before the columns are laid out anew.
    const bool upToDate = BringUpToDate(mParent->Window());
    if ((mFlags & CLV_COLUMN_HEADER_TRUNCATE) != 0) {
        // The whole label, as an ellipsis may draw the letter before it nearer, or change its shape.
        if (TruncateText(mWidth) != kNowhere) {
            InvalidateIfValid(header, mHeaderFrame);
        }
    }
    const float oldEnd = mColumnEnd;
    MovePixels(header, oldEnd, growth, upToDate);
    MovePixels(mParent, oldEnd, growth, upToDate);
    const float border = std::min(oldEnd, oldEnd + growth);
    InvalidateStrip(header, border, border);
    mParent->UpdateColumnSizesDataRectSizeScrollBars(false);
    header->UpdateDragGroups();
    if (IsExpander() || mPushedByExpander) {
        InvalidatePushedCells();
    }
}

// Rows of deeper levels have these cells further right, where the pixels were moved as if they belonged to
// the columns there, and the arrow at the end of the expander's.
void CLVColumn::InvalidatePushedCells() {
    const float left = IsExpander() ? mColumnBegin : mColumnEnd;
    const float limit = PushLimit(mParent->ColumnsInDisplayOrder(), mColumnEnd);
    if (IsExpander() || (mFlags & CLV_COLUMN_TELL_ITEMS_WIDTH) == 0) {
        InvalidateStrip(mParent, left, limit);
    }
}

void CLVColumn::SetShown(bool shown) {
    if (mParent != nullptr) {
        mParent->AssertWindowLocked();
    }
    if (shown == IsShown()) {
        return;
    }
    mFlags = shown ? mFlags & ~static_cast<unsigned long>(CLV_COLUMN_HIDDEN) : mFlags | CLV_COLUMN_HIDDEN;
    if (mParent == nullptr) {
        return;
    }
    float begin = mColumnBegin;
    if (IsExpander()) {
        mParent->SetExpanderColumn(shown ? mParent->IndexOfColumn(this) : -1);
    }
    mParent->UpdateColumnSizesDataRectSizeScrollBars(true);
    CLVColumnLabelView* const header = mParent->HeaderView();
    header->UpdateDragGroups();
    if (shown) {
        begin = mColumnBegin;
    }
    // The cell before it may end, or begin, to be merged: its border changes.
    InvalidateStrip(header, begin - 1, header->Bounds().right);
    InvalidateStrip(mParent, begin, mParent->Bounds().right);
}

void CLVColumn::SetSortMode(CLVSortMode mode) {
    if (mParent == nullptr) {
        mSortMode = mode;
        return;
    }
    mParent->AssertWindowLocked();
    mParent->SetSortMode(mParent->IndexOfColumn(this), mode);
}

void CLVColumn::SetColumnSpan(float begin, float end) {
    if (mHeaderFrame != kNowhere) {
        // The header's pixels move along.
        mHeaderFrame.left += begin - mColumnBegin;
        mHeaderFrame.right += end - mColumnEnd;
    }
    mColumnBegin = begin;
    mColumnEnd = end;
}

void CLVColumn::DrawColumnHeader(BView* view, BRect header_rect, bool sort_key, bool pressed,
                                 float font_ascent) {
    if (!mHasLabel) {
        return;
    }
    const char* const text = (mFlags & CLV_COLUMN_HEADER_TRUNCATE) != 0 ? TruncatedLabel() : GetLabel();
    view->SetHighColor(pressed ? kLabelPressed : kLabelBlack);
    const BPoint origin(header_rect.left + kLabelIndent, header_rect.top + font_ascent + 1);
    view->SetDrawingMode(B_OP_OVER);
    view->DrawString(text, origin);
    view->SetDrawingMode(B_OP_COPY);
    if (sort_key) {
        const float left = origin.x - 1;
        view->StrokeLine(BPoint(left, origin.y + 2), BPoint(left + view->StringWidth(text), origin.y + 2));
    }
    mHeaderFrame = header_rect;
}
