// The application object.
#pragma once

#include "app/WindowSlot.h"

#include <Application.h>
#include <SupportDefs.h>

#include <memory>

class BFile;
class BMenu;
class BMessage;
class BVolume;
class BVolumeRoster;
class SoundplayScripter;
class UnattendedJobs;

inline constexpr char kQuirnelSignature[] = "application/x-vnd.vorn-quirnel";

// One per process, kept in brindle_app. Starts the program, owns the windows' places, through its messages
// opens and closes them for each other (AppMessages.h), and ends the program with the last main window: that
// is the find or the indexer window. Its members are called in the application's own thread, except where
// they say otherwise.
class QuirnelApp : public BApplication {
  public:
    // Installs the application's MIME type when it is missing.
    QuirnelApp();
    // Ends the connection to the SoundPlay player, and cancels jobs that still run without their window.
    // Closes no window: QuitRequested() does.
    ~QuirnelApp() override;

    // Prepares file manager and volumes and opens the windows that were open last time; both main windows
    // where nothing is known.
    void ReadyToRun() override;
    // Codes about windows that come before ReadyToRun() are acted upon after it.
    void MessageReceived(BMessage* message) override;
    // Saves the settings, then closes the main windows without asking them.
    bool QuitRequested() override;
    // Saves the settings, for a session that may end before the program is asked to.
    void SaveStateRequested() override;
    // Shows the about box and waits until it is closed.
    void AboutRequested() override;

    // Ends the program if no main window is left. Any thread.
    void MaybeQuit();

    // The menu that all windows have; its messages go to the window that it is added to. The caller owns it.
    // `openCode` means nothing; "Close" sends `closeCode`. Any thread.
    BMenu* MakeFileMenu(long openCode, long closeCode);

    // The settings file holds a frame for each main window that was open. A null file stands for the
    // settings file itself, which is replaced as a whole or, when the new one cannot be written, stays as it
    // was; another one is read or written where it stands. Loading answers whether there was a file. One that
    // holds no settings, or no window, opens the find window. Says on standard output when there is no
    // directory for settings or the file cannot be written.
    bool LoadPreferences(BFile* file);
    void LoadPreferences(BMessage* settings);
    void SavePreferences(BFile* file);
    // Nothing for null.
    void SavePreferences(BMessage* settings);

    // The remote control of the SoundPlay player, made at the first call: always the same one, which belongs
    // to the application.
    SoundplayScripter* GetSoundplayScripter();

    // Windows fill their slots as they open, and empty them when they close by themselves.
    WindowSlot& IndexWindowSlot() { return mIndexWindow; }
    WindowSlot& FindWindowSlot() { return mFindWindow; }
    WindowSlot& PlayListWindowSlot() { return mPlayListWindow; }
    // Any thread.
    UnattendedJobs& JobsWithoutWindow() { return *mJobsWithoutWindow; }

    // Makes the attribute indices on every volume that knows attributes and queries. The walk over the
    // volumes goes on where the last one stopped: a second call finds no volume. Always 0.
    status_t CheckCreateIndices();

    // Makes the music attributes' indices on one volume; those that exist stay as they are. Always 0.
    status_t CreateIndices(BVolume* volume);

    // Makes the file manager offer the music attributes as columns of MP3 files. Those that are listed
    // already stay as they are; says on standard output which it adds. Always 0.
    status_t CheckTrackerDisplayAttributes();

    // Appends one column to an attribute-info message, unless the attribute is in it; says so on standard
    // output.
    void AddToMsg(BMessage* attributeInfo, const char* attributeName, const char* publicName, long type,
                  long width, long alignment);

  private:
    bool IsEarly(const BMessage& message) const;
    // With default frames where `settings` is null.
    void OpenIndexWindow(BMessage* settings);
    void OpenFindWindow(BMessage* settings);
    void OpenPlayListWindow(BMessage* settings);

    // Null until it is first needed.
    std::unique_ptr<SoundplayScripter> mScripter;
    // Null until it is first needed, then kept with its place in the list of volumes.
    std::unique_ptr<BVolumeRoster> mVolumeRoster;
    WindowSlot mPlayListWindow;
    WindowSlot mFindWindow;
    WindowSlot mIndexWindow;
    std::unique_ptr<UnattendedJobs> mJobsWithoutWindow;
};

// Null before main() has made the application and after it was deleted.
extern QuirnelApp* brindle_app;
