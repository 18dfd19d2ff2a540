// How menus look, for all of the program.
#include "ControlLook.h"

#include <CopyText.h>
#include <Menu.h>
#include <ThreadSafety.h>

namespace {

class MenuLooks {
  public:
    static MenuLooks& Instance() {
        static MenuLooks* const looks = new MenuLooks;
        return *looks;
    }
    menu_info Get() {
        GuardLock guard(mMutex);
        return mInfo;
    }
    void Set(const menu_info& info) {
        GuardLock guard(mMutex);
        mInfo = info;
    }

  private:
    MenuLooks() {
        be_plain_font->GetFamilyAndStyle(&mInfo.f_family, &mInfo.f_style);
        mInfo.font_size = be_plain_font->Size();
        mInfo.background_color = ui_color(B_MENU_BACKGROUND_COLOR);
        mInfo.click_to_open = true;
    }

    GuardMutex mMutex;
    menu_info mInfo GUARDED_BY(mMutex) = {};
};

} // namespace

status_t get_menu_info(menu_info* info) {
    if (info == nullptr) {
        return B_BAD_VALUE;
    }
    *info = MenuLooks::Instance().Get();
    return B_OK;
}

status_t set_menu_info(const menu_info* info) {
    if (info == nullptr) {
        return B_BAD_VALUE;
    }
    MenuLooks::Instance().Set(*info);
    return B_OK;
}
