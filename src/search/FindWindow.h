// The "Find song" window: a text, and the songs that contain it.
#pragma once

#include "indexing/VolumeListEntry.h"

#include <EntryRef.h>
#include <Window.h>

#include <memory>
#include <vector>

class BMessage;
class BMessenger;
class BTextControl;
class BVolumeRoster;
class CLVContainerView;
class PlayListView;

// Made by the application, which it tells of itself as it opens, and shows itself. All of it runs in the
// window's thread, except the constructor. The volumes are those that there are at that time: what is mounted
// later is not searched, what is unmounted stays and has no hits.
class FindWindow : public BWindow {
  public:
    // `settings`, which may be null, is what SavePreferences() wrote.
    explicit FindWindow(BMessage* settings);
    ~FindWindow() override;

    void MessageReceived(BMessage* message) override;
    bool QuitRequested() override;

    // Lists the songs that contain the text (PushSongsContaining), volume after volume, in place of what the
    // list held. A volume that fails ends with what it has found, silently.
    void SearchFor(const char* text);
    // Unless the file is listed.
    void AddToList(entry_ref* ref);

    // The window's frame. Both do nothing for null. A frame that does not lie on the main screen as a whole
    // is not restored.
    void SavePreferences(BMessage* settings);
    void LoadPreferences(BMessage* settings);

    PlayListView* List() const { return mList; }

  private:
    void AddViews();
    void AddVolumes();
    void SearchVolume(VolumeListEntry& entry, const char* text);

    std::unique_ptr<BMessenger> mMessenger;
    std::unique_ptr<BVolumeRoster> mVolumeRoster;
    std::vector<std::unique_ptr<VolumeListEntry>> mVolumes;
    // These belong to the window.
    BTextControl* mFindText = nullptr;
    CLVContainerView* mContainer = nullptr;
    PlayListView* mList = nullptr;
};
