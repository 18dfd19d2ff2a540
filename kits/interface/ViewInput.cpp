// The part of BView that deals with the pointer's shape and with drags.
#include <View.h>

#include "ViewHost.h"

#include <Bitmap.h>
#include <Message.h>
#include <Messenger.h>

#include <memory>

void BView::SetViewCursor(const BCursor* cursor, bool /*sync*/) {
    if (mHost != nullptr) {
        mHost->SetViewCursor(this, cursor);
    }
}

void BView::BeginRectTracking(BRect startRect, uint32 style) {
    if (mHost != nullptr && startRect.IsValid()) {
        const BPoint leftTop = ConvertToSurface(startRect.LeftTop());
        mHost->BeginRectTracking(startRect.OffsetToCopy(leftTop), style);
    }
}

void BView::EndRectTracking() {
    if (mHost != nullptr) {
        mHost->EndRectTracking();
    }
}

void BView::DragMessage(BMessage* message, BRect dragRect, BHandler* replyTo) {
    if (mHost == nullptr || message == nullptr || !dragRect.IsValid()) {
        return;
    }
    BPoint pointer;
    uint32 buttons = 0;
    GetMouse(&pointer, &buttons, false);
    ViewHost::DragStart drag;
    drag.message = message;
    drag.outline = dragRect;
    drag.offset = pointer - dragRect.LeftTop();
    drag.replyTo = BMessenger(replyTo != nullptr ? replyTo : this);
    mHost->StartDrag(drag);
}

void BView::DragMessage(BMessage* message, BBitmap* picture, BPoint offset, BHandler* replyTo) {
    DragMessage(message, picture, B_OP_ALPHA, offset, replyTo);
}

void BView::DragMessage(BMessage* message, BBitmap* picture, drawing_mode /*mode*/, BPoint offset,
                        BHandler* replyTo) {
    const std::unique_ptr<BBitmap> owned(picture);
    if (mHost == nullptr || message == nullptr || picture == nullptr) {
        return;
    }
    ViewHost::DragStart drag;
    drag.message = message;
    drag.outline = picture->Bounds();
    drag.picture = picture;
    drag.offset = offset;
    drag.replyTo = BMessenger(replyTo != nullptr ? replyTo : this);
    mHost->StartDrag(drag);
}
