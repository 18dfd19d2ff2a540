// Which views hear of the pointer.
#include "MouseTracking.h"

#include <View.h>
#include <gtest/gtest.h>

namespace {

class MouseTrackingTest : public testing::Test {
  protected:
    using Visits = std::vector<std::pair<BView*, uint32>>;
    Visits MoveTo(BView* under) {
        mTracking.Moved(under);
        return Queued();
    }
    Visits Queued() {
        Visits visits;
        MouseTracking::Visit visit;
        while (mTracking.NextVisit(&visit)) {
            visits.emplace_back(visit.view, visit.transit);
        }
        return visits;
    }

    BView mLeft{BRect(0, 0, 9, 9), "left", 0, 0};
    BView mRight{BRect(10, 0, 19, 9), "right", 0, 0};
    MouseTracking mTracking;
};

} // namespace

TEST_F(MouseTrackingTest, AViewIsEnteredStayedInAndLeft) {
    EXPECT_EQ(MoveTo(&mLeft), (Visits{{&mLeft, B_ENTERED_VIEW}}));
    EXPECT_EQ(MoveTo(&mLeft), (Visits{{&mLeft, B_INSIDE_VIEW}}));
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mLeft, B_EXITED_VIEW}, {&mRight, B_ENTERED_VIEW}}));
    EXPECT_EQ(MoveTo(nullptr), (Visits{{&mRight, B_EXITED_VIEW}}));
    EXPECT_EQ(MoveTo(nullptr), Visits());
}

TEST_F(MouseTrackingTest, TheViewThatHoldsThePressHearsOfMovesOutsideOfIt) {
    MoveTo(&mLeft);
    mTracking.SetPress(&mLeft, B_POINTER_EVENTS, 0);
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mLeft, B_EXITED_VIEW}, {&mRight, B_ENTERED_VIEW}}));
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mLeft, B_OUTSIDE_VIEW}, {&mRight, B_INSIDE_VIEW}}));
    EXPECT_EQ(mTracking.Audience(&mRight), (std::vector<BView*>{&mLeft, &mRight}));
    mTracking.Released();
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mRight, B_INSIDE_VIEW}}));
}

TEST_F(MouseTrackingTest, AnExclusivePressKeepsTheOthersOut) {
    MoveTo(&mLeft);
    mTracking.SetPress(&mLeft, B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mLeft, B_EXITED_VIEW}}));
    EXPECT_EQ(MoveTo(&mRight), (Visits{{&mLeft, B_OUTSIDE_VIEW}}));
    EXPECT_EQ(mTracking.Audience(&mRight), (std::vector<BView*>{&mLeft}));
}

TEST_F(MouseTrackingTest, AMaskedViewAlwaysHears) {
    mTracking.SetMask(&mRight, B_POINTER_EVENTS);
    EXPECT_EQ(MoveTo(&mLeft), (Visits{{&mLeft, B_ENTERED_VIEW}, {&mRight, B_OUTSIDE_VIEW}}));
    mTracking.SetMask(&mRight, B_KEYBOARD_EVENTS);
    EXPECT_EQ(MoveTo(&mLeft), (Visits{{&mLeft, B_INSIDE_VIEW}}));
    EXPECT_EQ(mTracking.KeyListeners(), (std::vector<BView*>{&mRight}));
}

TEST_F(MouseTrackingTest, AViewThatHasGoneIsNotVisited) {
    MoveTo(&mLeft);
    mTracking.Moved(&mRight);
    mTracking.Forget(&mLeft);
    EXPECT_EQ(Queued(), (Visits{{&mRight, B_ENTERED_VIEW}}));
    mTracking.Forget(&mRight);
    EXPECT_EQ(mTracking.LastUnder(), nullptr);
    EXPECT_EQ(MoveTo(nullptr), Visits());
}
