#include "gui_application.h"

#include "host/api/display.h"
#include "host/api/threads.h"

#include <QGuiApplication>

#include <atomic>
#include <cerrno>
#include <mutex>
#include <string>

namespace host {

namespace {

std::atomic<bool> display_expected{false};

// Never deleted: fonts are used until the last thread ends, and static destructors come too early for that.
void make_application(int& argument_count, char** arguments) {
    [[maybe_unused]] static QGuiApplication* application = nullptr;
    // The desktop's own theme decides about fonts and times; what it would link in for its windows is not
    // wanted.
    application = new QGuiApplication(argument_count, arguments);
    // An object of ours must not decide when the process ends.
    QGuiApplication::setQuitOnLastWindowClosed(false);
}

void make_offscreen_application() {
    static int argc = 3;
    static char name[] = "bekits";
    static char option[] = "-platform";
    static char platform[] = "offscreen";
    static char* argv[] = {name, option, platform, nullptr};
    make_application(argc, argv);
}

bool on_first_thread() {
    return current_native_thread() == current_process();
}

} // namespace

void expect_display() {
    display_expected = true;
}

void make_display_application() {
    // The desktop knows a program's windows by its name.
    static int argc = 1;
    static char* argv[] = {program_invocation_short_name, nullptr};
    make_application(argc, argv);
}

bool ensure_gui_application() {
    static std::once_flag once;
    std::call_once(once, [] {
        if (QCoreApplication::instance() != nullptr) {
            return;
        }
        std::string problem;
        if (!display_expected || !on_first_thread() || !connect_display(&problem)) {
            make_offscreen_application();
        }
    });
    return qobject_cast<QGuiApplication*>(QCoreApplication::instance()) != nullptr;
}

} // namespace host
