// BScrollView: a view in a frame, with scroll bars.
#pragma once

#include <View.h>

class BScrollBar;

// Takes the place and the resizing of its target, which becomes its child and fills it; the border and the
// bars lie around what the target's frame was. A bar takes 15 pixels, the fancy border 2, the plain one 1.
// Thread rule: that of BView.
class BScrollView : public BView {
  public:
    // The target must have no parent.
    BScrollView(const char* name, BView* target, uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
                uint32 flags = 0, bool horizontal = false, bool vertical = false,
                border_style border = B_FANCY_BORDER);
    // From what Archive() wrote deep: bars and target are among the children.
    explicit BScrollView(BMessage* archive);
    ~BScrollView() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_style" (int32, the border) and "_target" (int32, which of the children is the target).
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void WindowActivated(bool active) override;
    void FrameResized(float newWidth, float newHeight) override;
    void Draw(BRect updateRect) override;
    // A target or bar that is removed is forgotten.
    bool RemoveChild(BView* child) override;
    void GetPreferredSize(float* width, float* height) override;

    // Null where there is none.
    BScrollBar* ScrollBar(orientation posture) const;
    // The children keep their places: change it before they show.
    virtual void SetBorder(border_style border);
    border_style Border() const { return mBorder; }
    // Shows that the target has the focus; done by the kit's lists and text views. B_ERROR for borders that
    // cannot show it.
    virtual status_t SetBorderHighlighted(bool highlighted);
    bool IsBorderHighlighted() const { return mHighlighted; }
    // The old target is the caller's again.
    void SetTarget(BView* target);
    BView* Target() const { return mTarget; }

  private:
    void Adopt(BView* target);
    void InvalidateBorder();

    BView* mTarget = nullptr;
    BScrollBar* mHorizontal = nullptr;
    BScrollBar* mVertical = nullptr;
    border_style mBorder = B_FANCY_BORDER;
    bool mHighlighted = false;
    // Bounds when the border was last seen to.
    BRect mKnownBounds;
};
