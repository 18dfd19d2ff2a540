// WindowLoop: the main loop of a program with windows. Internal to the kits.
#pragma once

#include "MainLoop.h"

#include <SupportDefs.h>
#include <ThreadSafety.h>

#include <condition_variable>

// Installed by being linked: a program that knows BWindow has it from its start on. It runs the display's
// events in the thread that calls BApplication::Run(), which must be the process's first, and ends it with
// one line on standard error and exit status 1 when there is no display. What has to be there before the
// first window and the first text is there before the application's own thread begins.
class WindowLoop : public MainLoop {
  public:
    // In main(), before Run(), a window may be made already. Without effect elsewhere.
    static void Connect();

    bool Prepare() override;
    bool Run() override;
    void Quit() override;
    // Waits for a window that is busy. One that does not run yet is another thread's in the making and is
    // left alone; pop-ups belong to their menus.
    [[nodiscard]] bool CloseWindows() override;
    // Every window that is not hidden, the last made in front. One that is busy stays where it is.
    void Activate(const std::string& token) override;

    // Constructed once, before main().
    WindowLoop();

  private:
    // In the main thread, when the display has gone in the middle of Run().
    void EndApplication();
    // False when Quit() is not called in time.
    bool WaitForQuit(bigtime_t timeout);

    GuardMutex mMutex;
    std::condition_variable mQuitCalled;
    bool mQuits GUARDED_BY(mMutex) = false;
};
