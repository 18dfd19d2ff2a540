// A list of songs in a window, worked on as the display would tell it. Nothing is shown: the application does
// not run.
#pragma once

#include "TrackVolume.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "playlist/PlayListItem.h"
#include "playlist/PlayListView.h"

#include "DragSession.h"
#include "WindowEvents.h"
#include "WindowHost.h"
#include "live_input_state.h"

#include <Application.h>
#include <Autolock.h>
#include <MessageQueue.h>
#include <Messenger.h>
#include <Window.h>

#include <cmath>
#include <memory>
#include <string>
#include <vector>

// A window at (100, 100) with a list of 480 by 286 pixels below its header, in front of a blue view.
class ListWindow : public BWindow {
  public:
    ListWindow() : BWindow(BRect(100, 100, 599, 399), "Songs", B_TITLED_WINDOW, 0) {
        auto* const back = new BView(Bounds(), "back", B_FOLLOW_ALL, B_WILL_DRAW);
        back->SetViewColor(34, 34, 119);
        AddChild(back);
        CLVContainerView* container = nullptr;
        list = new PlayListView(BRect(10, 0, 489, 286), &container);
        back->AddChild(container);
        list->MakeFocus();
        Show();
    }

    PlayListView* list; // the window's
};

class PlayListStage : public TrackTest {
  protected:
    typedef std::vector<int> Numbers;
    typedef std::vector<std::string> Names;

    PlayListStage() : PlayListStage(std::make_unique<BApplication>("application/x-vnd.Test-Playlist")) {}
    explicit PlayListStage(std::unique_ptr<BApplication> application) : mApplication(std::move(application)) {
        LiveInput().modifiers_are(0);
        LiveInput().pointer_at({0, 0}, 0);
        mWindow = new ListWindow;
        mEvents = mWindow->Host()->SharedEvents();
        mList = mWindow->list;
        const BAutolock lock(mWindow);
        mCorner = mList->ConvertToScreen(B_ORIGIN) - mWindow->Frame().LeftTop();
    }
    ~PlayListStage() override {
        if (mWindow != nullptr && mWindow->Lock())
            mWindow->Quit();
        DragSession::End();
        mApplication.reset();
    }

    template <typename Work>
    auto Locked(Work work) {
        const BAutolock lock(mWindow);
        return work();
    }
    // The window has handled all that was posted to it before.
    void Settle() {
        BMessage reply;
        EXPECT_EQ(BMessenger(mWindow).SendMessage('sync', &reply), B_OK);
    }

    static std::string MakeSong(const std::string& path, const std::string& name) {
        const std::string full = MakeFile(path);
        SetText(full, "Audio:Songname", name);
        return full;
    }
    void AddFile(const std::string& path) {
        entry_ref ref = RefOf(path);
        Locked([&] { mList->AddToList(&ref); });
    }
    // Rows "0.mp3", "1.mp3", ...
    void Fill(int count) {
        for (int i = 0; i < count; ++i)
            AddFile(MakeSong(std::to_string(i) + ".mp3", "Song " + std::to_string(i)));
    }
    // The leaf names of the rows' files, from top to bottom.
    Names Rows() {
        return Locked([&] {
            Names names;
            for (int32 i = 0; i < mList->CountItems(); ++i) {
                entry_ref ref;
                static_cast<PlayListItem*>(mList->ItemAt(i))->GetRef(&ref);
                names.emplace_back(ref.name);
            }
            return names;
        });
    }
    Numbers Selection() {
        return Locked([&] {
            Numbers rows;
            for (int32 i = 0; mList->CurrentSelection(i) >= 0; ++i)
                rows.push_back(mList->CurrentSelection(i));
            return rows;
        });
    }
    void Select(const Numbers& rows) {
        Locked([&] {
            mList->DeselectAll();
            for (const int row : rows)
                mList->Select(row, true);
        });
    }

    // In the window, which is not locked for it: who waits for the lock ends the press that is being
    // followed. The list is not scrolled; rows are 21 pixels high.
    BPoint InList(BPoint where) const { return mCorner + where; }
    BPoint On(int row) const { return InList(BPoint(60, static_cast<float>(21 * row + 10))); }

    static host::LiveInputState& LiveInput() { return host::LiveInputState::instance(); }
    static host::PointerPosition OnScreen(BPoint inWindow) {
        return {static_cast<double>(inWindow.x + 100), static_cast<double>(inWindow.y + 100)};
    }
    void TellPointer(host::PointerInput::Kind kind, BPoint where, std::uint32_t buttons, int clicks = 1) {
        LiveInput().pointer_at(OnScreen(where), buttons);
        host::PointerInput input;
        input.kind = kind;
        input.where = {static_cast<double>(where.x), static_cast<double>(where.y)};
        input.on_screen = OnScreen(where);
        input.buttons = buttons;
        input.clicks = clicks;
        mEvents->pointer(input);
        WaitUntilTaken();
    }
    void Press(BPoint where, std::uint32_t buttons = host::primary_button, int clicks = 1) {
        TellPointer(host::PointerInput::Kind::pressed, where, buttons, clicks);
    }
    void HoldTo(BPoint where) { TellPointer(host::PointerInput::Kind::moved, where, host::primary_button); }
    void Release(BPoint where) {
        TellPointer(host::PointerInput::Kind::released, where, 0);
        Settle();
    }
    void Click(BPoint where, int clicks = 1) {
        Press(where, host::primary_button, clicks);
        Release(where);
    }
    void Key(const std::string& text, host::KeyName name, std::uint32_t modifiers = 0) {
        host::KeyInput input;
        input.text = text;
        input.plain_text = text;
        input.name = name;
        input.modifiers = modifiers;
        mEvents->key(input);
        Settle();
    }

    std::unique_ptr<BApplication> mApplication;
    ListWindow* mWindow = nullptr; // deletes itself
    std::shared_ptr<WindowEvents> mEvents;
    PlayListView* mList = nullptr;

  private:
    BPoint mCorner;

    // By the window's thread, which may be following a held button and then takes nothing else.
    void WaitUntilTaken() {
        const auto waits = [this](uint32 what) {
            return mWindow->MessageQueue()->FindMessage(what, 0) != nullptr;
        };
        while (waits(B_MOUSE_DOWN) || waits(B_MOUSE_MOVED) || waits(B_MOUSE_UP))
            snooze(500);
    }
};
