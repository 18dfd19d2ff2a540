// Qt's names of keys, buttons and modifiers turned into ours.
#pragma once

#include "host/api/display.h"

#include <Qt>

class QInputMethodEvent;
class QKeyEvent;

namespace host {

std::uint32_t to_buttons(Qt::MouseButtons buttons);
std::uint32_t to_modifiers(Qt::KeyboardModifiers modifiers);
KeyInput to_key_input(const QKeyEvent& event);

// What an input method says: text that is finished, and then text that it is working on, UTF-8.
struct InputMethodText {
    std::string committed;
    std::string composed;
    int caret = 0; // in `composed`, in bytes; its end unless the event says otherwise
};
InputMethodText to_input_method_text(const QInputMethodEvent& event);

// Counts presses that follow each other quickly in one place.
class ClickCounter {
  public:
    // `now` and `interval` in milliseconds. The count that this press makes: 1, 2, 3 ...
    int press(std::uint32_t button, PointerPosition on_screen, std::int64_t now, std::int64_t interval);

  private:
    std::uint32_t button_ = 0;
    PointerPosition where_;
    std::int64_t time_ = 0;
    int count_ = 0;
};

} // namespace host
