// GalleryWindow: one page of the gallery, under a menu bar.
#pragma once

#include <Window.h>

class BMenu;
class BMenuBar;
class BStringView;
class GalleryList;
struct GalleryPage;

// The application that opened it gets the message code kGalleryWindowClosed when it closes. Thread rule: that
// of BWindow.
class GalleryWindow : public BWindow {
  public:
    GalleryWindow(BPoint leftTop, const GalleryPage& page);
    ~GalleryWindow() override;

    void MessageReceived(BMessage* message) override;

    GalleryList* List() const { return mList; }

  private:
    static BMenu* MakePageMenu();
    void AddMenus(BMenuBar* bar);
    BMenu* MakeColumnMenu();
    void AddList(const GalleryPage& page, BRect frame);
    void ToggleColumn(int32 column);
    void AddRow();
    void ShowSummary();

    GalleryList* mList = nullptr; // the window's
    BMenu* mColumnMenu = nullptr; // the menu bar's
    BStringView* mSummary = nullptr;
    int32 mAddedRows = 0;
};
