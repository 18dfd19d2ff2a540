#include "support/desktop.h"

#include "support/program.h"

#include <array>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace test {
namespace {

void pause_for(int milliseconds) {
    std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
}

/// Ends with this process, whatever becomes of it.
pid_t start(const std::vector<std::string>& words) {
    std::vector<char*> arguments;
    for (const std::string& word : words)
        arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    const pid_t process = fork();
    if (process == 0) {
        const int nothing = open("/dev/null", O_RDWR);
        dup2(nothing, STDIN_FILENO);
        dup2(nothing, STDOUT_FILENO);
        dup2(nothing, STDERR_FILENO);
        // The checkers' options are not for programs that are not ours.
        unsetenv("LD_PRELOAD");
        execvp(arguments[0], arguments.data());
        _exit(127);
    }
    return process;
}

void end(pid_t process) {
    if (process > 0) {
        kill(process, SIGTERM);
        waitpid(process, nullptr, 0);
    }
}

/// Xvfb's own choice of a free number, or empty.
std::string read_display_number(int pipe) {
    std::string text;
    pollfd ready{pipe, POLLIN, 0};
    while (text.find('\n') == std::string::npos && poll(&ready, 1, 20000) > 0) {
        std::array<char, 16> part{};
        const ssize_t size = read(pipe, part.data(), part.size());
        if (size <= 0)
            break;
        text.append(part.data(), static_cast<size_t>(size));
    }
    return text.substr(0, text.find('\n'));
}

std::string trimmed(std::string text) {
    while (!text.empty() && text.back() == '\n')
        text.pop_back();
    return text;
}

} // namespace

Desktop::Desktop(WindowManager manager) {
    int pipes[2] = {-1, -1};
    if (pipe(pipes) != 0)
        return;
    fcntl(pipes[0], F_SETFD, FD_CLOEXEC);
    server_ = start({"Xvfb", "-displayfd", std::to_string(pipes[1]), "-screen", "0", "1280x1024x24",
                     "+extension", "XTEST", "-nolisten", "tcp"});
    close(pipes[1]);
    const std::string number = read_display_number(pipes[0]);
    close(pipes[0]);
    if (number.empty()) {
        std::fprintf(stderr, "desktop: Xvfb does not start\n");
        return;
    }
    display_ = ":" + number;
    setenv("DISPLAY", display_.c_str(), 1);
    unsetenv("WAYLAND_DISPLAY");
    unsetenv("QT_QPA_PLATFORM");
    // Where there is no session bus, looking for one would start one: by a fork in the middle of a program of
    // many threads, which a sanitizer does not always survive.
    setenv("DBUS_SESSION_BUS_ADDRESS", "disabled:", 0);
    if (manager == WindowManager::openbox) {
        manager_ = start({"openbox"});
        // It tells the root window when it is there.
        for (int i = 0; i < 200 && tool({"get_num_desktops"}).empty(); ++i)
            pause_for(50);
        // It tells so before it is ready, and a window that comes between waits for the next event to be
        // seen.
        pause_for(1000);
    }
    works_ = true;
}

Desktop::~Desktop() {
    end(manager_);
    end(server_);
}

std::string Desktop::tool(const std::vector<std::string>& words) const {
    return trimmed(run_program("/usr/bin/xdotool", words).output);
}

void Desktop::move_pointer(int x, int y) const {
    tool({"mousemove", std::to_string(x), std::to_string(y)});
    pause_for(30);
}

void Desktop::press(int button) const {
    tool({"mousedown", std::to_string(button)});
    pause_for(30);
}

void Desktop::release(int button) const {
    tool({"mouseup", std::to_string(button)});
    pause_for(30);
}

void Desktop::click(int x, int y, int button) const {
    move_pointer(x, y);
    press(button);
    release(button);
}

void Desktop::drag(int from_x, int from_y, int to_x, int to_y, int pause) const {
    constexpr int steps = 20;
    move_pointer(from_x, from_y);
    press();
    for (int i = 1; i <= steps; ++i) {
        move_pointer(from_x + (to_x - from_x) * i / steps, from_y + (to_y - from_y) * i / steps);
        pause_for(pause);
    }
    pause_for(200);
    release();
}

void Desktop::key(const std::string& name) const {
    tool({"key", name});
    pause_for(30);
}

std::string Desktop::window(const std::string& title, int seconds) const {
    for (int i = 0; i < seconds * 10; ++i) {
        const std::string found = tool({"search", "--onlyvisible", "--name", "^" + title + "$"});
        if (!found.empty())
            return found.substr(0, found.find('\n'));
        pause_for(100);
    }
    return {};
}

std::uint32_t Desktop::pixel(int x, int y) const {
    const std::string place = "1x1+" + std::to_string(x) + "+" + std::to_string(y);
    const std::string bytes =
        run_program("/usr/bin/import", {"-silent", "-window", "root", "-crop", place, "-depth", "8", "rgb:-"})
            .output;
    std::uint32_t color = 0;
    for (size_t i = 0; i < 3 && i < bytes.size(); ++i)
        color = color << 8 | static_cast<unsigned char>(bytes[i]);
    return color;
}

bool Desktop::becomes(int x, int y, std::uint32_t color) const {
    for (int i = 0; i < 300; ++i) {
        if (pixel(x, y) == color)
            return true;
        pause_for(100);
    }
    return false;
}

void Desktop::screenshot(const std::string& path) const {
    run_program("/usr/bin/import", {"-silent", "-window", "root", path});
}

} // namespace test
