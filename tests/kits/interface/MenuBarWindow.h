// A window with menus, a pop-up and an alert that writes down what is chosen from them.
#pragma once

#include "WindowWithApplication.h"

#include "host/api/display.h"

#include <Alert.h>
#include <MenuBar.h>
#include <MenuItem.h>
#include <PopUpMenu.h>

#include <atomic>
#include <string>

inline constexpr uint32 kOpenPopUp = 'popu';
inline constexpr uint32 kAsk = 'ask?';

inline std::string CodeOf(uint32 what) {
    std::string code;
    for (int shift = 24; shift >= 0; shift -= 8) {
        code += static_cast<char>(what >> shift);
    }
    return code;
}

// A window with a view below a menu bar: "File" with Open (Control+O), the disabled Print (Control+P) and
// Close, and "Edit" with Undo.
class MenuBarWindow : public NotingWindow {
  public:
    explicit MenuBarWindow(Notes& notes) : NotingWindow(BRect(100, 100, 499, 399), notes), mNotes(notes) {
        bar->AddItem(file);
        file->AddItem(new BMenuItem("Open", new BMessage('open'), 'O'));
        file->AddItem(new BMenuItem("Print", new BMessage('prnt'), 'P'));
        file->ItemAt(1)->SetEnabled(false);
        file->AddItem(new BMenuItem("Close", new BMessage('clos')));
        edit->AddItem(new BMenuItem("Undo", new BMessage('undo')));
        bar->AddItem(edit);
        AddChild(bar);
        AddChild(new NotingView(BRect(0, 21, 399, 299), "view", notes));
        popUp.AddItem(new BMenuItem("First", nullptr));
        popUp.AddItem(new BMenuItem("Second", new BMessage('secd')));
    }
    void MenusBeginning() override { mNotes.Add("beginning"); }
    void MenusEnded() override { mNotes.Add("ended"); }
    void MessageReceived(BMessage* message) override {
        if (message->what == kOpenPopUp) {
            FindView("view")->Invalidate();
            const BMenuItem* const chosen = popUp.Go(BPoint(200, 200));
            mNotes.Add(std::string("chose ") + (chosen == nullptr ? "nothing" : chosen->Label()));
        } else if (message->what == kAsk) {
            FindView("view")->Invalidate();
            alert = new BAlert("Ask", "Really?", "No", "Yes");
            const int32 answer = alert.load()->Go();
            alert = nullptr;
            mNotes.Add("answer " + std::to_string(answer));
        } else if (message->HasPointer("source")) {
            mNotes.Add(CodeOf(message->what) + " index " + std::to_string(message->GetInt32("index", -1)));
        } else {
            NotingWindow::MessageReceived(message);
        }
    }

    BMenuBar* const bar = new BMenuBar(BRect(0, 0, 300, 20), "menubar");
    BMenu* const file = new BMenu("File");
    BMenu* const edit = new BMenu("Edit");
    BPopUpMenu popUp{"popup", false, false};
    // While it is asked.
    std::atomic<BAlert*> alert{nullptr};

  private:
    Notes& mNotes;
};

// Menus measure text as soon as they are made, which has to wait for the display's own thread.
inline void RunWithDisplay(const std::function<void()>& body) {
    RunApplication([&body] {
        while (!host::display_connected()) {
            snooze(1000);
        }
        body();
    });
}
