// BListItem: one row of a list; BStringItem: a row that shows a text.
#pragma once

#include <Archivable.h>
#include <Rect.h>

#include <string>

class BFont;
class BMessage;
class BView;

// Knows its state and its size; draws itself on the list's view. Belongs to nobody until a list takes it.
// Only to be used by the thread that has the list's window locked.
class BListItem : public BArchivable {
  public:
    explicit BListItem(uint32 outlineLevel = 0, bool expanded = true);
    // Missing fields take the values of a new item.
    explicit BListItem(BMessage* archive);
    ~BListItem() override;

    // Adds "_sel" and "_disable" (bool) where they are not the usual, "_li_expanded" (bool) and
    // "_li_outline_level" (int32).
    status_t Archive(BMessage* archive, bool deep = true) const override;

    float Height() const { return mHeight; }
    float Width() const { return mWidth; }
    bool IsSelected() const { return mSelected; }
    // Lists select by these; calling them alone redraws nothing.
    void Select() { mSelected = true; }
    void Deselect() { mSelected = false; }

    virtual void SetEnabled(bool enabled) { mEnabled = enabled; }
    bool IsEnabled() const { return mEnabled; }

    void SetHeight(float height) { mHeight = height; }
    void SetWidth(float width) { mWidth = width; }

    // Draws the row into `frame` of the owner's coordinates. `complete` asks to draw every pixel, the
    // background included; without it the background has just been cleared.
    virtual void DrawItem(BView* owner, BRect frame, bool complete = false) = 0;
    // Called when the row joins a list that is in a window, and when the list's font changes. Sets the width
    // to the owner's and the height to that of a line of text.
    virtual void Update(BView* owner, const BFont* font);

    // For outline lists.
    bool IsExpanded() const { return mExpanded; }
    void SetExpanded(bool expanded) { mExpanded = expanded; }
    uint32 OutlineLevel() const { return mOutlineLevel; }
    void SetOutlineLevel(uint32 level) { mOutlineLevel = level; }

  private:
    float mWidth = 0;
    float mHeight = 0;
    uint32 mOutlineLevel = 0;
    bool mSelected = false;
    bool mEnabled = true;
    bool mExpanded = true;
};

// A row with a text of its own.
class BStringItem : public BListItem {
  public:
    explicit BStringItem(const char* text, uint32 outlineLevel = 0, bool expanded = true);
    explicit BStringItem(BMessage* archive);
    ~BStringItem() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_label", the text.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void DrawItem(BView* owner, BRect frame, bool complete = false) override;
    void Update(BView* owner, const BFont* font) override;

    // A copy is kept; null is the empty text.
    virtual void SetText(const char* text);
    const char* Text() const { return mText.c_str(); }

  private:
    std::string mText;
    float mBaselineOffset = 0;
};
