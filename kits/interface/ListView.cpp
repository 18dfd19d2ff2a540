#include <ListView.h>

#include "ControlLook.h"
#include "ListAutoscroll.h"
#include "RowPositions.h"
#include "ViewHost.h"

#include <Looper.h>
#include <Message.h>
#include <MessageRunner.h>
#include <ScrollBar.h>
#include <ScrollView.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr char kTypeField[] = "_lv_type";
constexpr char kInvocationField[] = "_msg";
constexpr char kSelectionField[] = "_2nd_msg";
constexpr char kItemsField[] = "_l_items";

} // namespace

REGISTER_ARCHIVABLE(BListView);

BListView::BListView(BRect frame, const char* name, list_view_type type, uint32 resizingMode, uint32 flags)
    : BView(frame, name, resizingMode, flags), mType(type), mPositions(std::make_unique<RowPositions>()) {}

BListView::BListView(BMessage* archive) : BView(archive), mPositions(std::make_unique<RowPositions>()) {
    if (archive == nullptr) {
        return;
    }
    int32 type = 0;
    if (archive->FindInt32(kTypeField, &type) == B_OK && type == B_MULTIPLE_SELECTION_LIST) {
        mType = B_MULTIPLE_SELECTION_LIST;
    }
    BMessage message;
    if (archive->FindMessage(kInvocationField, &message) == B_OK) {
        BInvoker::SetMessage(new BMessage(message));
    }
    if (archive->FindMessage(kSelectionField, &message) == B_OK) {
        mSelectionMessage = std::make_unique<BMessage>(message);
    }
    BList rows;
    for (int32 i = 0; archive->FindMessage(kItemsField, i, &message) == B_OK; ++i) {
        BArchivable* const object = instantiate_object(&message);
        if (auto* const item = dynamic_cast<BListItem*>(object); item != nullptr) {
            rows.AddItem(item);
        } else {
            delete object;
        }
    }
    InsertRows(0, rows);
}

BListView::~BListView() = default;

BArchivable* BListView::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BListView") ? new BListView(archive) : nullptr;
}

status_t BListView::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddInt32(kTypeField, mType);
    }
    if (status == B_OK && InvocationMessage() != nullptr) {
        status = archive->AddMessage(kInvocationField, InvocationMessage());
    }
    if (status == B_OK && mSelectionMessage != nullptr) {
        status = archive->AddMessage(kSelectionField, mSelectionMessage.get());
    }
    for (int32 i = 0; deep && status == B_OK && i < CountItems(); ++i) {
        BMessage itemArchive;
        status = RowAt(i)->Archive(&itemArchive, deep);
        if (status == B_OK) {
            status = archive->AddMessage(kItemsField, &itemArchive);
        }
    }
    return status;
}

void BListView::AttachedToWindow() {
    BView::AttachedToWindow();
    if (!Messenger().IsValid()) {
        BInvoker::SetTarget(Looper());
    }
    UpdateAllRows();
}

void BListView::DetachedFromWindow() {
    EndPress();
    BView::DetachedFromWindow();
}

void BListView::WindowActivated(bool active) {
    BView::WindowActivated(active);
    if (mCursorShown) {
        InvalidateItem(mCursor);
    }
}

void BListView::TargetedByScrollView(BScrollView* scrollView) {
    mScrollView = scrollView;
    FixupScrollBar();
}

void BListView::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    FixupScrollBar();
}

void BListView::MakeFocus(bool focus) {
    const bool before = IsFocus();
    BView::MakeFocus(focus);
    if (IsFocus() == before) {
        return;
    }
    if (mCursorShown) {
        InvalidateItem(mCursor);
    }
    if (mScrollView != nullptr) {
        mScrollView->SetBorderHighlighted(IsFocus());
    }
}

void BListView::SetFont(const BFont* font, uint32 mask) {
    BFont before;
    GetFont(&before);
    BView::SetFont(font, mask);
    BFont after;
    GetFont(&after);
    // A row that sets a font while the window is drawn anew does so for itself. To have all rows drawn again
    // for that would never end.
    const bool isDrawing = Host() != nullptr && Host()->DrawingLimit() != nullptr;
    if (!isDrawing && !(after == before)) {
        UpdateAllRows();
    }
}

void BListView::ScrollTo(BPoint where) {
    BView::ScrollTo(where);
}

void BListView::GetPreferredSize(float* width, float* height) {
    float widest = 0;
    for (int32 i = 0; i < CountItems(); ++i) {
        widest = std::max(widest, RowAt(i)->Width());
    }
    *width = IsEmpty() ? Bounds().Width() : std::ceil(widest);
    *height = IsEmpty() ? Bounds().Height() : static_cast<float>(mPositions->TotalHeight() - 1);
}

void BListView::Draw(BRect updateRect) {
    const int64 top = std::max<int64>(0, std::lround(std::floor(updateRect.top)));
    for (int32 row = mPositions->RowAt(top); row >= 0 && row < CountItems(); ++row) {
        const BRect frame = ItemFrame(row);
        if (frame.top > updateRect.bottom) {
            break;
        }
        DrawItem(RowAt(row), frame);
        if (row == mCursor && mCursorShown && IsFocus()) {
            ControlLook(this).Frame(frame, ControlLook::kFocus);
        }
    }
}

void BListView::DrawItem(BListItem* item, BRect frame, bool complete) {
    item->DrawItem(this, frame, complete);
}

void BListView::MessageReceived(BMessage* message) {
    if (message->what == B_SELECT_ALL && mType == B_MULTIPLE_SELECTION_LIST) {
        Select(0, CountItems() - 1);
        return;
    }
    if (message->what == kListAutoscroll) {
        Autoscroll();
        return;
    }
    BView::MessageReceived(message);
}

void BListView::SetListType(list_view_type type) {
    mType = type;
    if (type == B_SINGLE_SELECTION_LIST && CurrentSelection(1) >= 0) {
        Select(CurrentSelection(0));
    }
}

void BListView::SetSelectionMessage(BMessage* message) {
    if (message != mSelectionMessage.get()) {
        mSelectionMessage.reset(message);
    }
}

void BListView::SetInvocationMessage(BMessage* message) {
    BInvoker::SetMessage(message);
}

uint32 BListView::SelectionCommand() const {
    return mSelectionMessage == nullptr ? 0 : mSelectionMessage->what;
}

status_t BListView::Invoke(BMessage* message) {
    bool notifying = false;
    const uint32 kind = InvokeKind(&notifying);
    // InvokeNotify() without a message means to tell those who watch, and nobody else.
    const BMessage* const wanted = message == nullptr && !notifying ? Message() : message;
    if (wanted == nullptr && !IsWatched()) {
        return B_BAD_VALUE;
    }
    BMessage copy(kind);
    if (wanted != nullptr) {
        copy = *wanted;
    }
    copy.AddPointer("source", this);
    copy.AddMessenger("be:sender", BMessenger(this));
    for (int32 i = 0, row = CurrentSelection(0); row >= 0; row = CurrentSelection(++i)) {
        copy.AddInt32("index", row);
    }
    SendNotices(kind, &copy);
    return wanted == nullptr ? B_BAD_VALUE : BInvoker::Invoke(&copy);
}

BRect BListView::ItemFrame(int32 index) {
    if (index < 0 || index >= CountItems()) {
        return {};
    }
    TakeHeightFromRow(index);
    // Each edge is rounded once: far down, floats do not know every pixel.
    const int64 top = mPositions->TopOf(index);
    const int64 bottom = top + mPositions->HeightOf(index) - 1;
    return {0, static_cast<float>(top), std::max(0.0F, Bounds().right), static_cast<float>(bottom)};
}
