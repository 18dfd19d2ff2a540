// What the main thread does while the application runs. Internal to the kits.
#pragma once

#include <string>

// Installed by whoever needs the main thread for itself (the windowing part); without one the main thread
// just waits for the application's looper to end.
class MainLoop {
  public:
    virtual ~MainLoop() = default;

    // Called in the thread that called BApplication::Run(), before the application's looper has its own.
    // False as for Run().
    virtual bool Prepare() { return true; }
    // Called in that thread, too. Returns after Quit(), also when that came first.
    // False when it cannot work (no display); the reason has been printed then, and the application's
    // Run() ends the process with exit status 1.
    virtual bool Run() = 0;
    // Called once, from the application's looper thread, as it ends.
    virtual void Quit() = 0;
    // Asks the program's windows whether they may go, and closes each one that agrees, the last made first.
    // False, and the others stay, as soon as one refuses. Called without the application locked.
    [[nodiscard]] virtual bool CloseWindows() { return true; }
    // Brings the program's windows to the front, because the user started the program again or another one
    // asks for it. `token` is what the desktop gave for this (its activation token or start-up id), empty for
    // none. Called from the application's looper thread; returns at once.
    virtual void Activate(const std::string& token) { (void)token; }
};

// Before BApplication::Run(); the loop must outlive it. Null takes it away.
void set_main_loop(MainLoop* loop);
MainLoop* main_loop();
