// GalleryApp: opens the gallery's windows; ends when the last one closes.
#pragma once

#include <Application.h>

struct GalleryPage;

enum : uint32 {
    // "page" (string): its name. Unknown ones are left out.
    kOpenGalleryPage = 'opgp',
    // From each window that closes.
    kGalleryWindowClosed = 'gwcl'
};

class GalleryApp : public BApplication {
  public:
    // Null opens all pages.
    explicit GalleryApp(const GalleryPage* only);

    void ReadyToRun() override;
    void MessageReceived(BMessage* message) override;

  private:
    void Open(const GalleryPage& page);

    const GalleryPage* mOnly;
    int32 mOpened = 0;
    int32 mOpen = 0;
};
