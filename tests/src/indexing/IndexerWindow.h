// The indexer window without a display. The application object does not run here, so that what it is sent can
// be looked at.
#pragma once

#include "indexing/FileIndexWindow.h"

#include "VolumeJobs.h"
#include "app/QuirnelApp.h"
#include "indexing/UnattendedJobs.h"

#include <Button.h>
#include <ListView.h>
#include <MessageQueue.h>

#include <memory>
#include <string>

class IndexerWindow : public TrackTest {
  protected:
    IndexerWindow() {
        TestVolumes::Instance();
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
    }
    ~IndexerWindow() override {
        mApp->IndexWindowSlot().Close();
        mApp.reset();
        brindle_app = nullptr;
    }

    void Open(BMessage* settings = nullptr) { mWindow = new FileIndexWindow(settings); }
    template <typename Use>
    void WithWindow(Use use) {
        bool used = false;
        mApp->IndexWindowSlot().UseLocked([&](BWindow*) {
            use();
            used = true;
        });
        ASSERT_TRUE(used);
    }
    BListView* List() const { return dynamic_cast<BListView*>(mWindow->FindView("volumelist")); }
    FileIndexListItem* Row(int32 index) const {
        return dynamic_cast<FileIndexListItem*>(List()->ItemAt(index));
    }
    BButton* Button(const char* name) const { return dynamic_cast<BButton*>(mWindow->FindView(name)); }
    // Which of Status, Strip, Index and Stop can be pressed.
    std::string Enabled() {
        std::string enabled;
        WithWindow([&] {
            for (const char* name : {"stat", "strip", "index", "stop"})
                enabled += Button(name)->IsEnabled() ? std::string(name) + " " : "";
        });
        return enabled;
    }
    // The window has handled all that was posted to it before.
    void Settle() {
        BMessage reply;
        EXPECT_EQ(BMessenger(mWindow).SendMessage('sync', &reply), B_OK);
    }
    void Post(uint32 what) {
        mWindow->PostMessage(what);
        Settle();
    }
    void Select(int32 row) {
        WithWindow([&] { List()->Select(row); });
        Settle();
    }
    void Pulse() {
        WithWindow([&] { mWindow->Pulse(); });
    }
    int CountSentToApp(uint32 what) const {
        int count = 0;
        while (mApp->MessageQueue()->FindMessage(what, count) != nullptr)
            ++count;
        return count;
    }
    static void MakeFiles(int count) {
        for (int i = 0; i < count; ++i)
            MakeFile(std::to_string(i % 20) + "/Artist - " + std::to_string(i) + ".mp3");
    }
    static int CountTagged() {
        int count = 0;
        for (const auto& entry : std::filesystem::recursive_directory_iterator(Volume()))
            count += entry.is_regular_file() && RawAttribute(entry.path(), "Audio:Songname").has_value();
        return count;
    }

    std::unique_ptr<QuirnelApp> mApp;
    FileIndexWindow* mWindow = nullptr;
};

inline constexpr int32 kMusicRow = 0;
inline constexpr int32 kSecondRow = 1;
inline constexpr int32 kUnsupportedRow = 4;
