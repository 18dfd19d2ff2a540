#include "gui_application.h"

#include <QGuiApplication>

#include <mutex>

namespace host {

namespace {

void make_offscreen_application() {
    static int argc = 3;
    static char name[] = "bekits";
    static char option[] = "-platform";
    static char platform[] = "offscreen";
    static char* argv[] = {name, option, platform, nullptr};
    // Never deleted: fonts are used until the last thread ends, and static destructors come too early for
    // that.
    [[maybe_unused]] static QGuiApplication* application = nullptr;
    application = new QGuiApplication(argc, argv);
    // An object of ours must not decide when the process ends.
    QGuiApplication::setQuitOnLastWindowClosed(false);
}

} // namespace

bool ensure_gui_application() {
    static std::once_flag once;
    std::call_once(once, [] {
        if (QCoreApplication::instance() == nullptr) {
            make_offscreen_application();
        }
    });
    return qobject_cast<QGuiApplication*>(QCoreApplication::instance()) != nullptr;
}

} // namespace host
