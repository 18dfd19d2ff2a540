// The connection to the display, and the loop that serves it.
#include "gui_application.h"
#include "main_thread.h"
#include "screen_list.h"
#include "screen_window.h"

#include "host/api/display.h"
#include "host/api/threads.h"

#include <QGuiApplication>
#include <QSessionManager>
#include <QStyleHints>

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <utility>

namespace host {

namespace {

std::atomic<bool> connected{false};
std::atomic<bool> loop_to_end{false};
std::function<void()>& save_handler() {
    static std::function<void()> handler;
    return handler;
}

std::function<void()>& quit_handler() {
    static auto* const handler = new std::function<void()>;
    return *handler;
}

std::function<void()>& loss_handler() {
    static auto* const handler = new std::function<void()>;
    return *handler;
}
QtMessageHandler usual_message_handler = nullptr;

bool is_set(const char* variable) {
    const char* const value = std::getenv(variable);
    return value != nullptr && value[0] != '\0';
}

bool has_display() {
    return is_set("DISPLAY") || is_set("WAYLAND_DISPLAY") || is_set("QT_QPA_PLATFORM");
}

// Qt ends the process when its platform does not answer. It shall say so as we would, and not leave a core.
void end_without_display(QtMsgType type, const QMessageLogContext& /*context*/, const QString& text) {
    if (type == QtFatalMsg) {
        const char* const display = std::getenv("DISPLAY");
        const char* const wayland = std::getenv("WAYLAND_DISPLAY");
        std::fprintf(stderr, "cannot open the display %s\n",
                     wayland != nullptr ? wayland : (display != nullptr ? display : ""));
        std::_Exit(EXIT_FAILURE);
    }
    if (type == QtCriticalMsg) {
        std::fprintf(stderr, "%s\n", text.toLocal8Bit().constData());
    }
}

// What Qt says, on X11 and on Wayland, before it ends the process from within its loop. Nothing else tells,
// and threads that are at work would run on while everything is torn down around them.
bool tells_of_loss(const QString& text) {
    return text.contains(QLatin1String("connection broke")) ||
           text.contains(QLatin1String("connection experienced a fatal error"));
}

void watch_for_loss(QtMsgType type, const QMessageLogContext& context, const QString& text) {
    if (!MainThread::instance().is_current() || !tells_of_loss(text)) {
        usual_message_handler(type, context, text);
        return;
    }
    std::fprintf(stderr, "the display has gone\n");
    if (loss_handler()) {
        loss_handler()();
    }
    std::fflush(nullptr);
    std::_Exit(EXIT_FAILURE);
}

// What the session's end is made into; left alone, it would close the windows one by one and end the loop.
class EndOfSession : public QObject {
  public:
    using QObject::QObject;
    bool eventFilter(QObject* object, QEvent* event) override {
        if (object != qApp || event->type() != QEvent::Quit) {
            return QObject::eventFilter(object, event);
        }
        if (quit_handler()) {
            quit_handler()();
        }
        event->accept();
        return true;
    }
};

void serve_session() {
    qApp->installEventFilter(new EndOfSession(qApp));
    QObject::connect(qApp, &QGuiApplication::commitDataRequest, qApp, [](QSessionManager& /*session*/) {
        if (save_handler()) {
            save_handler()();
        }
    });
    // The session restarts what the user starts; a copy that it makes by itself would be a second one.
    QObject::connect(qApp, &QGuiApplication::saveStateRequest, qApp,
                     [](QSessionManager& session) { session.setRestartHint(QSessionManager::RestartNever); });
}

} // namespace

bool connect_display(std::string* problem) {
    if (connected) {
        return true;
    }
    if (QCoreApplication::instance() == nullptr) {
        if (!has_display()) {
            *problem = "there is no display: neither DISPLAY nor WAYLAND_DISPLAY is set";
            return false;
        }
        const QtMessageHandler before = qInstallMessageHandler(end_without_display);
        make_display_application();
        qInstallMessageHandler(before);
    }
    if (qobject_cast<QGuiApplication*>(QCoreApplication::instance()) == nullptr) {
        *problem = "the display cannot be used: the program has begun without one";
        return false;
    }
    set_double_click_time(
        static_cast<std::int64_t>(QGuiApplication::styleHints()->mouseDoubleClickInterval()) * 1000);
    usual_message_handler = qInstallMessageHandler(watch_for_loss);
    serve_session();
    ScreenList::instance().follow();
    MainThread::instance().start();
    connected = true;
    return true;
}

bool display_connected() {
    return connected;
}

void run_display() {
    if (!loop_to_end.exchange(false)) {
        QCoreApplication::exec();
        loop_to_end = false;
    }
}

void end_display_loop() {
    loop_to_end = true;
    // Behind everything that was asked for before.
    MainThread::instance().add([] {
        if (loop_to_end) {
            // Not quit(), which would ask the windows: their own threads have been asked already.
            QCoreApplication::exit(0);
        }
    });
}

void set_save_handler(std::function<void()> handler) {
    save_handler() = std::move(handler);
}

void set_quit_handler(std::function<void()> handler) {
    quit_handler() = std::move(handler);
}

void set_loss_handler(std::function<void()> handler) {
    loss_handler() = std::move(handler);
}

void run_on_main_thread(std::function<void()> task) {
    MainThread::instance().add(std::move(task));
}

} // namespace host
