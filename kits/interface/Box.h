// BBox: a frame around other views, with a label at its top edge.
#pragma once

#include <View.h>

#include <string>

// Takes its parent's view colour. The label is a text, or a view that the box owns and that lies there as it
// is. Thread rule: that of BView.
class BBox : public BView {
  public:
    explicit BBox(BRect frame, const char* name = nullptr, uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
                  uint32 flags = B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE_JUMP,
                  border_style border = B_FANCY_BORDER);
    explicit BBox(BMessage* archive);
    ~BBox() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_style" (int32), and "_label" (string) or "_lblview" (int32, which of the children is the label)
    // where there is one.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void FrameResized(float newWidth, float newHeight) override;
    void Draw(BRect updateRect) override;
    bool RemoveChild(BView* child) override;

    virtual void SetBorder(border_style border);
    border_style Border() const { return mBorder; }
    // A text takes the place of a view, which is deleted, and the other way round. Null is no label.
    void SetLabel(const char* label);
    // The view must have no parent. B_BAD_VALUE when it has one.
    status_t SetLabel(BView* label);
    // Null where there is none, or where it is a view.
    const char* Label() const { return mHasLabel ? mLabel.c_str() : nullptr; }
    BView* LabelView() const { return mLabelView; }
    // The frame itself, below the upper half of the label, and what lies inside of it.
    BRect FrameRect() const;
    BRect InnerFrame() const;

  private:
    void ForgetLabel();

    std::string mLabel;
    bool mHasLabel = false;
    BView* mLabelView = nullptr; // our child
    border_style mBorder = B_FANCY_BORDER;
    BRect mKnownBounds;
};
