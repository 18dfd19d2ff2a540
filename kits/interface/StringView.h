// BStringView: one line of text that cannot be edited.
#pragma once

#include <View.h>

#include <string>

// Takes its parent's view colour. The text is cut with an ellipsis where the view is too narrow. Thread rule:
// that of BView.
class BStringView : public BView {
  public:
    // A copy of the text is kept; null is the empty text.
    BStringView(BRect frame, const char* name, const char* text,
                uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP, uint32 flags = B_WILL_DRAW);
    explicit BStringView(BMessage* archive);
    ~BStringView() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_text" (string) and "_align" (int32).
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void Draw(BRect updateRect) override;
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;

    void SetText(const char* text);
    const char* Text() const { return mText.c_str(); }
    void SetAlignment(alignment align);
    alignment Alignment() const { return mAlignment; }

    void GetPreferredSize(float* width, float* height) override;

  private:
    std::string mText;
    alignment mAlignment = B_ALIGN_LEFT;
};
