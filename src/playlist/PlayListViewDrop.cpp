// The part of PlayListView that takes in dragged files.
#include "playlist/PlayListView.h"

#include <CopyText.h>
#include <Errors.h>
#include <Message.h>
#include <MimeType.h>
#include <Node.h>
#include <NodeInfo.h>
#include <StorageDefs.h>
#include <Window.h>

#include <cstring>

namespace {

bool IsAudio(const entry_ref& ref) {
    BNode node(&ref);
    BNodeInfo info(&node);
    char type[B_MIME_TYPE_LENGTH] = "";
    if (const status_t status = info.GetType(type); status != B_OK) {
        // Most files come from places where nothing has given them a type yet.
        BMimeType guess;
        if (status != B_ENTRY_NOT_FOUND || BMimeType::GuessMimeType(&ref, &guess) != B_OK)
            return false;
        CopyText(type, guess.Type());
    }
    type[strcspn(type, "/")] = '\0';
    return strcmp(type, "audio") == 0;
}

} // namespace

void PlayListView::MouseMoved(BPoint where, uint32 transit, const BMessage* drag) {
    switch (transit) {
    case B_ENTERED_VIEW:
        DragEntered(where, drag);
        break;
    case B_INSIDE_VIEW:
        if (mDropAccepted) {
            const bool wereVisible = mAntsVisible;
            mAntsVisible = mAntsRect.Contains(where);
            mAntsCleared = mAntsCleared || !mAntsVisible;
            if (wereVisible && !mAntsVisible)
                Invalidate();
        }
        break;
    case B_EXITED_VIEW:
        // What leaves by the margin, where they do not show, stays accepted; meant so.
        if (mAntsVisible) {
            mAntsCleared = true;
            HideAnts();
        }
        break;
    default:
        break;
    }
}

void PlayListView::DragEntered(BPoint where, const BMessage* drag) {
    entry_ref first;
    if (drag != nullptr && drag->FindRef("refs", &first) == B_OK) {
        mDropAccepted = true;
        mDragMessage = std::make_unique<BMessage>(*drag);
        if (IsAudio(first))
            mAntsRect = Bounds().InsetByCopy(1, 1);
    }
    if (mDropAccepted && mAntsRect.Contains(where))
        mAntsVisible = true;
}

void PlayListView::MouseUp(BPoint where) {
    if (mAntsVisible) {
        if (mDragMessage != nullptr) {
            entry_ref ref;
            for (int32 i = 0; mDragMessage->FindRef("refs", i, &ref) == B_OK; ++i)
                AddToList(&ref);
        }
        HideAnts();
    }
    BListView::MouseUp(where);
}

void PlayListView::HideAnts() {
    mAntsVisible = false;
    mDropAccepted = false;
    if (Window() != nullptr && Window()->Lock()) {
        Invalidate();
        Window()->Unlock();
    }
}

void PlayListView::Pulse() {
    // The lock ends with the message that brought the pulse.
    if (mAntsVisible && Window()->Lock())
        UpdateWalkingAnts();
}

void PlayListView::UpdateWalkingAnts() {
    mAnts.DrawAndStep(this, mAntsRect);
}
