// The part of WindowHost that deals with the pointer and with drags.
#include "WindowHost.h"

#include "KeyTranslation.h"
#include "MessageDelivery.h"

#include <Bitmap.h>
#include <Cursor.h>
#include <Message.h>
#include <MessageQueue.h>
#include <View.h>

#include <algorithm>
#include <cmath>

namespace {

// Where the pointer was, in the content's coordinates.
BPoint PlaceOf(const BMessage& message) {
    return message.GetPoint("window_where", BPoint(-1, -1));
}

uint32 ButtonsOf(const BMessage& message) {
    return static_cast<uint32>(message.GetInt32("buttons", 0));
}

BView* ViewBelow(BView* view, BPoint surfacePoint) {
    for (int32 i = view->CountChildren() - 1; i >= 0; --i) {
        BView* const child = view->ChildAt(i);
        if (!child->IsHidden(view) && child->Bounds().Contains(child->ConvertFromSurface(surfacePoint))) {
            return ViewBelow(child, surfacePoint);
        }
    }
    return view;
}

bool IsOfPointer(uint32 what) {
    return what == B_MOUSE_MOVED || what == B_MOUSE_UP || what == B_MOUSE_DOWN;
}

host::Picture PictureOf(const BBitmap& bitmap) {
    host::Picture picture;
    const PixelSurface surface = bitmap.Surface();
    picture.width = surface.width;
    picture.height = surface.height;
    picture.pixels.resize(static_cast<size_t>(surface.width) * static_cast<size_t>(surface.height));
    for (int32 y = 0; y < surface.height; ++y) {
        load_pixels(surface.space, surface.Row(y), 0, surface.width,
                    picture.pixels.data() + static_cast<ptrdiff_t>(y) * surface.width);
    }
    return picture;
}

} // namespace

BView* WindowHost::ViewAt(BPoint point) const {
    if (mRoot == nullptr || !mRoot->Bounds().Contains(point)) {
        return nullptr;
    }
    BView* const found = ViewBelow(mRoot, point);
    return found == mRoot ? nullptr : found;
}

BHandler* WindowHost::TargetOf(BMessage& message, BHandler* handler) {
    switch (message.what) {
    case B_MOUSE_DOWN:
    case B_MOUSE_UP:
    case B_MOUSE_MOVED:
    case B_MOUSE_WHEEL_CHANGED: {
        BView* const under = message.HasBool("be:left") ? nullptr : ViewAt(PlaceOf(message));
        BView* const view = message.what == B_MOUSE_WHEEL_CHANGED ? under : mMouse.Foremost(under);
        const BPoint where = view != nullptr ? view->ConvertFromSurface(PlaceOf(message)) : PlaceOf(message);
        message.RemoveName("where");
        message.RemoveName("be:view_where");
        message.AddPoint("where", where);
        message.AddPoint("be:view_where", where);
        return view != nullptr ? view : handler;
    }
    case _MESSAGE_DROPPED_: {
        BView* const view = ViewAt(PlaceOf(message));
        if (!UnwrapDrop(message)) {
            return nullptr;
        }
        return view != nullptr ? view : handler;
    }
    case B_KEY_DOWN:
    case B_KEY_UP:
    case B_UNMAPPED_KEY_DOWN:
    case B_UNMAPPED_KEY_UP: {
        const bool plain = (message.GetInt32("modifiers", 0) & (B_COMMAND_KEY | B_OPTION_KEY)) == 0;
        if (mDefaultButton != nullptr && plain && message.GetInt32("raw_char", 0) == B_ENTER) {
            return mDefaultButton;
        }
        return mFocus != nullptr ? mFocus : handler;
    }
    default:
        return handler;
    }
}

void WindowHost::MouseDown(BMessage& message, BHandler* handler) {
    mAltAlone = false;
    const BPoint place = PlaceOf(message);
    BView* const under = ViewAt(place);
    auto* const first = dynamic_cast<BView*>(handler);
    std::vector<BView*> audience = mMouse.Audience(under);
    if (first != nullptr) {
        first->MouseDown(first->ConvertFromSurface(place));
    }
    for (BView* view : audience) {
        if (view != first && IsKnown(view)) {
            view->MouseDown(view->ConvertFromSurface(place));
        }
    }
}

void WindowHost::MouseUp(BMessage& message, BHandler* handler) {
    const BPoint place = PlaceOf(message);
    const bool allUp = ButtonsOf(message) == 0;
    auto* const first = dynamic_cast<BView*>(handler);
    const std::vector<BView*> audience = mMouse.Audience(ViewAt(place));
    if (allUp) {
        mMouse.Released();
    }
    if (first != nullptr) {
        first->MouseUp(first->ConvertFromSurface(place));
    }
    for (BView* view : audience) {
        if (view != first && IsKnown(view)) {
            view->MouseUp(view->ConvertFromSurface(place));
        }
    }
}

void WindowHost::BeginRectTracking(BRect rect, uint32 style) {
    EndRectTracking();
    const BMessage* const message = mWindow.CurrentMessage();
    mOutline.Begin(rect, style,
                   message != nullptr && IsOfPointer(message->what) ? PlaceOf(*message) : LivePointer());
    OutlineMoved({});
}

void WindowHost::EndRectTracking() {
    const std::vector<clipping_rect> before = mOutline.Sides(Surface().LogicalBounds());
    if (mOutline.IsActive()) {
        mOutline.End();
        OutlineMoved(before);
    }
}

void WindowHost::TrackPointer(BPoint place) {
    const std::vector<clipping_rect> before = mOutline.Sides(Surface().LogicalBounds());
    if (mOutline.PointerAt(place)) {
        OutlineMoved(before);
    }
}

// What it lay on before, and lies on now, is shown anew.
void WindowHost::OutlineMoved(const std::vector<clipping_rect>& before) {
    for (const clipping_rect& side : before) {
        SurfaceChanged(side);
    }
    if (mOutline.IsActive()) {
        for (const clipping_rect& side : mOutline.Sides(Surface().LogicalBounds())) {
            SurfaceChanged(side);
        }
    }
}

BPoint WindowHost::LivePointer() const {
    const host::LiveInput live = host::live_input();
    return BPoint(static_cast<float>(std::floor(live.on_screen.x)),
                  static_cast<float>(std::floor(live.on_screen.y))) -
           ScreenOrigin();
}

void WindowHost::MouseMoved(BMessage& message, BHandler* /*handler*/) {
    const BPoint place = PlaceOf(message);
    TrackPointer(place);
    BView* const under = message.HasBool("be:left") ? nullptr : ViewAt(place);
    const BMessage* const dragged = DragMessageOf(message);
    mMouse.Moved(under);
    RefreshCursor(under);
    MouseTracking::Visit visit;
    while (mMouse.NextVisit(&visit)) {
        const BPoint where = visit.view->ConvertFromSurface(place);
        visit.view->MouseMoved(where, visit.transit, dragged);
    }
}

bool WindowHost::GetMouse(BView* /*view*/, BPoint* surfacePoint, uint32* buttons, bool checkMessageQueue) {
    if (checkMessageQueue && mWindow.Thread() == find_thread(nullptr)) {
        // Whoever waits for the mouse in a loop wants to be seen at it.
        Update();
    }
    Flush();
    if (checkMessageQueue) {
        BMessageQueue* const queue = mWindow.MessageQueue();
        std::unique_ptr<BMessage> next;
        queue->Lock();
        for (int32 i = 0; i < queue->CountMessages(); ++i) {
            if (BMessage* const message = queue->FindMessage(i); IsOfPointer(message->what)) {
                queue->RemoveMessage(message);
                next.reset(message);
                break;
            }
        }
        queue->Unlock();
        if (next != nullptr) {
            *surfacePoint = PlaceOf(*next);
            TrackPointer(*surfacePoint);
            *buttons = ButtonsOf(*next);
            if (next->what == B_MOUSE_UP && *buttons == 0) {
                mMouse.Released();
            }
            return true;
        }
    }
    *surfacePoint = LivePointer();
    *buttons = host::live_input().buttons;
    if (mWindow.Thread() == find_thread(nullptr)) {
        TrackPointer(*surfacePoint);
    }
    return true;
}

status_t WindowHost::SetMouseEventMask(BView* view, uint32 mask, uint32 options) {
    const BMessage* const message = mWindow.CurrentMessage();
    if (message == nullptr || message->what != B_MOUSE_DOWN) {
        return B_ERROR;
    }
    mMouse.SetPress(view, mask, options);
    return B_OK;
}

void WindowHost::EventMaskChanged(BView* view) {
    mMouse.SetMask(view, view->EventMask());
}

void WindowHost::SetViewCursor(BView* view, const BCursor* cursor) {
    if (cursor == nullptr) {
        mCursors.erase(view);
    } else {
        mCursors[view] = cursor->ForHost();
    }
    mCursorView = nullptr;
    RefreshCursor(mMouse.LastUnder());
}

void WindowHost::RefreshCursor(BView* under) {
    if (mCursors.empty() && mCursorView == nullptr) {
        return;
    }
    BView* view = under;
    while (view != nullptr && mCursors.find(view) == mCursors.end()) {
        view = view->Parent();
    }
    if (view == nullptr) {
        mPeer->set_cursor(host::Cursor());
    } else if (view != mCursorView) {
        mPeer->set_cursor(mCursors[view]);
    }
    mCursorView = view;
}

void WindowHost::StartDrag(const DragStart& drag) {
    auto own = std::make_shared<OwnDrag>();
    own->message = *drag.message;
    own->replyTo = drag.replyTo;
    own->offset = drag.offset;
    host::DragContents contents;
    contents.data = FormatsOf(*drag.message);
    if (drag.picture != nullptr && drag.picture->IsValid()) {
        contents.picture = PictureOf(*drag.picture);
    }
    contents.outline = {static_cast<int>(drag.outline.Width()) + 1,
                        static_cast<int>(drag.outline.Height()) + 1};
    contents.hot_spot = {static_cast<int>(drag.offset.x), static_cast<int>(drag.offset.y)};
    DragSession::Begin(std::move(own));
    mPeer->start_drag(std::move(contents));
}

const BMessage* WindowHost::DragMessageOf(const BMessage& message) {
    const int32 number = message.GetInt32("be:drag", 0);
    if (number == 0) {
        return nullptr;
    }
    if (number != mDragNumber) {
        const WindowEvents::Dragged dragged = mEvents->DragOf(number);
        if (dragged.number != number) {
            return nullptr;
        }
        mDragNumber = number;
        mOwnDrag = dragged.own;
        mDragMessage = dragged.foreign != nullptr ? MessageOf(*dragged.foreign) : nullptr;
    }
    return mOwnDrag != nullptr ? &mOwnDrag->message : mDragMessage.get();
}

bool WindowHost::UnwrapDrop(BMessage& message) {
    const BMessage* const dragged = DragMessageOf(message);
    if (dragged == nullptr) {
        return false;
    }
    const BPoint screenWhere = message.GetPoint("screen_where", B_ORIGIN);
    const std::shared_ptr<const OwnDrag> own = mOwnDrag;
    // The fields alone are copied: how the message came here stays.
    message = *dragged;
    MessageDelivery::MarkDropped(message, screenWhere, own != nullptr ? own->offset : B_ORIGIN);
    MessageDelivery::SetReplyTo(message,
                                MessageDelivery::AddressOf(own != nullptr ? own->replyTo : BMessenger()));
    mDragMessage.reset();
    mOwnDrag.reset();
    mDragNumber = 0;
    return true;
}

void WindowHost::DragEnded() {
    // The button was let go over another window, or none: the view that has been promised to hear of it does.
    BView* const pressed = mMouse.Foremost(nullptr);
    if (pressed == nullptr) {
        return;
    }
    const host::LiveInput live = host::live_input();
    const BPoint place =
        BPoint(static_cast<float>(live.on_screen.x), static_cast<float>(live.on_screen.y)) - ScreenOrigin();
    mMouse.Released();
    pressed->MouseUp(pressed->ConvertFromSurface(place));
}
