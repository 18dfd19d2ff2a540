// IconMenuItem: a menu item that shows a file or folder with its icon, and can show it in Tracker.
#pragma once

#include <Entry.h>
#include <MenuItem.h>

#include <memory>

class BBitmap;

class IconMenuItem : public BMenuItem {
  public:
    // The entry is copied. An icon that cannot be had is reported on standard output; the item works all the
    // same.
    explicit IconMenuItem(const BEntry* entry);
    ~IconMenuItem() override;

    // Copies the entry.
    void GetEntry(BEntry* out) const;

    void GetContentSize(float* width, float* height) override;
    // A disabled item looks like an enabled one.
    void DrawContent() override;

    // Has Tracker open the file or folder, starting Tracker where it does not run. For the entry "." it only
    // prints a line.
    void ShowInTracker();

  private:
    BEntry mEntry;
    std::unique_ptr<BBitmap> mIcon; // 16 x 16, B_CMAP8
};
