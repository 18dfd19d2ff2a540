#include "playlist/WalkingAnts.h"

#include <View.h>

#include <algorithm>
#include <iterator>

namespace {

constexpr rgb_color kHighColor = {255, 255, 255, 255};
constexpr rgb_color kLowColor = {0, 0, 0, 255};
constexpr float kPenSize = 2;

} // namespace

void WalkingAnts::DrawAndStep(BView* view, BRect frame) {
    view->SetHighColor(kHighColor);
    view->SetLowColor(kLowColor);
    view->SetPenSize(kPenSize);
    view->StrokeLine(frame.LeftTop(), frame.RightTop(), mTopAndRight);
    view->StrokeLine(frame.RightTop(), frame.RightBottom(), mTopAndRight);
    view->StrokeLine(frame.LeftTop(), frame.LeftBottom(), mLeftAndBottom);
    view->StrokeLine(frame.LeftBottom(), frame.RightBottom(), mLeftAndBottom);

    uint8* const forward = mTopAndRight.data;
    uint8* const back = mLeftAndBottom.data;
    std::rotate(forward, forward + 1, std::end(mTopAndRight.data));
    std::rotate(back, std::end(mLeftAndBottom.data) - 1, std::end(mLeftAndBottom.data));
}
