// BScrollBar: scrolls a view by a thumb, buttons, clicks beside the thumb, and the wheel.
#pragma once

#include <View.h>

#include "ScrollBarLayout.h"

#include <memory>
#include <string>

class BMessageRunner;

// Its value is the left or top edge of what the target shows: setting it scrolls the target, and scrolling
// the target sets it. Values are whole numbers. A target has one bar of each orientation at most; target and
// bar forget each other when one of them goes. A held button repeats through messages, so that the window
// goes on meanwhile. Thread rule: that of BView.
class BScrollBar : public BView {
  public:
    BScrollBar(BRect frame, const char* name, BView* target, float min, float max, orientation direction);
    // From what Archive() wrote; without a target.
    explicit BScrollBar(BMessage* archive);
    ~BScrollBar() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_range" and "_steps" (two floats each), "_val", "_prop" (float) and "_orient" (int32).
    status_t Archive(BMessage* archive, bool deep = true) const override;

    // Brought into the range.
    void SetValue(float value);
    float Value() const { return mLayout.value; }
    // Called when the value has changed, by whatever; the base class scrolls the target there.
    virtual void ValueChanged(float newValue);
    // What the view shows as a part of the whole, 0 to 1; sets the length of the thumb.
    void SetProportion(float proportion);
    float Proportion() const { return mLayout.proportion; }
    // A bar whose range is empty cannot be used. Nothing happens when min > max.
    void SetRange(float min, float max);
    // Null for what is not wanted, here and below.
    void GetRange(float* min, float* max) const;
    // How far a button and a click beside the thumb scroll; 1 and 10 at first.
    void SetSteps(float smallStep, float largeStep);
    void GetSteps(float* smallStep, float* largeStep) const;
    // Null for none. By name: a view of the window, at once or when the bar is added to one.
    void SetTarget(BView* target);
    void SetTarget(const char* targetName);
    BView* Target() const { return mTarget; }
    orientation Orientation() const { return mOrientation; }

    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void MessageReceived(BMessage* message) override;
    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void MouseUp(BPoint where) override;
    void FrameResized(float newWidth, float newHeight) override;
    void Draw(BRect updateRect) override;
    void GetPreferredSize(float* width, float* height) override;

    // For the kit's own use: the turns of the mouse's wheel, positive towards the end.
    void ScrollByWheel(float turns);

  private:
    friend class BView;
    typedef ScrollBarLayout::Part Part;

    // From the target: it has been scrolled, or goes away.
    void TargetScrolledTo(float value);
    void ForgetTarget() { mTarget = nullptr; }

    ScrollBarLayout CurrentLayout() const;
    void InvalidateUnlessItLooksLike(const ScrollBarLayout& before);
    float AlongBar(BPoint point) const { return mOrientation == B_HORIZONTAL ? point.x : point.y; }
    BRect PartRect(int32 start, int32 length) const;
    void DrawButton(BRect rect, bool isMore);
    // What is pressed does its work once more, where the pointer still is on it.
    void Step();
    void StartRepeating();
    void StopPressing();

    ScrollBarLayout mLayout; // its length and breadth are those of the bounds, see CurrentLayout()
    orientation mOrientation;
    float mSmallStep = 1;
    float mLargeStep = 10;
    BView* mTarget = nullptr; // not ours
    std::string mTargetName;
    Part mPressed = Part::None;
    float mPointer = 0; // along the bar
    // From the thumb's start to where it was grabbed.
    float mGrabOffset = 0;
    std::unique_ptr<BMessageRunner> mRepeater;
};
