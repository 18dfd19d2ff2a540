#include "screen_window.h"

#include "live_input_state.h"
#include "popup_stack.h"

#include <QDrag>
#include <QEvent>
#include <QGuiApplication>
#include <QPainter>
#include <QScreen>
#include <QStyleHints>

#include <algorithm>
#include <cmath>

namespace host {

namespace {

constexpr std::int64_t default_frame_time = 16; // milliseconds

QRect to_rect(const Area& area) {
    return {area.left, area.top, std::max(area.width, 1), std::max(area.height, 1)};
}

Area to_area(const QRect& rect) {
    return {rect.x(), rect.y(), rect.width(), rect.height()};
}

Qt::WindowFlags to_flags(const WindowOptions& options) {
    Qt::WindowFlags flags;
    switch (options.kind) {
    case WindowKind::popup:
        return Qt::Popup | Qt::FramelessWindowHint | Qt::NoDropShadowWindowHint;
    case WindowKind::borderless:
        flags = Qt::Window | Qt::FramelessWindowHint;
        break;
    case WindowKind::bordered:
        flags = Qt::Window | Qt::CustomizeWindowHint;
        break;
    case WindowKind::floating:
        flags = Qt::Tool | Qt::CustomizeWindowHint | Qt::WindowTitleHint;
        break;
    case WindowKind::modal:
        flags = Qt::Dialog | Qt::CustomizeWindowHint | Qt::WindowTitleHint;
        break;
    case WindowKind::titled:
    case WindowKind::document:
        flags = Qt::Window | Qt::CustomizeWindowHint | Qt::WindowTitleHint | Qt::WindowSystemMenuHint;
        break;
    }
    flags.setFlag(Qt::WindowCloseButtonHint, options.closable);
    flags.setFlag(Qt::WindowMinimizeButtonHint, options.minimizable);
    flags.setFlag(Qt::WindowMaximizeButtonHint, options.zoomable && options.resizable);
    flags.setFlag(Qt::WindowDoesNotAcceptFocus, !options.takes_focus);
    flags.setFlag(Qt::WindowStaysOnTopHint, options.stays_on_top);
    return flags;
}

// Hears for windows that are on their way out.
class DeafListener : public WindowListener {
  public:
    void area_changed(Area /*content*/, std::uint64_t /*wishes*/) override {}
    void scale_changed(double /*scale*/) override {}
    void margins_changed(FrameMargins /*margins*/) override {}
    void activated(bool /*active*/) override {}
    void state_changed(WindowState /*state*/) override {}
    void close_requested() override {}
    void pointer(const PointerInput& /*input*/) override {}
    void wheel(const WheelInput& /*input*/) override {}
    void key(const KeyInput& /*input*/) override {}
    void text_committed(const std::string& /*text*/) override {}
    void text_composed(const std::string& /*text*/, int /*caret*/) override {}
    void drag(const DragInput& /*input*/) override {}
    void drag_ended(bool /*accepted*/) override {}
    void popups_dismissed() override {}
    void screens_changed() override {}
    void pulse() override {}
};

std::shared_ptr<WindowListener> deaf_listener() {
    static auto* const listener = new std::shared_ptr<WindowListener>(std::make_shared<DeafListener>());
    return *listener;
}

// The one window that the program takes for the active one, whatever pop-ups the focus passes through.
ScreenWindow* active_window = nullptr;

} // namespace

ScreenWindow::ScreenWindow(std::shared_ptr<WindowPicture> picture, std::shared_ptr<WindowListener> listener)
    : picture_(std::move(picture)), listener_(std::move(listener)), store_(this) {
    setSurfaceType(QSurface::RasterSurface);
    QObject::connect(this, &QWindow::screenChanged, this, [this] { tell_scale(); });
    QObject::connect(this, &QWindow::windowStateChanged, this, [this] { state_changed(windowStates()); });
}

ScreenWindow::~ScreenWindow() {
    PopupStack::instance().remove(this);
    if (active_window == this) {
        active_window = nullptr;
    }
}

void ScreenWindow::apply_options(const WindowOptions& options) {
    options_ = options;
    // To Qt an empty title means the program's name.
    setTitle(options.title.empty() ? QStringLiteral(" ") : QString::fromStdString(options.title));
    if (const Qt::WindowFlags wanted = to_flags(options); wanted != flags()) {
        setFlags(wanted);
    }
    setMinimumSize({options.least.width, options.least.height});
    setMaximumSize({options.most.width, options.most.height});
    const Qt::WindowModality modality = options.modal_to_program ? Qt::ApplicationModal : Qt::NonModal;
    if (this->modality() != modality) {
        setModality(modality);
    }
}

void ScreenWindow::place(Area content, std::uint64_t wishes) {
    wishes_ = wishes;
    if (geometry() == to_rect(content)) {
        // Told all the same: the wish was heard.
        told_anything_ = false;
        tell_area();
        return;
    }
    setGeometry(to_rect(content));
    if (!isVisible()) {
        tell_area();
    }
}

void ScreenWindow::appear() {
    if (is_popup()) {
        if (transientParent() == nullptr) {
            setTransientParent(QGuiApplication::focusWindow());
        }
        setVisible(true);
        PopupStack::instance().push(this);
        return;
    }
    if (options_.kind == WindowKind::modal || options_.kind == WindowKind::floating) {
        QWindow* const active = QGuiApplication::focusWindow();
        if (transientParent() == nullptr && active != this) {
            setTransientParent(active);
        }
    }
    setVisible(true);
    tell_scale();
}

void ScreenWindow::disappear() {
    PopupStack::instance().remove(this);
    setVisible(false);
}

void ScreenWindow::leave() {
    if (QGuiApplication::mouseButtons() != Qt::NoButton) {
        // Without effect unless it is this program that drags.
        QDrag::cancel();
    }
    listener_ = deaf_listener();
    disappear();
    deleteLater();
}

void ScreenWindow::set_active(bool active) {
    if (active == active_) {
        return;
    }
    if (active && active_window != nullptr) {
        active_window->set_active(false);
    }
    active_window = active ? this : nullptr;
    active_ = active;
    listener_->activated(active);
}

void ScreenWindow::program_left() {
    if (active_window != nullptr) {
        active_window->set_active(false);
    }
}

void ScreenWindow::take_activation_token(const std::string& token) {
    // Read by Qt when it next activates a window; on X11 the request's time says the same.
    if (QGuiApplication::platformName() == QLatin1String("wayland")) {
        qputenv("XDG_ACTIVATION_TOKEN", QByteArray::fromStdString(token));
    }
}

void ScreenWindow::set_minimized(bool minimized) {
    Qt::WindowStates states = windowStates();
    states.setFlag(Qt::WindowMinimized, minimized);
    setWindowStates(states);
}

void ScreenWindow::set_maximized(bool maximized) {
    setWindowStates(maximized ? Qt::WindowMaximized : Qt::WindowNoState);
}

void ScreenWindow::come_to_front() {
    if ((windowStates() & Qt::WindowMinimized) != 0) {
        set_minimized(false);
    }
    raise();
    if (options_.takes_focus) {
        requestActivate();
    }
}

void ScreenWindow::set_pulse(std::int64_t interval) {
    if (interval <= 0) {
        pulse_timer_.stop();
        return;
    }
    pulse_timer_.start(static_cast<int>(std::clamp<std::int64_t>(interval / 1000, 1, 3600000)),
                       Qt::PreciseTimer, this);
}

void ScreenWindow::set_text_input(bool wanted, Area caret) {
    const bool switched = wanted != text_input_;
    text_input_ = wanted;
    caret_ = caret;
    if (isActive()) {
        QGuiApplication::inputMethod()->update(switched ? Qt::ImQueryAll : Qt::ImCursorRectangle);
    }
}

void ScreenWindow::picture_changed() {
    if (!isExposed() || frame_timer_.isActive()) {
        // Shown when the window is, or with the frame that is due already.
        return;
    }
    const double rate = screen() != nullptr ? screen()->refreshRate() : 0;
    const std::int64_t frame_time =
        rate > 1 ? std::clamp<std::int64_t>(std::llround(1000 / rate), 4, 100) : default_frame_time;
    const std::int64_t passed = since_present_.isValid() ? since_present_.elapsed() : frame_time;
    if (passed >= frame_time) {
        present(WindowPicture::Extent::changed);
    } else {
        frame_timer_.start(static_cast<int>(frame_time - passed), Qt::PreciseTimer, this);
    }
}

void ScreenWindow::timerEvent(QTimerEvent* event) {
    if (event->timerId() == frame_timer_.timerId()) {
        frame_timer_.stop();
        present(WindowPicture::Extent::changed);
    } else if (event->timerId() == pulse_timer_.timerId()) {
        listener_->pulse();
    } else {
        QWindow::timerEvent(event);
    }
}

void ScreenWindow::present(WindowPicture::Extent extent) {
    if (!isExposed() || picture_->is_empty()) {
        return;
    }
    since_present_.start();
    if (store_.size() != size()) {
        // The new store holds nothing.
        store_.resize(size());
        extent = WindowPicture::Extent::all;
    }
    const QRect whole(QPoint(0, 0), size());
    store_.beginPaint(whole);
    QRegion shown;
    QPaintDevice* const device = store_.paintDevice();
    auto* const image =
        device != nullptr && device->devType() == QInternal::Image ? static_cast<QImage*>(device) : nullptr;
    const bool direct = image != nullptr && image->depth() == 32 && image->bytesPerLine() % 4 == 0;
    QImage copy;
    if (!direct && device != nullptr) {
        const double scale = devicePixelRatio();
        copy = QImage(QSize(static_cast<int>(std::lround(width() * scale)),
                            static_cast<int>(std::lround(height() * scale))),
                      QImage::Format_RGB32);
        extent = WindowPicture::Extent::all;
    }
    QImage* const target = direct ? image : &copy;
    if (!target->isNull()) {
        uchar* const bits = target->bits();
        if (bits != stored_bits_ || target->bytesPerLine() != stored_row_) {
            // Other memory than last time holds less than was shown: the store works with several buffers, or
            // has made a new one to have room for a frame.
            extent = WindowPicture::Extent::all;
            stored_bits_ = bits;
            stored_row_ = target->bytesPerLine();
        }
        const std::vector<DeviceRect> written =
            picture_->take(extent, reinterpret_cast<std::uint32_t*>(bits),
                           static_cast<std::size_t>(target->bytesPerLine()) / sizeof(std::uint32_t),
                           {target->width(), target->height()});
        const double scale = devicePixelRatio();
        for (const DeviceRect& rect : written) {
            const QPoint left_top(static_cast<int>(std::floor(rect.left / scale)),
                                  static_cast<int>(std::floor(rect.top / scale)));
            const QPoint right_bottom(static_cast<int>(std::ceil(rect.right / scale)) - 1,
                                      static_cast<int>(std::ceil(rect.bottom / scale)) - 1);
            shown += QRect(left_top, right_bottom);
        }
        if (!direct) {
            copy.setDevicePixelRatio(scale);
            QPainter(device).drawImage(0, 0, copy);
        }
    }
    store_.endPaint();
    if (!shown.isEmpty()) {
        store_.flush(shown & whole);
    }
}

void ScreenWindow::exposeEvent(QExposeEvent* /*event*/) {
    if (isExposed()) {
        tell_scale();
        tell_area();
        present(WindowPicture::Extent::all);
    }
}

void ScreenWindow::resizeEvent(QResizeEvent* /*event*/) {
    tell_scale();
    tell_area();
}

void ScreenWindow::moveEvent(QMoveEvent* /*event*/) {
    tell_area();
}

void ScreenWindow::tell_area() {
    const Area area = to_area(geometry());
    if (!told_anything_ || !(area == told_area_)) {
        told_anything_ = true;
        told_area_ = area;
        listener_->area_changed(area, wishes_);
    }
    const QMargins around = frameMargins();
    const FrameMargins margins{around.left(), around.top(), around.right(), around.bottom()};
    if (!(margins == told_margins_)) {
        told_margins_ = margins;
        listener_->margins_changed(margins);
    }
}

void ScreenWindow::tell_scale() {
    const double scale = devicePixelRatio();
    if (scale != told_scale_) {
        told_scale_ = scale;
        listener_->scale_changed(scale);
    }
}

void ScreenWindow::state_changed(Qt::WindowStates state) {
    if ((state & Qt::WindowMinimized) != 0) {
        listener_->state_changed(WindowState::minimized);
    } else if ((state & Qt::WindowMaximized) != 0) {
        listener_->state_changed(WindowState::maximized);
    } else {
        listener_->state_changed(WindowState::normal);
    }
}

} // namespace host
