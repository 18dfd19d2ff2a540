// The way of the keyboard focus through the views.
#include "FocusOrder.h"

#include <View.h>
#include <gtest/gtest.h>

namespace {

class FocusOrderTest : public testing::Test {
  protected:
    BView* Add(BView& parent, const char* name, uint32 flags) {
        auto* const view = new BView(BRect(0, 0, 9, 9), name, 0, flags);
        parent.AddChild(view);
        return view;
    }
    const char* Next(BView* from, FocusDirection direction = FocusDirection::forward) {
        const BView* const next = NextFocus(mRoot, from, direction);
        return next == nullptr ? "none" : next->Name();
    }

    BView mRoot{BRect(0, 0, 99, 99), "root", 0, 0};
};

} // namespace

TEST_F(FocusOrderTest, TheTreeIsWalkedRoundInOrder) {
    BView* const first = Add(mRoot, "first", B_NAVIGABLE);
    BView* const group = Add(mRoot, "group", 0);
    BView* const inner = Add(*group, "inner", B_NAVIGABLE);
    BView* const last = Add(mRoot, "last", B_NAVIGABLE);
    EXPECT_STREQ(Next(nullptr), "first");
    EXPECT_STREQ(Next(first), "inner");
    EXPECT_STREQ(Next(inner), "last");
    EXPECT_STREQ(Next(last), "first");
    EXPECT_STREQ(Next(first, FocusDirection::backward), "last");
    EXPECT_STREQ(Next(nullptr, FocusDirection::backward), "last");
}

TEST_F(FocusOrderTest, HiddenViewsAndTheirChildrenAreLeftOut) {
    BView* const first = Add(mRoot, "first", B_NAVIGABLE);
    BView* const group = Add(mRoot, "group", 0);
    Add(*group, "inner", B_NAVIGABLE);
    group->Hide();
    EXPECT_STREQ(Next(first), "first");
}

TEST_F(FocusOrderTest, WithoutNavigableViewsThereIsNoWay) {
    Add(mRoot, "label", B_WILL_DRAW);
    EXPECT_STREQ(Next(nullptr), "none");
}

TEST_F(FocusOrderTest, GroupsAreJumpedTo) {
    BView* const first = Add(mRoot, "first", B_NAVIGABLE);
    Add(mRoot, "second", B_NAVIGABLE);
    BView* const third = Add(mRoot, "third", B_NAVIGABLE | B_NAVIGABLE_JUMP);
    Add(mRoot, "fourth", B_NAVIGABLE);
    EXPECT_EQ(NextFocusGroup(mRoot, first, FocusDirection::forward), third);
    EXPECT_EQ(NextFocusGroup(mRoot, third, FocusDirection::forward), first);
}
