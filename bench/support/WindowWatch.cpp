#include "support/WindowWatch.h"

#include "support/Figures.h"
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <sys/wait.h>
#include <unistd.h>
#include <xcb/xcb.h>

namespace bench {

namespace {

constexpr unsigned kWhite = 0xFFFFFF;

/// Replies of the server are the caller's to free.
template <typename Reply>
std::unique_ptr<Reply, decltype(&std::free)> Owned(Reply* reply) {
    return {reply, &std::free};
}

} // namespace

WindowWatch::WindowWatch() {
    int pipes[2];
    if (pipe(pipes) != 0)
        std::exit(1);
    mServer = fork();
    if (mServer == 0) {
        close(pipes[0]);
        const std::string number = std::to_string(pipes[1]);
        execlp("Xvfb", "Xvfb", "-displayfd", number.c_str(), "-screen", "0", "1280x1024x24", "-nolisten",
               "tcp", nullptr);
        std::perror("Xvfb");
        _exit(1);
    }
    close(pipes[1]);
    std::string display = ":";
    for (char digit = 0; read(pipes[0], &digit, 1) == 1 && digit != '\n';)
        display += digit;
    close(pipes[0]);
    setenv("DISPLAY", display.c_str(), 1);
    mConnection = xcb_connect(display.c_str(), nullptr);
    if (display == ":" || xcb_connection_has_error(mConnection) != 0) {
        std::fprintf(stderr, "no virtual display\n");
        std::exit(1);
    }
}

WindowWatch::~WindowWatch() {
    xcb_disconnect(mConnection);
    kill(mServer, SIGTERM);
    waitpid(mServer, nullptr, 0);
}

bool WindowWatch::WaitForWindow(const std::string& title, double seconds) {
    const Stopwatch watch;
    while (!IsShown(title)) {
        if (watch.Seconds() > seconds)
            return false;
        usleep(1000);
    }
    return true;
}

bool WindowWatch::IsShown(const std::string& title) const {
    const xcb_window_t root = xcb_setup_roots_iterator(xcb_get_setup(mConnection)).data->root;
    const auto tree = Owned(xcb_query_tree_reply(mConnection, xcb_query_tree(mConnection, root), nullptr));
    if (!tree)
        return false;
    const xcb_window_t* windows = xcb_query_tree_children(tree.get());
    for (int i = 0; i < xcb_query_tree_children_length(tree.get()); ++i) {
        const xcb_window_t window = windows[i];
        const auto name = Owned(xcb_get_property_reply(
            mConnection,
            xcb_get_property(mConnection, 0, window, XCB_ATOM_WM_NAME, XCB_GET_PROPERTY_TYPE_ANY, 0, 100),
            nullptr));
        if (!name ||
            std::string(static_cast<const char*>(xcb_get_property_value(name.get())),
                        static_cast<std::size_t>(xcb_get_property_value_length(name.get()))) != title)
            continue;
        const auto place =
            Owned(xcb_get_geometry_reply(mConnection, xcb_get_geometry(mConnection, window), nullptr));
        if (!place)
            continue;
        // Fails while the window is not shown.
        const auto pixel = Owned(
            xcb_get_image_reply(mConnection,
                                xcb_get_image(mConnection, XCB_IMAGE_FORMAT_Z_PIXMAP, window,
                                              static_cast<std::int16_t>(place->width / 8),
                                              static_cast<std::int16_t>(place->height * 3 / 5), 1, 1, ~0U),
                                nullptr));
        if (pixel && xcb_get_image_data_length(pixel.get()) >= 4 &&
            (*reinterpret_cast<const unsigned*>(xcb_get_image_data(pixel.get())) & kWhite) == kWhite)
            return true;
    }
    return false;
}

} // namespace bench
