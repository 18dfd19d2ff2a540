#include "BitmapWithView.h"
#include "ViewStage.h"

#include <Message.h>

#include <gtest/gtest.h>
#include <string>

namespace {

BView* MakeView(BRect frame, const char* name = "child", uint32 mode = B_FOLLOW_NONE, uint32 flags = 0) {
    return new BView(frame, name, mode, flags);
}

TEST(View, BoundsStartAtTheOriginAndFrameWhereItWasMade) {
    BView view(BRect(10, 20, 40, 60), "view", B_FOLLOW_ALL, B_WILL_DRAW | B_PULSE_NEEDED);
    EXPECT_EQ(view.Bounds(), BRect(0, 0, 30, 40));
    EXPECT_EQ(view.Frame(), BRect(10, 20, 40, 60));
    EXPECT_EQ(view.ResizingMode(), 0x1234U);
    EXPECT_EQ(view.Flags(), B_WILL_DRAW | B_PULSE_NEEDED);
    EXPECT_EQ(view.Window(), nullptr);
    EXPECT_EQ(view.Parent(), nullptr);
    view.MoveTo(1, 2);
    view.ResizeTo(5, 6);
    EXPECT_EQ(view.Frame(), BRect(1, 2, 6, 8));
    view.MoveBy(1, 1);
    view.ResizeBy(-1, -2);
    EXPECT_EQ(view.Frame(), BRect(2, 3, 6, 7));
}

TEST(View, StartsWithTheColoursOfPaper) {
    const BView view(BRect(0, 0, 1, 1), nullptr, 0, 0);
    EXPECT_EQ(view.HighColor(), make_color(0, 0, 0));
    EXPECT_EQ(view.LowColor(), make_color(255, 255, 255));
    EXPECT_EQ(view.ViewColor(), make_color(255, 255, 255));
    EXPECT_EQ(view.DrawingMode(), B_OP_COPY);
    EXPECT_EQ(view.PenSize(), 1);
    BFont font;
    view.GetFont(&font);
    EXPECT_EQ(font, *be_plain_font);
}

TEST(View, ChildrenAreKeptInOrderAndFoundByName) {
    BView parent(BRect(0, 0, 99, 99), "parent", 0, 0);
    BView* const first = MakeView(BRect(0, 0, 9, 9), "first");
    BView* const second = MakeView(BRect(0, 0, 9, 9), "second");
    BView* const middle = MakeView(BRect(0, 0, 9, 9), "middle");
    parent.AddChild(first);
    parent.AddChild(second);
    parent.AddChild(middle, second);
    EXPECT_EQ(parent.CountChildren(), 3);
    EXPECT_EQ(parent.ChildAt(1), middle);
    EXPECT_EQ(parent.ChildAt(3), nullptr);
    EXPECT_EQ(parent.ChildAt(-1), nullptr);
    EXPECT_EQ(first->NextSibling(), middle);
    EXPECT_EQ(second->NextSibling(), nullptr);
    EXPECT_EQ(second->PreviousSibling(), middle);
    EXPECT_EQ(first->PreviousSibling(), nullptr);
    EXPECT_EQ(parent.FindView("middle"), middle);
    EXPECT_EQ(parent.FindView("parent"), &parent);
    EXPECT_EQ(parent.FindView("nobody"), nullptr);
    EXPECT_TRUE(middle->RemoveSelf());
    EXPECT_FALSE(middle->RemoveSelf());
    EXPECT_EQ(middle->Parent(), nullptr);
    EXPECT_EQ(parent.CountChildren(), 2);
    delete middle;
    delete first;
    EXPECT_EQ(parent.ChildAt(0), second);
}

TEST(View, ChildrenFollowTheEdgesTheyAreToldTo) {
    struct Case {
        uint32 mode;
        BRect expected;
    };
    for (const Case& one : {Case{B_FOLLOW_NONE, BRect(10, 10, 20, 20)},
                            Case{B_FOLLOW_LEFT | B_FOLLOW_TOP, BRect(10, 10, 20, 20)},
                            Case{B_FOLLOW_RIGHT | B_FOLLOW_BOTTOM, BRect(30, 50, 40, 60)},
                            Case{B_FOLLOW_ALL, BRect(10, 10, 40, 60)},
                            Case{B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP, BRect(10, 10, 40, 20)},
                            Case{B_FOLLOW_LEFT | B_FOLLOW_TOP_BOTTOM, BRect(10, 10, 20, 60)},
                            Case{B_FOLLOW_H_CENTER | B_FOLLOW_V_CENTER, BRect(20, 30, 30, 40)}}) {
        BView parent(BRect(0, 0, 100, 100), "parent", 0, 0);
        BView* const child = MakeView(BRect(10, 10, 20, 20), "child", one.mode);
        parent.AddChild(child);
        parent.ResizeTo(120, 140);
        EXPECT_EQ(child->Frame(), one.expected) << std::hex << one.mode;
    }
}

TEST(View, ResizingReachesGrandchildren) {
    BView parent(BRect(0, 0, 100, 100), "parent", 0, 0);
    BView* const child = MakeView(BRect(0, 0, 100, 100), "child", B_FOLLOW_ALL);
    BView* const grandchild = MakeView(BRect(90, 0, 100, 100), "bar", B_FOLLOW_RIGHT | B_FOLLOW_TOP_BOTTOM);
    child->AddChild(grandchild);
    parent.AddChild(child);
    parent.ResizeBy(7, -50);
    EXPECT_EQ(grandchild->Frame(), BRect(97, 0, 107, 50));
}

TEST(View, CoordinatesAreConvertedThroughParentsAndScrolling) {
    BView parent(BRect(100, 200, 300, 400), "parent", 0, 0);
    BView* const child = MakeView(BRect(10, 20, 60, 70));
    parent.AddChild(child);
    EXPECT_EQ(child->ConvertToParent(BPoint(1, 2)), BPoint(11, 22));
    EXPECT_EQ(child->ConvertFromParent(BPoint(11, 22)), BPoint(1, 2));
    EXPECT_EQ(child->ConvertToSurface(BPoint(1, 2)), BPoint(111, 222));
    child->ScrollTo(0, 100);
    EXPECT_EQ(child->Bounds(), BRect(0, 100, 50, 150));
    EXPECT_EQ(child->Frame(), BRect(10, 20, 60, 70)) << "scrolling moves no frame";
    EXPECT_EQ(child->ConvertToParent(BPoint(1, 102)), BPoint(11, 22));
    EXPECT_EQ(child->ConvertFromSurface(BPoint(111, 222)), BPoint(1, 102));
    EXPECT_EQ(child->ConvertToScreen(BRect(0, 100, 5, 105)), BRect(110, 220, 115, 225));
    EXPECT_EQ(child->ConvertFromScreen(BRect(110, 220, 115, 225)), BRect(0, 100, 5, 105));
    child->ScrollBy(3, -100);
    EXPECT_EQ(child->LeftTop(), BPoint(3, 0));
}

TEST(View, HidingCountsAndIncludesAncestors) {
    BView parent(BRect(0, 0, 9, 9), "parent", 0, 0);
    BView* const child = MakeView(BRect(0, 0, 9, 9));
    parent.AddChild(child);
    EXPECT_FALSE(child->IsHidden());
    child->Hide();
    child->Hide();
    child->Show();
    EXPECT_TRUE(child->IsHidden());
    child->Show();
    parent.Hide();
    EXPECT_TRUE(child->IsHidden());
    EXPECT_FALSE(child->IsHidden(&parent));
}

TEST(View, StatesAreKeptAndComeBack) {
    BView view(BRect(0, 0, 9, 9), "view", 0, 0);
    view.SetHighColor(1, 2, 3);
    view.SetPenSize(4);
    view.SetOrigin(10, 10);
    view.PushState();
    EXPECT_EQ(view.Origin(), BPoint(0, 0));
    EXPECT_EQ(view.HighColor(), make_color(1, 2, 3));
    view.SetHighColor(9, 9, 9);
    view.SetPenSize(1);
    view.SetDrawingMode(B_OP_OVER);
    view.MovePenTo(5, 5);
    view.PopState();
    EXPECT_EQ(view.HighColor(), make_color(1, 2, 3));
    EXPECT_EQ(view.PenSize(), 4);
    EXPECT_EQ(view.DrawingMode(), B_OP_COPY);
    EXPECT_EQ(view.PenLocation(), BPoint(0, 0));
    EXPECT_EQ(view.Origin(), BPoint(10, 10));
    view.PopState();
    EXPECT_EQ(view.PenSize(), 4) << "one pop too many does nothing";
}

TEST(View, TakesOverTheAskedPartsOfAFont) {
    BView view(BRect(0, 0, 9, 9), "view", 0, 0);
    BFont font(be_fixed_font);
    font.SetSize(20);
    view.SetFont(&font, B_FONT_SIZE);
    BFont got;
    view.GetFont(&got);
    EXPECT_EQ(got.Size(), 20);
    EXPECT_FALSE(got.IsFixed());
    view.SetFont(&font, B_FONT_FAMILY_AND_STYLE);
    view.GetFont(&got);
    EXPECT_TRUE(got.IsFixed());
    view.SetFont(be_plain_font);
    view.SetFontSize(9);
    view.GetFont(&got);
    EXPECT_EQ(got.Size(), 9);
    EXPECT_FLOAT_EQ(view.StringWidth("Hamburg"), got.StringWidth("Hamburg"));
}

class RecordingView : public BView {
  public:
    RecordingView(const char* name, std::string* record)
        : BView(BRect(0, 0, 9, 9), name, 0, B_FRAME_EVENTS), mRecord(record) {}
    void AttachedToWindow() override { *mRecord += std::string("+") + Name(); }
    void AllAttached() override { *mRecord += std::string("!") + Name(); }
    void DetachedFromWindow() override { *mRecord += std::string("-") + Name(); }
    void FrameMoved(BPoint) override { *mRecord += std::string("m") + Name(); }
    void FrameResized(float, float) override { *mRecord += std::string("r") + Name(); }

  private:
    std::string* mRecord;
};

TEST(View, HooksAreCalledFromTheTopDownAndBack) {
    std::string record;
    BBitmap bitmap(BRect(0, 0, 9, 9), B_RGB32, true);
    auto* const top = new RecordingView("a", &record);
    auto* const below = new RecordingView("b", &record);
    top->AddChild(below);
    EXPECT_EQ(record, "");
    bitmap.AddChild(top);
    EXPECT_EQ(record, "+a+b!b!a");
    record.clear();
    below->MoveTo(1, 1);
    below->ResizeTo(3, 3);
    EXPECT_EQ(record, "mbrb");
    record.clear();
    top->RemoveChild(below);
    EXPECT_EQ(record, "-b");
    top->AddChild(below);
    EXPECT_EQ(record, "-b+b!b");
    record.clear();
    bitmap.RemoveChild(top);
    EXPECT_EQ(record, "-a-b");
    delete top;
}

TEST(View, ArchivesAndComesBack) {
    BView view(BRect(1, 2, 30, 40), "name", B_FOLLOW_ALL, B_WILL_DRAW);
    view.SetHighColor(1, 2, 3);
    view.SetViewColor(216, 216, 216);
    BMessage archive;
    ASSERT_EQ(view.Archive(&archive), B_OK);
    const BView back(&archive);
    EXPECT_EQ(back.Frame(), BRect(1, 2, 30, 40));
    EXPECT_EQ(back.ResizingMode(), B_FOLLOW_ALL);
    EXPECT_EQ(back.Flags(), B_WILL_DRAW);
    EXPECT_EQ(back.HighColor(), make_color(1, 2, 3));
    EXPECT_EQ(back.ViewColor(), make_color(216, 216, 216));
}

TEST(View, WithoutAHostInputIsIdle) {
    BView view(BRect(0, 0, 9, 9), "view", 0, 0);
    BPoint where;
    uint32 buttons = 77;
    view.GetMouse(&where, &buttons);
    EXPECT_EQ(buttons, 0U);
    EXPECT_FALSE(view.IsFocus());
    view.MakeFocus();
    EXPECT_FALSE(view.IsFocus());
    EXPECT_EQ(view.SetMouseEventMask(B_POINTER_EVENTS), B_ERROR);
    view.Invalidate();
    view.Sync();
    view.Flush();
}

TEST(View, WhileItDrawsOnlyWhatIsDrawnAnewCanBeDrawnOn) {
    class Noting : public BView {
      public:
        using BView::BView;
        void Draw(BRect) override { GetClippingRegion(&region); }
        BRegion region;
    };
    ViewStage stage(100, 80);
    auto* const view = new Noting(BRect(10, 10, 59, 59), "view", B_FOLLOW_NONE, B_WILL_DRAW);
    stage.Add(view);
    stage.Locked([&] { view->ScrollTo(0, 100); });
    stage.Redraw();
    stage.Locked([&] { view->Invalidate(BRect(5, 110, 14, 119)); });

    stage.Redraw();

    EXPECT_EQ(view->region.Frame(), BRect(5, 110, 14, 119));
    stage.Locked([&] { view->GetClippingRegion(&view->region); });
    EXPECT_EQ(view->region.Frame(), BRect(0, 100, 49, 149));
}

} // namespace
