// The "Indexer" window: the persistent volumes, and buttons that start or stop a job on one of them.
#pragma once

#include <Window.h>

#include <memory>
#include <vector>

class BButton;
class BListView;
class BMessage;
class BVolumeRoster;
class FileIndexListItem;

// Made by the application, which it tells of itself as it opens, and shows itself. All of it runs in the
// window's thread, except the constructor. The volumes are those that there are at that time.
//
// Jobs are looked at five times a second. The close box (B_QUIT_REQUESTED) stops all jobs and waits for them
// before the window goes. When the application closes it otherwise, as the menu's "Close" has it do, jobs
// that are at work go on without it (UnattendedJobs).
class FileIndexWindow : public BWindow {
  public:
    // `settings`, which may be null, is what SavePreferences() wrote.
    explicit FileIndexWindow(BMessage* settings);
    ~FileIndexWindow() override;

    // Redraws the rows whose jobs are at work or have just ended.
    void Pulse();
    // Enables what can be done with that row. Nothing for null. The list gets the keyboard where the button
    // that had it is disabled.
    void UpdateButtons(FileIndexListItem* item);

    void MessageReceived(BMessage* message) override;
    bool QuitRequested() override;

    // The window's frame. Both do nothing for null. A frame that does not lie on the main screen as a whole
    // is not restored.
    void SavePreferences(BMessage* settings);
    void LoadPreferences(BMessage* settings);

  private:
    void AddViews();
    void AddVolumes();
    // Null when no row is selected.
    FileIndexListItem* SelectedItem() const;
    void StartJob(FileIndexListItem* item, void (FileIndexListItem::*start)());
    // Empties the list.
    std::vector<std::unique_ptr<FileIndexListItem>> TakeItems();

    std::unique_ptr<BVolumeRoster> mVolumeRoster;
    // The views belong to the window. The rows are the window's own, the list only shows them.
    BListView* mVolumeList = nullptr;
    BButton* mStatusButton = nullptr;
    BButton* mStripButton = nullptr;
    BButton* mIndexButton = nullptr;
    BButton* mStopButton = nullptr;
};
