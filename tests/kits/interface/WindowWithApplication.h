// A running application, and windows that write down what happens to them.
#pragma once

#include "WindowEvents.h"
#include "WindowHost.h"

#include <Application.h>
#include <Autolock.h>
#include <View.h>
#include <Window.h>

#include <algorithm>
#include <atomic>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <utility>
#include <vector>

// Runs `body` in a thread of its own while the main thread serves the display, as in any program.
inline void RunApplication(const std::function<void()>& body) {
    BApplication application("application/x-vnd.Test-Windows");
    std::thread worker([&] {
        body();
        application.PostMessage(B_QUIT_REQUESTED);
    });
    application.Run();
    worker.join();
}

// Lines of text from any thread.
class Notes {
  public:
    void Add(const std::string& line) {
        const std::lock_guard<std::mutex> lock(mMutex);
        mLines.push_back(line);
    }
    std::vector<std::string> Take() {
        const std::lock_guard<std::mutex> lock(mMutex);
        return std::exchange(mLines, {});
    }
    int Count(const std::string& line) {
        const std::lock_guard<std::mutex> lock(mMutex);
        return static_cast<int>(std::count(mLines.begin(), mLines.end(), line));
    }
    // False when the line does not come within some seconds.
    bool WaitFor(const std::string& line, int count = 1) {
        for (int i = 0; i < 2000; ++i) {
            if (Count(line) >= count) {
                return true;
            }
            snooze(5000);
        }
        return false;
    }

  private:
    std::mutex mMutex;
    std::vector<std::string> mLines;
};

class NotingView : public BView {
  public:
    NotingView(BRect frame, const char* name, Notes& notes, uint32 flags = B_WILL_DRAW | B_NAVIGABLE,
               uint32 resizing = B_FOLLOW_ALL)
        : BView(frame, name, resizing, flags), mNotes(notes) {}
    void Draw(BRect) override { Note("draw"); }
    void MouseDown(BPoint where) override {
        const BMessage* const message = Window()->CurrentMessage();
        Note("down " + std::to_string(static_cast<int>(where.x)) + "," +
             std::to_string(static_cast<int>(where.y)) + " buttons " +
             std::to_string(message->GetInt32("buttons", -1)) + " clicks " +
             std::to_string(message->GetInt32("clicks", -1)));
    }
    void MouseUp(BPoint) override { Note("up"); }
    void MouseMoved(BPoint, uint32 code, const BMessage* dragged) override {
        Note("moved " + std::to_string(code) + (dragged != nullptr ? " dragging" : ""));
    }
    void KeyDown(const char* bytes, int32 count) override {
        Note("key " + std::string(bytes, static_cast<size_t>(count)));
        BView::KeyDown(bytes, count);
    }
    void MakeFocus(bool focus) override {
        BView::MakeFocus(focus);
        Note(focus ? "focus" : "no focus");
    }
    void FrameResized(float width, float height) override {
        Note("resized " + std::to_string(static_cast<int>(width)) + "x" +
             std::to_string(static_cast<int>(height)));
    }
    void WindowActivated(bool active) override { Note(active ? "active" : "inactive"); }
    void MessageReceived(BMessage* message) override {
        if (message->WasDropped()) {
            Note("dropped");
        } else if (message->what == B_SELECT_ALL) {
            Note("select all");
        } else {
            BView::MessageReceived(message);
        }
    }
    void Pulse() override { Note("pulse"); }

  protected:
    void Note(const std::string& what) { mNotes.Add(std::string(Name()) + ": " + what); }
    Notes& mNotes;
};

class NotingWindow : public BWindow {
  public:
    NotingWindow(BRect frame, Notes& notes, uint32 flags = 0, window_type type = B_TITLED_WINDOW)
        : BWindow(frame, "Noting", type, flags), mNotes(notes) {}
    ~NotingWindow() override { mNotes.Add("window: gone"); }
    void DispatchMessage(BMessage* message, BHandler* handler) override {
        mDispatched++;
        BWindow::DispatchMessage(message, handler);
    }
    void MessageReceived(BMessage* message) override {
        if (message->what == 'test') {
            mNotes.Add("window: test");
            return;
        }
        if (message->what == 'work' && work) {
            work();
            mNotes.Add("window: worked");
            return;
        }
        BWindow::MessageReceived(message);
    }
    void FrameResized(float width, float height) override {
        mNotes.Add("window: resized " + std::to_string(static_cast<int>(width)) + "x" +
                   std::to_string(static_cast<int>(height)));
    }
    void FrameMoved(BPoint where) override {
        mNotes.Add("window: moved " + std::to_string(static_cast<int>(where.x)) + "," +
                   std::to_string(static_cast<int>(where.y)));
    }
    void WindowActivated(bool active) override { mNotes.Add(active ? "window: active" : "window: inactive"); }
    bool QuitRequested() override {
        mNotes.Add("window: quit requested");
        return true;
    }
    int Dispatched() const { return mDispatched; }

    // Done in the window's thread when the message 'work' comes. Set before it is posted.
    std::function<void()> work;

  private:
    Notes& mNotes;
    std::atomic<int> mDispatched{0};
};
