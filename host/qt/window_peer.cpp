// What a thread holds of its window: requests to the main thread, and the picture.
#include "cursor_shapes.h"
#include "main_thread.h"
#include "screen_window.h"

#include <QDrag>

#include <atomic>

namespace host {

namespace {

class QtWindowPeer : public WindowPeer {
  public:
    explicit QtWindowPeer(std::shared_ptr<WindowListener> listener)
        : shared_(std::make_shared<Shared>(std::move(listener))) {}
    ~QtWindowPeer() override { close(); }

    void set_options(const WindowOptions& options) override {
        ask([options](ScreenWindow& window) { window.apply_options(options); });
    }
    void set_area(Area content) override {
        const std::uint64_t wish = ++shared_->wishes;
        ask([content, wish](ScreenWindow& window) { window.place(content, wish); });
    }
    void show() override {
        ask([](ScreenWindow& window) { window.appear(); });
    }
    void hide() override {
        ask([](ScreenWindow& window) { window.disappear(); });
    }
    void minimize(bool minimized) override {
        ask([minimized](ScreenWindow& window) { window.set_minimized(minimized); });
    }
    void maximize(bool maximized) override {
        ask([maximized](ScreenWindow& window) { window.set_maximized(maximized); });
    }
    void activate() override {
        ask([](ScreenWindow& window) { window.come_to_front(); });
    }
    void send_behind(const std::shared_ptr<WindowPeer>& other) override {
        const auto* const peer = dynamic_cast<const QtWindowPeer*>(other.get());
        const std::shared_ptr<Shared> above = peer != nullptr ? peer->shared_ : nullptr;
        ask([above](ScreenWindow& window) {
            if (above == nullptr || above->window == nullptr) {
                window.lower();
                return;
            }
            // Window managers are asked for the front or the back, never for a place between.
            window.raise();
            above->window->raise();
        });
    }
    void set_pulse(std::int64_t interval) override {
        ask([interval](ScreenWindow& window) { window.set_pulse(interval); });
    }
    void set_parent(const std::shared_ptr<WindowPeer>& parent) override {
        const auto* const other = dynamic_cast<const QtWindowPeer*>(parent.get());
        const std::shared_ptr<Shared> above = other != nullptr ? other->shared_ : nullptr;
        ask([above](ScreenWindow& window) {
            window.setTransientParent(above != nullptr ? above->window : nullptr);
        });
    }
    void set_cursor(const Cursor& cursor) override {
        ask([cursor](ScreenWindow& window) { window.setCursor(to_qt_cursor(cursor)); });
    }
    void set_text_input(bool wanted, Area caret) override {
        ask([wanted, caret](ScreenWindow& window) { window.set_text_input(wanted, caret); });
    }
    void start_drag(DragContents contents) override {
        ask([contents = std::move(contents)](ScreenWindow& window) { window.start_drag(contents); });
    }
    void present(const std::uint32_t* pixels, std::size_t stride, Size size,
                 const std::vector<DeviceRect>& changed) override {
        if (shared_->picture->put(pixels, stride, size, changed)) {
            ask([](ScreenWindow& window) { window.picture_changed(); });
        }
    }
    void wait_for_present() override {
        if (!MainThread::instance().is_current()) {
            shared_->picture->wait_until_taken();
        }
    }
    void close() override {
        if (shared_->closed.exchange(true)) {
            return;
        }
        shared_->picture->close();
        MainThread::instance().add([shared = shared_] {
            shared->listener.reset();
            if (ScreenWindow* const window = std::exchange(shared->window, nullptr)) {
                window->leave();
            }
        });
    }

  private:
    // Outlives the peer for as long as requests are on their way.
    struct Shared {
        explicit Shared(std::shared_ptr<WindowListener> heard) : listener(std::move(heard)) {}

        const std::shared_ptr<WindowPicture> picture = std::make_shared<WindowPicture>();
        std::atomic<std::uint64_t> wishes{0};
        std::atomic<bool> closed{false};
        // Main thread only; the window is made with the first request and deletes itself by leave().
        std::shared_ptr<WindowListener> listener;
        ScreenWindow* window = nullptr;
    };

    template <typename Request>
    void ask(Request request) {
        MainThread::instance().add([shared = shared_, request = std::move(request)] {
            if (shared->listener == nullptr) {
                return;
            }
            if (shared->window == nullptr) {
                shared->window = new ScreenWindow(shared->picture, shared->listener);
            }
            request(*shared->window);
        });
    }

    const std::shared_ptr<Shared> shared_;
};

} // namespace

void take_activation_token(const std::string& token) {
    if (!token.empty()) {
        MainThread::instance().add([token] { ScreenWindow::take_activation_token(token); });
    }
}

std::shared_ptr<WindowPeer> make_window(const WindowOptions& options, Area content,
                                        std::shared_ptr<WindowListener> listener) {
    auto peer = std::make_shared<QtWindowPeer>(std::move(listener));
    peer->set_options(options);
    peer->set_area(content);
    return peer;
}

} // namespace host
