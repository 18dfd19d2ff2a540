#include "widgets/IconMenuItem.h"

#include <Bitmap.h>
#include <Errors.h>
#include <Menu.h>
#include <Messenger.h>
#include <NodeInfo.h>
#include <Roster.h>

#include <cstdio>
#include <cstring>

namespace {

constexpr char kTrackerSignature[] = "application/x-vnd.Be-TRAK";

// The name that an entry has when it is a directory seen from itself.
constexpr char kSelfName[] = ".";

bool IsSelf(const BEntry& entry) {
    char name[B_FILE_NAME_LENGTH];
    return entry.GetName(name) == B_OK && std::strcmp(name, kSelfName) == 0;
}

} // namespace

IconMenuItem::IconMenuItem(const BEntry* entry)
    : BMenuItem("foo", nullptr), mEntry(*entry),
      mIcon(std::make_unique<BBitmap>(BRect(0, 0, 15, 15), B_CMAP8)) {
    char name[B_FILE_NAME_LENGTH];
    if (mEntry.GetName(name) == B_OK)
        SetLabel(IsSelf(mEntry) ? "Desktop" : name);
    entry_ref ref;
    status_t status = mEntry.GetRef(&ref);
    if (status == B_OK)
        status = BNodeInfo::GetTrackerIcon(&ref, mIcon.get(), B_MINI_ICON);
    if (status != B_OK)
        std::printf("Error getting icon: %s\n", strerror(status));
}

IconMenuItem::~IconMenuItem() = default;

void IconMenuItem::GetEntry(BEntry* out) const {
    *out = mEntry;
}

void IconMenuItem::GetContentSize(float* width, float* height) {
    BMenuItem::GetContentSize(width, height);
    *width += 40;
    *height += 4;
}

void IconMenuItem::DrawContent() {
    const BRect frame = Frame();
    const BPoint place = frame.LeftTop() + BPoint(14, 4);
    BMenu* const menu = Menu();
    if (mIcon != nullptr) {
        menu->SetDrawingMode(B_OP_OVER);
        // One pixel larger than the icon each way, which is meant so.
        menu->DrawBitmap(mIcon.get(), BRect(place, place + BPoint(16, 16)));
    }
    menu->DrawString(Label(), BPoint(frame.left + 34, frame.bottom - 4));
}

void IconMenuItem::ShowInTracker() {
    if (!be_roster->IsRunning(kTrackerSignature))
        be_roster->Launch(kTrackerSignature);
    BMessage message(B_REFS_RECEIVED);
    BMessenger tracker(kTrackerSignature);
    if (IsSelf(mEntry)) {
        std::printf("Hiding all windows... (TODO)\n");
        return;
    }
    entry_ref ref;
    mEntry.GetRef(&ref);
    message.AddRef("refs", &ref);
    tracker.SendMessage(&message);
}
