#include "support/wayland_desktop.h"

#include "support/program.h"
#include "support/temporary_environment.h"

#include <array>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <sys/wait.h>
#include <unistd.h>

namespace test {
namespace {

constexpr const char* kSocket = "wayland-of-a-test";

pid_t start_compositor(const std::string& log) {
    const pid_t process = fork();
    if (process != 0)
        return process;
    const int file = open(log.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    dup2(file, STDOUT_FILENO);
    dup2(file, STDERR_FILENO);
    unsetenv("WAYLAND_DISPLAY");
    unsetenv("DISPLAY");
    // The checkers' options are not for programs that are not ours.
    unsetenv("LD_PRELOAD");
    // Pictures of the screen are only given away in the mode for debugging.
    execlp("weston", "weston", "--backend=headless-backend.so", "--use-pixman", "--no-config", "--debug",
           "--idle-time=0", "--width=1280", "--height=1024", (std::string("--socket=") + kSocket).c_str(),
           nullptr);
    _exit(127);
}

bool can_run(const char* program) {
    return run_program("/usr/bin/which", {program}).status == 0;
}

} // namespace

std::string WaylandDesktop::problem() {
    for (const char* program : {"weston", "weston-screenshooter"}) {
        if (!can_run(program))
            return std::string(program) + " is not installed";
    }
    return {};
}

WaylandDesktop::WaylandDesktop() : folder_(make_directory_with_attributes()) {
    const std::filesystem::path socket = std::filesystem::path(std::getenv("XDG_RUNTIME_DIR")) / kSocket;
    compositor_ = start_compositor(folder_ + "/log");
    for (int i = 0; i < 300 && !std::filesystem::exists(socket); ++i)
        usleep(100000);
    if (!std::filesystem::exists(socket)) {
        std::fprintf(stderr, "desktop: Weston does not start\n%s", read_file(folder_ + "/log").c_str());
        return;
    }
    setenv("WAYLAND_DISPLAY", kSocket, 1);
    unsetenv("DISPLAY");
    unsetenv("QT_QPA_PLATFORM");
    // Where there is no session bus, looking for one would start one: by a fork in the middle of a program of
    // many threads, which a sanitizer does not always survive.
    setenv("DBUS_SESSION_BUS_ADDRESS", "disabled:", 0);
    works_ = true;
}

WaylandDesktop::~WaylandDesktop() {
    if (compositor_ > 0) {
        kill(compositor_, SIGTERM);
        waitpid(compositor_, nullptr, 0);
    }
    remove_tree(folder_);
}

bool WaylandDesktop::screenshot(const std::string& path) const {
    const std::string shots = folder_ + "/shots";
    remove_tree(shots);
    std::filesystem::create_directory(shots);
    if (run_program("/usr/bin/env", {"-C", shots, "weston-screenshooter"}).status != 0)
        return false;
    for (const auto& entry : std::filesystem::directory_iterator(shots)) {
        std::filesystem::copy_file(entry.path(), path, std::filesystem::copy_options::overwrite_existing);
        return true;
    }
    return false;
}

long WaylandDesktop::count_pixels(unsigned color) const {
    const std::string picture = folder_ + "/picture.png";
    if (!screenshot(picture))
        return -1;
    std::array<char, 16> name{};
    std::snprintf(name.data(), name.size(), "#%06X", color);
    const ProgramResult colors = run_program(
        "/usr/bin/convert", {picture, "-depth", "8", "-alpha", "off", "-format", "%c", "histogram:info:"});
    for (const std::string& line : lines_of(colors.output)) {
        if (line.find(name.data()) != std::string::npos)
            return std::atol(line.c_str());
    }
    return colors.status == 0 ? 0 : -1;
}

} // namespace test
