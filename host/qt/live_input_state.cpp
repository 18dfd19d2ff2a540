#include "live_input_state.h"

namespace host {

LiveInputState& LiveInputState::instance() {
    static LiveInputState* const state = new LiveInputState;
    return *state;
}

LiveInput LiveInputState::get() {
    const MutexLock lock(mutex_);
    return now_;
}

void LiveInputState::pointer_at(PointerPosition on_screen, std::uint32_t buttons) {
    const MutexLock lock(mutex_);
    now_.on_screen = on_screen;
    now_.buttons = buttons;
}

void LiveInputState::buttons_are(std::uint32_t buttons) {
    const MutexLock lock(mutex_);
    now_.buttons = buttons;
}

void LiveInputState::modifiers_are(std::uint32_t modifiers) {
    const MutexLock lock(mutex_);
    now_.modifiers = modifiers;
}

LiveInput live_input() {
    return LiveInputState::instance().get();
}

} // namespace host
