// A looper with views on a bitmap: keys and mouse events are dispatched to them in its thread, and what they
// invalidate is drawn on demand.
#pragma once

#include "PixelPicture.h"
#include "ViewHost.h"

#include <Bitmap.h>
#include <Looper.h>
#include <Message.h>
#include <Messenger.h>
#include <View.h>

#include <algorithm>
#include <functional>
#include <string.h>
#include <string>
#include <vector>

// Runs from construction to Close(). Everything is called by the test's thread.
class ViewStage : private ViewHost {
  public:
    ViewStage(int32 width, int32 height)
        : mBitmap(BRect(0, 0, static_cast<float>(width - 1), static_cast<float>(height - 1)), B_RGB32),
          mLooper(new StageLooper(this)) {
        memset(mBitmap.Bits(), 0xFF, static_cast<size_t>(mBitmap.BitsLength()));
        mLooper->Run();
    }
    ~ViewStage() override { Close(); }
    // The last that is asked of it. For the destructors of stages that other threads ask, too: what they
    // override must not be gone before the views are.
    void Close() {
        if (mClosed) {
            return;
        }
        mClosed = true;
        mLooper->Lock();
        while (!mViews.empty()) {
            BView* const view = mViews.back();
            mViews.pop_back();
            view->DetachFromHost();
            delete view;
        }
        mLooper->Quit();
    }

    // The view belongs to the stage.
    void Add(BView* view) {
        Locked([&] {
            AddHandlers(view);
            mViews.push_back(view);
            view->AttachToHost(this);
        });
    }
    void Locked(const std::function<void()>& work) {
        mLooper->Lock();
        work();
        mLooper->Unlock();
    }
    BLooper* Looper() const { return mLooper; }

    void MouseDown(BView* view, BPoint where, uint32 modifiers = 0, int32 clicks = 1) {
        BMessage message(B_MOUSE_DOWN);
        message.AddInt32("clicks", clicks);
        message.AddInt32("buttons", B_PRIMARY_MOUSE_BUTTON);
        SendMouse(view, where, modifiers, message);
    }
    void MouseMoved(BView* view, BPoint where) {
        BMessage message(B_MOUSE_MOVED);
        message.AddInt32("buttons", B_PRIMARY_MOUSE_BUTTON);
        SendMouse(view, where, 0, message);
    }
    void MouseUp(BView* view, BPoint where) {
        BMessage message(B_MOUSE_UP);
        SendMouse(view, where, 0, message);
    }
    void Click(BView* view, BPoint where, uint32 modifiers = 0, int32 clicks = 1) {
        MouseDown(view, where, modifiers, clicks);
        MouseUp(view, where);
    }
    void Key(BView* view, const std::string& bytes, uint32 modifiers = 0) {
        BMessage message(B_KEY_DOWN);
        message.AddString("bytes", bytes.c_str());
        message.AddInt32("modifiers", static_cast<int32>(modifiers));
        message.AddInt32("raw_char", static_cast<uint8>(bytes[0]));
        Send(view, message);
    }
    void Key(BView* view, char byte, uint32 modifiers = 0) { Key(view, std::string(1, byte), modifiers); }
    void Send(BView* view, BMessage& message) {
        BMessage reply;
        BMessenger(view).SendMessage(&message, &reply);
    }

    // Clears and draws what is damaged, as a window does.
    void Redraw() {
        Locked([&] {
            mDrawn = mDamage;
            mDamage.MakeEmpty();
            mDrawing = true;
            for (BView* view : mViews) {
                view->ForgetClipping();
                DrawTree(view);
            }
            mDrawing = false;
            for (BView* view : mViews) {
                view->ForgetClipping();
            }
        });
    }
    // What the last Redraw() drew, and what waits.
    const BRegion& Drawn() const { return mDrawn; }
    BRegion& Damage() { return mDamage; }

    uint32 At(int32 x, int32 y) const {
        return reinterpret_cast<const uint32*>(mBitmap.Surface().Row(y))[x] & 0xFFFFFF;
    }
    int CountOf(uint32 color, BRect rect) const {
        int count = 0;
        for (auto y = static_cast<int32>(rect.top); y <= static_cast<int32>(rect.bottom); ++y) {
            for (auto x = static_cast<int32>(rect.left); x <= static_cast<int32>(rect.right); ++x) {
                count += At(x, y) == color;
            }
        }
        return count;
    }
    // Pixels that have not this colour, and the least red there is.
    int CountOther(uint32 color, BRect rect) const {
        return static_cast<int>((rect.Width() + 1) * (rect.Height() + 1)) - CountOf(color, rect);
    }
    uint32 Darkest(BRect rect) const {
        uint32 darkest = 255;
        for (auto y = static_cast<int32>(rect.top); y <= static_cast<int32>(rect.bottom); ++y) {
            for (auto x = static_cast<int32>(rect.left); x <= static_cast<int32>(rect.right); ++x) {
                darkest = std::min(darkest, At(x, y) >> 16);
            }
        }
        return darkest;
    }

  private:
    class StageLooper : public BLooper {
      public:
        explicit StageLooper(ViewStage* stage) : BLooper("stage"), mStage(stage) {}
        void DispatchMessage(BMessage* message, BHandler* handler) override {
            auto* const view = dynamic_cast<BView*>(handler);
            if (view != nullptr && Dispatch(message, view)) {
                BMessage done(B_REPLY);
                message->SendReply(&done);
                return;
            }
            BLooper::DispatchMessage(message, handler);
        }

      private:
        bool Dispatch(BMessage* message, BView* view) {
            BPoint where;
            (void)message->FindPoint("be:view_where", &where);
            switch (message->what) {
            case B_MOUSE_DOWN:
                view->MouseDown(where);
                return true;
            case B_MOUSE_MOVED:
                view->MouseMoved(where, B_INSIDE_VIEW, nullptr);
                return true;
            case B_MOUSE_UP:
                view->MouseUp(where);
                return true;
            case B_KEY_DOWN: {
                const char* bytes = nullptr;
                (void)message->FindString("bytes", &bytes);
                view->KeyDown(bytes, static_cast<int32>(std::string(bytes).size()));
                return true;
            }
            default:
                return false;
            }
        }
        ViewStage* const mStage;
    };

    void AddHandlers(BView* view) {
        mLooper->AddHandler(view);
        for (int32 i = 0; i < view->CountChildren(); ++i) {
            AddHandlers(view->ChildAt(i));
        }
    }
    void SendMouse(BView* view, BPoint where, uint32 modifiers, BMessage& message) {
        message.AddPoint("be:view_where", where);
        message.AddInt32("modifiers", static_cast<int32>(modifiers));
        Send(view, message);
    }
    void DrawTree(BView* view) {
        BRegion update = view->VisibleRegion(BView::Covered::WithoutChildren);
        BRegion damage = mDrawn;
        const BPoint origin = view->ConvertToSurface(B_ORIGIN);
        damage.OffsetBy(-static_cast<int32>(origin.x), -static_cast<int32>(origin.y));
        update.IntersectWith(&damage);
        if (!update.IsEmpty()) {
            view->PushState();
            if (view->ViewColor() != B_TRANSPARENT_COLOR) {
                view->SetHighColor(view->ViewColor());
                view->FillRect(view->Bounds());
            }
            view->PopState();
            view->Draw(update.Frame());
        }
        for (int32 i = 0; i < view->CountChildren(); ++i) {
            DrawTree(view->ChildAt(i));
        }
    }

    PixelSurface Surface() const override { return mBitmap.Surface(); }
    const BRegion* DrawingLimit() const override { return mDrawing ? &mDrawn : nullptr; }
    bool IsLocked() const override { return mLooper->IsLocked(); }
    void Invalidate(BView* view, const BRegion& region) override {
        BRegion damage = region;
        const BPoint origin = view->ConvertToSurface(B_ORIGIN);
        damage.OffsetBy(static_cast<int32>(origin.x), static_cast<int32>(origin.y));
        mDamage.Include(&damage);
    }
    void ViewRemoved(BView* view) override {
        if (mFocus == view) {
            mFocus = nullptr;
        }
        mLooper->RemoveHandler(view);
    }
    bool IsFocus(const BView* view) const override { return view == mFocus; }
    void SetFocus(BView* view, bool focus) override {
        if (!focus) {
            mFocus = mFocus == view ? nullptr : mFocus;
            return;
        }
        BView* const before = mFocus;
        if (before != nullptr && before != view) {
            before->MakeFocus(false);
        }
        mFocus = view;
    }
    status_t SetMouseEventMask(BView* /*view*/, uint32 /*mask*/, uint32 /*options*/) override { return B_OK; }

    BBitmap mBitmap;
    StageLooper* const mLooper; // deletes itself
    std::vector<BView*> mViews;
    BView* mFocus = nullptr;
    BRegion mDamage;
    BRegion mDrawn;
    bool mDrawing = false;
    bool mClosed = false;
};
