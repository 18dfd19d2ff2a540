// A find window without a display. The application object does not run, so that what it is sent can be looked
// at.
#pragma once

#include "TrackVolume.h"
#include "app/QuirnelApp.h"
#include "playlist/PlayListItem.h"
#include "playlist/PlayListView.h"
#include "search/FindWindow.h"

#include <Autolock.h>
#include <MessageQueue.h>
#include <Messenger.h>
#include <Node.h>
#include <TextControl.h>
#include <TypeConstants.h>

#include <memory>
#include <string>
#include <vector>

class FindWindowStage : public TrackTest {
  protected:
    typedef std::vector<std::string> Names;

    FindWindowStage() {
        TestVolumes::Instance();
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
        mApp->CheckCreateIndices();
    }
    ~FindWindowStage() override {
        mApp->FindWindowSlot().Close();
        mApp.reset();
        brindle_app = nullptr;
    }
    void Open(BMessage* settings = nullptr) { mWindow = new FindWindow(settings); }
    template <typename Use>
    void WithWindow(Use use) {
        bool used = false;
        mApp->FindWindowSlot().UseLocked([&](BWindow*) {
            use();
            used = true;
        });
        ASSERT_TRUE(used);
    }
    BTextControl* Field() const { return dynamic_cast<BTextControl*>(mWindow->FindView("findtext")); }
    void Settle() {
        BMessage reply;
        EXPECT_EQ(BMessenger(mWindow).SendMessage('sync', &reply), B_OK);
    }
    void Post(BMessage message) {
        mWindow->PostMessage(&message);
        Settle();
    }
    const BMessage* SentToApp(uint32 what) const { return mApp->MessageQueue()->FindMessage(what, 0); }

    // As a program that knows of the index writes it.
    static void Write(const std::string& path, const char* attribute, const std::string& text) {
        BNode node(path.c_str());
        ASSERT_EQ(node.WriteAttr(attribute, B_STRING_TYPE, 0, text.c_str(), text.size() + 1),
                  static_cast<ssize_t>(text.size() + 1))
            << path;
    }
    static std::string MakeSong(const std::string& path, const std::string& name) {
        const std::string full = MakeFile(path);
        Write(full, "Audio:Songname", name);
        return full;
    }

    // The leaf names of the rows' files, from top to bottom.
    Names Rows() {
        Names names;
        WithWindow([&] {
            PlayListView* const list = mWindow->List();
            for (int32 i = 0; i < list->CountItems(); ++i) {
                entry_ref ref;
                static_cast<PlayListItem*>(list->ItemAt(i))->GetRef(&ref);
                names.emplace_back(ref.name);
            }
        });
        return names;
    }
    Names Find(const std::string& text) {
        WithWindow([&] { mWindow->SearchFor(text.c_str()); });
        return Rows();
    }

    std::unique_ptr<QuirnelApp> mApp;
    FindWindow* mWindow = nullptr;
};
