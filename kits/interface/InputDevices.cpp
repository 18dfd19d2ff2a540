// The keyboard and the mouse as they are at the moment.
#include "KeyTranslation.h"

#include <InterfaceDefs.h>

#include "host/api/display.h"
#include "host/api/threads.h"

uint32 modifiers() {
    return ModifiersOf(host::live_input().modifiers);
}

status_t get_key_info(key_info* info) {
    if (info == nullptr) {
        return B_BAD_VALUE;
    }
    *info = {};
    info->modifiers = modifiers();
    return B_OK;
}

status_t get_click_speed(bigtime_t* speed) {
    if (speed == nullptr) {
        return B_BAD_VALUE;
    }
    *speed = host::double_click_time();
    return B_OK;
}

status_t set_click_speed(bigtime_t speed) {
    if (speed <= 0) {
        return B_BAD_VALUE;
    }
    host::set_double_click_time(speed);
    return B_OK;
}
