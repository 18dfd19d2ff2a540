// The part of BTextView that lays out, measures and draws.
#include <TextView.h>

#include "ControlLook.h"
#include "TextCharacters.h"
#include "Utf8Text.h"
#include "ViewHost.h"

#include <ScrollBar.h>

#include <host/api/fonts.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr std::string_view kBullet = "\u2022";
// Room that stays beside the caret when the text scrolls sideways under it.
constexpr float kSidewaysMargin = 16;
constexpr bigtime_t kBlinkTime = 500000;

} // namespace

std::vector<float> BTextView::Advances(std::string_view text) const {
    BFont font;
    GetFont(&font);
    const host::FontSpec spec = font.Spec();
    return mHidden ? std::vector<float>(utf8_count_chars(text), host::text_width(spec, kBullet))
                   : host::text_advances(spec, text);
}

std::string BTextView::Shown(std::string_view text) const {
    if (!mHidden) {
        return std::string(text);
    }
    std::string bullets;
    for (size_t i = utf8_count_chars(text); i > 0; --i) {
        bullets += kBullet;
    }
    return bullets;
}

void BTextView::LayOut() {
    const float width = mWrap ? std::max(1.0F, mTextRect.Width() + 1) : 0.0F;
    mLayout.LayOut(mText, {[this](std::string_view text) { return Advances(text); }, width, mTabWidth});
    FixupScrollBars();
    InvalidateText();
}

void BTextView::InvalidateText() {
    Invalidate();
}

float BTextView::LineHeight(int32 /*line*/) const {
    BFont font;
    GetFont(&font);
    return ControlLook::LineHeight(font);
}

float BTextView::TextHeight(int32 startLine, int32 endLine) const {
    const int32 first = std::max(0, startLine);
    const int32 last = std::min(endLine, CountLines() - 1);
    return static_cast<float>(std::max(0, last - first + 1)) * LineHeight();
}

float BTextView::LineWidth(int32 line) const {
    return line < 0 || line >= CountLines() ? 0.0F : mLayout.WidthOf(line);
}

float BTextView::IndentOf(int32 line) const {
    const float spare = mTextRect.Width() + 1 - mLayout.WidthOf(line);
    if (mAlignment == B_ALIGN_LEFT || spare <= 0) {
        return 0;
    }
    return mAlignment == B_ALIGN_RIGHT ? spare : std::floor(spare / 2);
}

int32 BTextView::LineAt(BPoint point) const {
    const float line = std::floor((point.y - mTextRect.top) / LineHeight());
    return std::clamp(static_cast<int32>(line), 0, CountLines() - 1);
}

int32 BTextView::OffsetAt(int32 line) const {
    return line < 0 || line >= CountLines() ? TextLength() : mLayout.StartOf(line);
}

int32 BTextView::OffsetAt(BPoint point) const {
    const int32 line = LineAt(point);
    return mLayout.OffsetAt(line, point.x - mTextRect.left - IndentOf(line), mText);
}

BPoint BTextView::PointAt(int32 offset, float* height) const {
    const float lineHeight = LineHeight();
    if (height != nullptr) {
        *height = lineHeight;
    }
    offset = BoundaryAt(offset);
    const int32 line = mLayout.LineAt(offset);
    return {mTextRect.left + IndentOf(line) + mLayout.XAt(offset),
            mTextRect.top + static_cast<float>(line) * lineHeight};
}

void BTextView::GetTextRegion(int32 startOffset, int32 endOffset, BRegion* region) const {
    region->MakeEmpty();
    const int32 from = BoundaryAt(startOffset);
    const int32 to = BoundaryAt(endOffset);
    if (from >= to) {
        return;
    }
    const float height = LineHeight();
    for (int32 line = LineAt(from); line <= LineAt(to); ++line) {
        const float left = mTextRect.left + IndentOf(line);
        const float top = mTextRect.top + static_cast<float>(line) * height;
        const float first = line == LineAt(from) ? mLayout.XAt(from) : 0.0F;
        const float end = line == LineAt(to) ? mLayout.XAt(to) : mLayout.WidthOf(line);
        if (end > first) {
            region->Include(
                BRect(std::floor(left + first), top, std::ceil(left + end) - 1, top + height - 1));
        }
    }
}

BRect BTextView::CaretRect() const {
    float height = 0;
    BPoint place = PointAt(mSelection.Caret(), &height);
    place.x += CompositionWidth(mCompositionCaret);
    const float x = std::max(Bounds().left, std::round(place.x) - (place.x > mTextRect.left ? 1.0F : 0.0F));
    return {x, place.y, x, place.y + height - 1};
}

void BTextView::ShowCaret() {
    mCaretShown = true;
    mCaretMoved = system_time();
    const BRect caret = CaretRect();
    Invalidate(caret);
    if (Host() != nullptr && IsFocus()) {
        Host()->SetTextCaret(this, caret);
    }
}

void BTextView::Pulse() {
    if (!ShowsFocus() || !mEditable || !mSelection.IsEmpty()) {
        return;
    }
    const bool shown = (system_time() - mCaretMoved) / kBlinkTime % 2 == 0;
    if (shown != mCaretShown) {
        mCaretShown = shown;
        Invalidate(CaretRect());
    }
}

void BTextView::Draw(BRect updateRect) {
    BFont font;
    GetFont(&font);
    const float height = LineHeight();
    const int32 first = LineAt(updateRect.LeftTop());
    const int32 last = LineAt(updateRect.LeftBottom());
    PushState();
    for (int32 line = first; line <= last; ++line) {
        const float top = mTextRect.top + static_cast<float>(line) * height;
        const BRect lineRect(mTextRect.left, top, mTextRect.right, top + height - 1);
        DrawSelection(line, lineRect);
        DrawLine(line, ControlLook::Baseline(font, lineRect));
    }
    PopState();
    if (ShowsFocus() && mEditable && (mSelection.IsEmpty() || !mComposition.empty()) && mCaretShown) {
        FillRect(CaretRect());
    }
}

void BTextView::DrawSelection(int32 line, BRect lineRect) {
    const int32 from = std::max(mSelection.From(), mLayout.StartOf(line));
    const int32 to = std::min(mSelection.To(), mLayout.EndOf(line));
    // A selected line feed shows as a strip behind the line.
    const bool feedSelected =
        mLayout.EndsParagraph(line) && mSelection.From() <= to && mSelection.To() > mLayout.EndOf(line);
    if (mSelection.IsEmpty() || !mSelectable || (from >= to && !feedSelected)) {
        return;
    }
    const float left = mTextRect.left + IndentOf(line);
    const float begin = from >= mLayout.EndOf(line) ? mLayout.WidthOf(line) : mLayout.XAt(from);
    const float end = to >= mLayout.EndOf(line) ? mLayout.WidthOf(line) : mLayout.XAt(to);
    lineRect.left = std::floor(left + begin);
    lineRect.right = std::ceil(left + end) - 1 + (feedSelected ? 4.0F : 0.0F);
    const rgb_color text = HighColor();
    SetHighColor(ShowsFocus() ? ControlLook::kSelectedText : ControlLook::kInactiveSelectedText);
    FillRect(lineRect);
    SetHighColor(text);
}

void BTextView::DrawLine(int32 line, float baseline) {
    // Mixed with what is there: the page, or the selection.
    SetDrawingMode(B_OP_OVER);
    if (!mComposition.empty() && line == CurrentLine()) {
        DrawLineWithComposition(line, baseline);
    } else {
        DrawPiece(mLayout.StartOf(line), mLayout.EndOf(line), mTextRect.left + IndentOf(line), baseline);
    }
    SetDrawingMode(B_OP_COPY);
}

// `left` is where the line begins.
void BTextView::DrawPiece(int32 from, int32 end, float left, float baseline) {
    // Tabs have their width from the layout; between them the text is drawn in one piece, so that letters
    // join as they were measured.
    for (int32 start = from; start < end;) {
        const size_t tab = mHidden ? std::string::npos : mText.find('\t', static_cast<size_t>(start));
        const int32 stop = tab == std::string::npos ? end : std::min(end, static_cast<int32>(tab));
        const std::string piece = Shown(
            std::string_view(mText).substr(static_cast<size_t>(start), static_cast<size_t>(stop - start)));
        if (!piece.empty()) {
            DrawString(piece.c_str(), BPoint(left + mLayout.XAt(start), baseline));
        }
        start = stop + 1;
    }
}

void BTextView::SelectionMoved() {
    ShowCaret();
    InvalidateText();
}

int32 BTextView::LineCountOfPage() const {
    return std::max(1, static_cast<int32>((Bounds().Height() + 1) / LineHeight()) - 1);
}

void BTextView::ScrollToSelection() {
    ScrollToOffset(mSelection.Caret());
}

void BTextView::ScrollToOffset(int32 offset) {
    float height = 0;
    BPoint place = PointAt(offset, &height);
    if (offset == mSelection.Caret()) {
        place.x += CompositionWidth(mCompositionCaret);
    }
    const BRect bounds = Bounds();
    BPoint leftTop = bounds.LeftTop();
    if (!mWrap) {
        if (place.x > bounds.right - 1) {
            leftTop.x = std::ceil(place.x - bounds.Width() + std::min(kSidewaysMargin, bounds.Width() / 4));
        } else if (place.x < bounds.left + 1) {
            leftTop.x = std::floor(place.x - kSidewaysMargin);
        }
        // No more empty room behind the text than it needs.
        const float contentRight =
            mTextRect.left + mLayout.WidestLine() + CompositionWidth(mComposition.size()) + mTextRect.left;
        leftTop.x = std::clamp(leftTop.x, 0.0F, std::max(0.0F, std::ceil(contentRight - bounds.Width())));
    }
    if (place.y < bounds.top || height > bounds.Height()) {
        leftTop.y = CountLines() == 1 ? bounds.top : place.y;
    } else if (place.y + height - 1 > bounds.bottom) {
        leftTop.y = CountLines() == 1 ? bounds.top : std::ceil(place.y + height - 1 - bounds.Height());
    }
    if (leftTop != bounds.LeftTop()) {
        ScrollTo(leftTop);
    }
}

void BTextView::FixupScrollBars() {
    const auto fix = [](BScrollBar* bar, float shown, float all, float step) {
        if (bar != nullptr) {
            bar->SetRange(0, std::max(0.0F, std::ceil(all - shown)));
            bar->SetProportion(all <= shown ? 1.0F : shown / all);
            bar->SetSteps(step, std::max(step, shown - step));
        }
    };
    const float height = TextHeight(0, CountLines() - 1);
    fix(ScrollBar(B_VERTICAL), Bounds().Height() + 1, height + 2 * mTextRect.top, LineHeight());
    fix(ScrollBar(B_HORIZONTAL), Bounds().Width() + 1,
        mWrap ? 0.0F : mLayout.WidestLine() + 2 * mTextRect.left, LineHeight());
}

void BTextView::GetPreferredSize(float* width, float* height) {
    *width = std::ceil(mLayout.WidestLine()) + 2 * mTextRect.left;
    *height = TextHeight(0, CountLines() - 1) + 2 * mTextRect.top - 1;
}
