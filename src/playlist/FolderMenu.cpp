#include "playlist/FolderMenu.h"

#include "widgets/IconMenuItem.h"

#include <Entry.h>
#include <EntryRef.h>
#include <Menu.h>

void AddFileAndFolders(BMenu& menu, const entry_ref& ref) {
    BEntry entry(&ref);
    auto* const file = new IconMenuItem(&entry);
    file->SetEnabled(false);
    menu.AddItem(file);
    while (entry.GetParent(&entry) == B_OK)
        menu.AddItem(new IconMenuItem(&entry));
}
