#include <PopUpMenu.h>

#include "MenuSession.h"

#include <MenuItem.h>

#include <memory>

// One call of Go().
struct BPopUpMenu::Opening {
    BPopUpMenu* menu = nullptr;
    MenuSession::PopUpWish wish;
    bool deliversMessage = false;
};

REGISTER_ARCHIVABLE(BPopUpMenu);

BPopUpMenu::BPopUpMenu(const char* title, bool radioMode, bool labelFromMarked, menu_layout layout)
    : BMenu(title, layout) {
    BMenu::SetRadioMode(radioMode);
    if (labelFromMarked) {
        SetLabelFromMarked(true);
    }
}

BPopUpMenu::BPopUpMenu(BMessage* archive) : BMenu(archive) {}

BPopUpMenu::~BPopUpMenu() = default;

BArchivable* BPopUpMenu::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BPopUpMenu") ? new BPopUpMenu(archive) : nullptr;
}

BMenuItem* BPopUpMenu::Go(BPoint where, bool deliversMessage, bool openAnyway, bool async) {
    mWhere = where;
    return Start({this, {where, openAnyway, std::nullopt}, deliversMessage}, async);
}

BMenuItem* BPopUpMenu::Go(BPoint where, bool deliversMessage, bool openAnyway, BRect clickToOpen,
                          bool async) {
    mWhere = where;
    return Start({this, {where, openAnyway, clickToOpen}, deliversMessage}, async);
}

BMenuItem* BPopUpMenu::Start(const Opening& opening, bool async) {
    if (mOpen.exchange(true)) {
        return nullptr;
    }
    if (!async) {
        return Run(opening);
    }
    auto kept = std::make_unique<Opening>(opening);
    const thread_id thread =
        spawn_thread(&BPopUpMenu::ThreadEntry, "pop-up menu", B_DISPLAY_PRIORITY, kept.get());
    if (thread < 0 || resume_thread(thread) != B_OK) {
        kill_thread(thread);
        mOpen = false;
    } else {
        (void)kept.release(); // the thread's
    }
    return nullptr;
}

BMenuItem* BPopUpMenu::Run(const Opening& opening) {
    BMenuItem* const chosen = MenuSession::RunPopUp(this, opening.wish);
    if (chosen != nullptr && chosen->Menu()->IsRadioMode()) {
        chosen->SetMarked(true);
    }
    if (chosen != nullptr && opening.deliversMessage) {
        static_cast<BInvoker*>(chosen)->Invoke();
    }
    mOpen = false;
    return chosen;
}

int32 BPopUpMenu::ThreadEntry(void* data) {
    const std::unique_ptr<Opening> opening(static_cast<Opening*>(data));
    // Asked first: once the menu is not open any more, its owner may delete it.
    BPopUpMenu* const menu = opening->menu;
    const bool deletesItself = menu->AsyncAutoDestruct();
    menu->Run(*opening);
    if (deletesItself) {
        delete menu;
    }
    return 0;
}

BPoint BPopUpMenu::ScreenLocation() {
    return Supermenu() == nullptr ? mWhere : BMenu::ScreenLocation();
}
