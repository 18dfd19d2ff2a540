#include "gui/ColumnListView/gallery/GalleryApp.h"

#include "gui/ColumnListView/gallery/GalleryPages.h"
#include "gui/ColumnListView/gallery/GalleryWindow.h"

#include <Message.h>

namespace {

// Of the first window, and from each to the next.
constexpr float kPlace = 60;
constexpr float kStep = 30;
constexpr int32 kSteps = 10;

} // namespace

GalleryApp::GalleryApp(const GalleryPage* only)
    : BApplication("application/x-vnd.Quirnel-ColumnListGallery"), mOnly(only) {}

void GalleryApp::ReadyToRun() {
    for (int32 i = 0; i < CountGalleryPages(); ++i) {
        if (mOnly == nullptr || mOnly == &GalleryPageAt(i)) {
            Open(GalleryPageAt(i));
        }
    }
}

void GalleryApp::MessageReceived(BMessage* message) {
    switch (message->what) {
    case kOpenGalleryPage:
        if (const GalleryPage* const page = FindGalleryPage(message->GetString("page", ""));
            page != nullptr) {
            Open(*page);
        }
        break;
    case kGalleryWindowClosed:
        if (--mOpen == 0) {
            PostMessage(B_QUIT_REQUESTED);
        }
        break;
    default:
        BApplication::MessageReceived(message);
    }
}

void GalleryApp::Open(const GalleryPage& page) {
    const float place = kPlace + kStep * static_cast<float>(mOpened++ % kSteps);
    ++mOpen;
    (new GalleryWindow(BPoint(place, place), page))->Show();
}
