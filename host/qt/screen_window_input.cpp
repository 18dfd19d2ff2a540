// The part of ScreenWindow that deals with input and drags.
#include "screen_window.h"

#include "cursor_shapes.h"
#include "data_formats.h"
#include "input_translation.h"
#include "live_input_state.h"
#include "popup_stack.h"

#include <QDrag>
#include <QDropEvent>
#include <QGuiApplication>
#include <QInputMethodEvent>
#include <QMimeData>
#include <QPainter>
#include <QPixmap>
#include <QStyleHints>

#include <chrono>

namespace host {

namespace {

// One for all windows: a double click has one place and one time.
ClickCounter& click_counter() {
    static ClickCounter counter;
    return counter;
}

// On the clock that uptime_nanoseconds() reads.
std::int64_t now_in_microseconds() {
    return std::chrono::duration_cast<std::chrono::microseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

PointerPosition to_position(QPointF point) {
    return {point.x(), point.y()};
}

QPixmap drag_picture(const DragContents& contents) {
    if (const QImage image = to_image(contents.picture); !image.isNull()) {
        return QPixmap::fromImage(image);
    }
    QImage outline(std::max(contents.outline.width, 1), std::max(contents.outline.height, 1),
                   QImage::Format_ARGB32_Premultiplied);
    outline.fill(Qt::transparent);
    QPainter painter(&outline);
    painter.setPen(QColor(96, 96, 96));
    painter.drawRect(outline.rect().adjusted(0, 0, -1, -1));
    painter.end();
    return QPixmap::fromImage(outline);
}

} // namespace

PointerPosition ScreenWindow::to_content(PointerPosition on_screen) const {
    const QPoint origin = geometry().topLeft();
    return {on_screen.x - origin.x(), on_screen.y - origin.y()};
}

bool ScreenWindow::event(QEvent* event) {
    switch (event->type()) {
    case QEvent::Close:
        // Whether the window goes is decided in its own thread.
        event->ignore();
        if (is_popup()) {
            PopupStack::instance().dismiss();
        } else if (options_.closable) {
            listener_->close_requested();
        }
        return true;
    case QEvent::Leave: {
        PointerInput input;
        input.kind = PointerInput::Kind::left;
        const LiveInput live = live_input();
        input.on_screen = live.on_screen;
        input.where = to_content(live.on_screen);
        input.buttons = live.buttons;
        input.modifiers = live.modifiers;
        input.when = now_in_microseconds();
        if (PopupStack::instance().empty()) {
            listener_->pointer(input);
        }
        return true;
    }
    case QEvent::InputMethodQuery:
        input_method_query(event);
        return true;
    case QEvent::InputMethod: {
        const InputMethodText text = to_input_method_text(*static_cast<QInputMethodEvent*>(event));
        if (!text.committed.empty() || text.composed.empty()) {
            end_composing();
        }
        if (!text.committed.empty()) {
            listener_->text_committed(text.committed);
        }
        if (!text.composed.empty()) {
            composing_ = true;
            listener_->text_composed(text.composed, text.caret);
        }
        return true;
    }
    case QEvent::DragEnter:
        drag_event(static_cast<QDropEvent*>(event), DragInput::Kind::entered);
        return true;
    case QEvent::DragMove:
        drag_event(static_cast<QDropEvent*>(event), DragInput::Kind::moved);
        return true;
    case QEvent::Drop:
        drag_event(static_cast<QDropEvent*>(event), DragInput::Kind::dropped);
        return true;
    case QEvent::DragLeave: {
        DragInput input;
        input.kind = DragInput::Kind::left;
        const LiveInput live = live_input();
        input.on_screen = live.on_screen;
        input.where = to_content(live.on_screen);
        input.buttons = live.buttons;
        input.modifiers = live.modifiers;
        input.when = now_in_microseconds();
        drag_visit_.end();
        listener_->drag(input);
        return true;
    }
    default:
        return QWindow::event(event);
    }
}

void ScreenWindow::focusInEvent(QFocusEvent* /*event*/) {
    if (!is_popup()) {
        set_active(true);
    }
}

void ScreenWindow::focusOutEvent(QFocusEvent* /*event*/) {
    const auto* const next = dynamic_cast<ScreenWindow*>(QGuiApplication::focusWindow());
    if (next != nullptr && next->is_popup()) {
        // Some window managers give pop-ups the focus; to the program its window stays the active one.
        return;
    }
    // A pop-up that goes hands the focus back to the window that was active all the time; the others stay.
    const bool handed_back = is_popup() && next != nullptr && next->active_;
    if (!handed_back) {
        PopupStack::instance().dismiss();
    }
    if (next == nullptr) {
        program_left();
    } else {
        // Of a pop-up that goes, the window that gets the focus tells the one that was active.
        set_active(false);
    }
}

void ScreenWindow::keyPressEvent(QKeyEvent* event) {
    key_event(event);
}

void ScreenWindow::keyReleaseEvent(QKeyEvent* event) {
    key_event(event);
}

void ScreenWindow::key_event(QKeyEvent* event) {
    KeyInput input = to_key_input(*event);
    input.when = now_in_microseconds();
    LiveInputState::instance().modifiers_are(input.modifiers);
    ScreenWindow* const popup = PopupStack::instance().top();
    (popup != nullptr ? popup : this)->listener_->key(input);
}

void ScreenWindow::mousePressEvent(QMouseEvent* event) {
    mouse_event(event, PointerInput::Kind::pressed);
}

void ScreenWindow::mouseReleaseEvent(QMouseEvent* event) {
    mouse_event(event, PointerInput::Kind::released);
}

void ScreenWindow::mouseMoveEvent(QMouseEvent* event) {
    mouse_event(event, PointerInput::Kind::moved);
}

void ScreenWindow::mouseDoubleClickEvent(QMouseEvent* /*event*/) {}

void ScreenWindow::mouse_event(QMouseEvent* event, PointerInput::Kind kind) {
    PointerInput input;
    input.kind = kind;
    input.on_screen = to_position(event->globalPosition());
    input.buttons = to_buttons(event->buttons());
    input.modifiers = to_modifiers(event->modifiers());
    input.when = now_in_microseconds();
    if (kind != PointerInput::Kind::moved && to_buttons(event->button()) == 0) {
        // A button that the kits have no name for.
        return;
    }
    if (kind == PointerInput::Kind::pressed) {
        input.clicks = click_counter().press(to_buttons(event->button()), input.on_screen,
                                             static_cast<std::int64_t>(event->timestamp()),
                                             QGuiApplication::styleHints()->mouseDoubleClickInterval());
    }
    LiveInputState::instance().pointer_at(input.on_screen, input.buttons);
    LiveInputState::instance().modifiers_are(input.modifiers);
    PopupStack& popups = PopupStack::instance();
    ScreenWindow* target = this;
    if (!popups.empty()) {
        target = popups.at(event->globalPosition());
        input.outside_popups = target == nullptr;
        target = target == nullptr ? popups.bottom() : target;
    }
    input.where = target == this ? to_position(event->position()) : target->to_content(input.on_screen);
    target->listener_->pointer(input);
}

void ScreenWindow::wheelEvent(QWheelEvent* event) {
    WheelInput input;
    // An eighth of a degree is Qt's unit, fifteen degrees a wheel's step.
    constexpr double step = 120.0;
    input.across = -event->angleDelta().x() / step;
    input.down = -event->angleDelta().y() / step;
    input.modifiers = to_modifiers(event->modifiers());
    input.when = now_in_microseconds();
    ScreenWindow* target = this;
    if (!PopupStack::instance().empty()) {
        target = PopupStack::instance().at(event->globalPosition());
    }
    if (target != nullptr && (input.across != 0 || input.down != 0)) {
        input.where = target->to_content(to_position(event->globalPosition()));
        target->listener_->wheel(input);
    }
}

void ScreenWindow::input_method_query(QEvent* event) const {
    auto* const query = static_cast<QInputMethodQueryEvent*>(event);
    const Qt::InputMethodQueries queries = query->queries();
    if ((queries & Qt::ImEnabled) != 0) {
        query->setValue(Qt::ImEnabled, text_input_);
    }
    if ((queries & Qt::ImCursorRectangle) != 0) {
        query->setValue(Qt::ImCursorRectangle, QRect(caret_.left, caret_.top, caret_.width, caret_.height));
    }
    if ((queries & Qt::ImHints) != 0) {
        query->setValue(Qt::ImHints, static_cast<int>(Qt::ImhNone));
    }
    query->accept();
}

void ScreenWindow::end_composing() {
    if (composing_) {
        composing_ = false;
        listener_->text_composed({}, 0);
    }
}

void ScreenWindow::drag_event(QDropEvent* event, DragInput::Kind kind) {
    DragInput input;
    input.kind = kind;
    input.own = event->source() != nullptr;
    if (!input.own) {
        input.data = event->mimeData() != nullptr ? drag_visit_.data_of(*event->mimeData()) : nullptr;
        if (input.data == nullptr) {
            event->ignore();
            return;
        }
    }
    input.where = to_position(event->position());
    input.on_screen = to_position(mapToGlobal(event->position()));
    input.modifiers = to_modifiers(event->modifiers());
    input.when = now_in_microseconds();
    // Other programs' drags do not say which button is held; dragging is done with the first.
    const std::uint32_t buttons = to_buttons(event->buttons());
    input.buttons = kind == DragInput::Kind::dropped ? 0 : (buttons != 0 ? buttons : primary_button);
    LiveInputState::instance().pointer_at(input.on_screen, input.buttons);
    if (kind == DragInput::Kind::dropped) {
        drag_visit_.end();
    }
    // Only ever a copy: nobody may delete the files because we have taken them.
    event->setDropAction(Qt::CopyAction);
    event->accept();
    listener_->drag(input);
}

void ScreenWindow::start_drag(const DragContents& contents) {
    if (LiveInputState::instance().get().buttons == 0) {
        // Let go while the request was on its way.
        listener_->drag_ended(false);
        return;
    }
    // Qt deletes it when the drag is over.
    auto* const drag = new QDrag(this);
    drag->setMimeData(to_mime_data(contents.data));
    const QPixmap picture = drag_picture(contents);
    drag->setPixmap(picture);
    drag->setHotSpot({contents.hot_spot.x, contents.hot_spot.y});
    const std::shared_ptr<WindowListener> listener = listener_;
    // Runs events until the button is let go; this window may be gone then.
    const Qt::DropAction action = drag->exec(Qt::CopyAction);
    LiveInputState::instance().buttons_are(0);
    listener->drag_ended(action != Qt::IgnoreAction);
}

} // namespace host
