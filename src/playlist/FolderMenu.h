// What the right button shows of a file: where it lies.
#pragma once

struct entry_ref;
class BMenu;

// Adds the file, disabled, and the folders that it lies in, the nearest first, up to the root: IconMenuItems,
// which are the menu's. A file whose folder cannot be found has no folders. In the thread of the menu's user.
void AddFileAndFolders(BMenu& menu, const entry_ref& ref);
