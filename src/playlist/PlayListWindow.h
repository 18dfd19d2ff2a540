// The "Playlist" window: the songs that the user collects.
#pragma once

#include <Window.h>

class BMessage;
class CLVContainerView;
class PlayListView;

// Made by the application, which it tells of itself as it opens, and shows itself. All of it runs in the
// window's thread, except the constructor. The songs are gone with the window.
class PlayListWindow : public BWindow {
  public:
    // `settings`, which may be null, is what SavePreferences() wrote.
    explicit PlayListWindow(BMessage* settings);
    ~PlayListWindow() override;

    void MessageReceived(BMessage* message) override;
    // Does not ask the application whether to end: this window does not keep it, on purpose.
    bool QuitRequested() override;

    // The window's frame. Both do nothing for null. A frame that does not lie on the main screen as a whole
    // is not restored.
    void SavePreferences(BMessage* settings);
    void LoadPreferences(BMessage* settings);

    PlayListView* List() const { return mList; }

  private:
    void AddViews();

    // Both belong to the window.
    CLVContainerView* mContainer = nullptr;
    PlayListView* mList = nullptr;
};
