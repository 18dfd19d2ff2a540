// Opens files with the programs that the user prefers, and folders in the user's file manager.
#pragma once

#include <EntryRef.h>

#include <string>
#include <vector>

// What cannot be opened is said on standard error, one line each. Stateless; any thread, and slow: other
// programs are asked and started.
class Opener {
  public:
    // Folders in the file manager; files in their preferred programs, where there is none by what the desktop
    // would try, and programs are only shown, never run. One that is not there is said to be gone.
    static void Open(const std::vector<entry_ref>& refs);
    // Selected in their folders' windows.
    static void Show(const std::vector<entry_ref>& refs);
};
