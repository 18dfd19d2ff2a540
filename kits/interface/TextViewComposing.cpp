// The part of BTextView that shows what an input method is working on.
#include <TextView.h>

#include "TextCharacters.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <utility>

void BTextView::SetComposition(std::string text, int32 caret) {
    if (!mEditable) {
        text.clear();
    }
    if (text.empty() && mComposition.empty()) {
        return;
    }
    mComposition = std::move(text);
    mCompositionCaret = code_point_boundary(
        mComposition, std::min(static_cast<size_t>(std::max(0, caret)), mComposition.size()));
    ShowCaret();
    InvalidateText();
    ScrollToSelection();
}

float BTextView::CompositionWidth(size_t bytes) const {
    if (mComposition.empty()) {
        return 0;
    }
    const std::vector<float> advances = Advances(std::string_view(mComposition).substr(0, bytes));
    return std::accumulate(advances.begin(), advances.end(), 0.0F);
}

void BTextView::DrawLineWithComposition(int32 line, float baseline) {
    const float left = mTextRect.left + IndentOf(line);
    const int32 caret = mSelection.Caret();
    DrawPiece(mLayout.StartOf(line), caret, left, baseline);
    const float begin = left + mLayout.XAt(caret);
    const float width = CompositionWidth(mComposition.size());
    DrawString(Shown(mComposition).c_str(), BPoint(begin, baseline));
    StrokeLine(BPoint(std::floor(begin), baseline + 1), BPoint(std::ceil(begin + width) - 1, baseline + 1));
    DrawPiece(caret, mLayout.EndOf(line), left + width, baseline);
}
