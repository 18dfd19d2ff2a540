#include "input_translation.h"

#include <QInputMethodEvent>
#include <QKeyEvent>

#include <algorithm>
#include <cmath>

namespace host {

namespace {

KeyName key_name(int key) {
    switch (key) {
    case Qt::Key_Backspace:
        return KeyName::backspace;
    case Qt::Key_Tab:
    case Qt::Key_Backtab:
        return KeyName::tab;
    case Qt::Key_Return:
    case Qt::Key_Enter:
        return KeyName::enter;
    case Qt::Key_Escape:
        return KeyName::escape;
    case Qt::Key_Left:
        return KeyName::left;
    case Qt::Key_Right:
        return KeyName::right;
    case Qt::Key_Up:
        return KeyName::up;
    case Qt::Key_Down:
        return KeyName::down;
    case Qt::Key_Insert:
        return KeyName::insert;
    case Qt::Key_Delete:
        return KeyName::del;
    case Qt::Key_Home:
        return KeyName::home;
    case Qt::Key_End:
        return KeyName::end;
    case Qt::Key_PageUp:
        return KeyName::page_up;
    case Qt::Key_PageDown:
        return KeyName::page_down;
    case Qt::Key_Print:
    case Qt::Key_SysReq:
        return KeyName::print;
    case Qt::Key_ScrollLock:
        return KeyName::scroll_lock;
    case Qt::Key_Pause:
        return KeyName::pause;
    case Qt::Key_Menu:
        return KeyName::menu;
    case Qt::Key_Shift:
        return KeyName::shift;
    case Qt::Key_Control:
        return KeyName::control;
    case Qt::Key_Alt:
        // The right one makes characters on many keyboards and opens no menus.
        return KeyName::alt;
    case Qt::Key_Meta:
    case Qt::Key_Super_L:
    case Qt::Key_Super_R:
        return KeyName::super;
    case Qt::Key_CapsLock:
        return KeyName::caps_lock;
    default:
        return key >= Qt::Key_F1 && key <= Qt::Key_F35 ? KeyName::function : KeyName::none;
    }
}

} // namespace

std::uint32_t to_buttons(Qt::MouseButtons buttons) {
    std::uint32_t held = 0;
    held |= (buttons & Qt::LeftButton) != 0 ? primary_button : 0U;
    held |= (buttons & Qt::RightButton) != 0 ? secondary_button : 0U;
    held |= (buttons & Qt::MiddleButton) != 0 ? tertiary_button : 0U;
    return held;
}

std::uint32_t to_modifiers(Qt::KeyboardModifiers modifiers) {
    std::uint32_t held = 0;
    held |= (modifiers & Qt::ShiftModifier) != 0 ? shift_modifier : 0U;
    held |= (modifiers & Qt::ControlModifier) != 0 ? control_modifier : 0U;
    held |= (modifiers & Qt::AltModifier) != 0 ? alt_modifier : 0U;
    held |= (modifiers & Qt::MetaModifier) != 0 ? super_modifier : 0U;
    return held;
}

KeyInput to_key_input(const QKeyEvent& event) {
    KeyInput input;
    input.pressed = event.type() != QEvent::KeyRelease;
    input.repeated = event.isAutoRepeat();
    input.name = key_name(event.key());
    input.function_number = input.name == KeyName::function ? event.key() - Qt::Key_F1 + 1 : 0;
    input.text = event.text().toStdString();
    if (input.name == KeyName::none && event.key() > 0 && event.key() < 0x110000) {
        const char32_t character = static_cast<char32_t>(event.key());
        input.plain_text = QString::fromUcs4(&character, 1).toLower().toStdString();
    }
    input.code = event.nativeScanCode();
    input.modifiers = to_modifiers(event.modifiers());
    // Qt tells the modifiers as they were before the key; ours are those after it.
    std::uint32_t own = 0;
    switch (input.name) {
    case KeyName::shift:
        own = shift_modifier;
        break;
    case KeyName::control:
        own = control_modifier;
        break;
    case KeyName::alt:
        own = alt_modifier;
        break;
    case KeyName::super:
        own = super_modifier;
        break;
    default:
        break;
    }
    input.modifiers = input.pressed ? input.modifiers | own : input.modifiers & ~own;
    return input;
}

InputMethodText to_input_method_text(const QInputMethodEvent& event) {
    InputMethodText text;
    text.committed = event.commitString().toStdString();
    const QString& composed = event.preeditString();
    text.composed = composed.toStdString();
    text.caret = static_cast<int>(text.composed.size());
    for (const QInputMethodEvent::Attribute& attribute : event.attributes()) {
        if (attribute.type == QInputMethodEvent::Cursor) {
            text.caret = static_cast<int>(composed.left(attribute.start).toUtf8().size());
        }
    }
    return text;
}

int ClickCounter::press(std::uint32_t button, PointerPosition on_screen, std::int64_t now,
                        std::int64_t interval) {
    constexpr double reach = 4.0;
    const bool follows = count_ > 0 && button == button_ && now - time_ <= interval &&
                         std::abs(on_screen.x - where_.x) <= reach &&
                         std::abs(on_screen.y - where_.y) <= reach;
    count_ = follows ? count_ + 1 : 1;
    button_ = button;
    where_ = on_screen;
    time_ = now;
    return count_;
}

} // namespace host
