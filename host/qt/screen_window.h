// The main thread's side of a window: Qt's window, its backing store and its events.
#pragma once

#include "drag_visit.h"
#include "window_picture.h"

#include "host/api/display.h"

#include <QBackingStore>
#include <QBasicTimer>
#include <QElapsedTimer>
#include <QWindow>

#include <memory>

class QDropEvent;

namespace host {

// Main thread only. Turns Qt's events into calls of the listener, and shows the picture.
class ScreenWindow : public QWindow {
  public:
    ScreenWindow(std::shared_ptr<WindowPicture> picture, std::shared_ptr<WindowListener> listener);
    ~ScreenWindow() override;

    void apply_options(const WindowOptions& options);
    // `wishes` counts the calls so far, this one included.
    void place(Area content, std::uint64_t wishes);
    void appear();
    void disappear();
    void set_minimized(bool minimized);
    void set_maximized(bool maximized);
    void come_to_front();
    void set_pulse(std::int64_t interval);
    void set_text_input(bool wanted, Area caret);
    void start_drag(const DragContents& contents);
    // The picture has changed: shows it at the next frame.
    void picture_changed();
    void screens_changed() { listener_->screens_changed(); }
    // Hides the window; it tells its listener nothing any more and deletes itself.
    void leave();
    // For the next window that comes to the front.
    static void take_activation_token(const std::string& token);
    bool is_popup() const { return options_.kind == WindowKind::popup; }

    WindowListener& listener() { return *listener_; }
    PointerPosition to_content(PointerPosition on_screen) const;

  protected:
    bool event(QEvent* event) override;
    void exposeEvent(QExposeEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void moveEvent(QMoveEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void keyReleaseEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    // The press that makes it a double click has come as an ordinary one before.
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void timerEvent(QTimerEvent* event) override;

  private:
    void present(WindowPicture::Extent extent);
    void tell_area();
    void tell_scale();
    void key_event(QKeyEvent* event);
    void mouse_event(QMouseEvent* event, PointerInput::Kind kind);
    void drag_event(QDropEvent* event, DragInput::Kind kind);
    void input_method_query(QEvent* event) const;
    void end_composing();
    void state_changed(Qt::WindowStates state);
    void set_active(bool active);
    // The focus has left all of the program's windows.
    static void program_left();

    const std::shared_ptr<WindowPicture> picture_;
    std::shared_ptr<WindowListener> listener_;
    WindowOptions options_;
    QBackingStore store_;
    // Where the store had its pixels when they were written last, and the bytes of a row of them.
    const uchar* stored_bits_ = nullptr;
    qsizetype stored_row_ = 0;
    QBasicTimer frame_timer_;
    QBasicTimer pulse_timer_;
    QElapsedTimer since_present_;
    std::uint64_t wishes_ = 0;
    Area told_area_;
    double told_scale_ = 0;
    FrameMargins told_margins_;
    bool told_anything_ = false;
    bool active_ = false;
    bool text_input_ = false;
    bool composing_ = false;
    Area caret_;
    DragVisit drag_visit_;
};

} // namespace host
