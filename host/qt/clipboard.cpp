#include "host/api/clipboard.h"

#include "data_formats.h"
#include "main_thread.h"

#include "host/api/thread_safety.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QMimeData>

#include <array>
#include <chrono>
#include <condition_variable>
#include <memory>

namespace host {

namespace {

std::size_t index_of(ClipboardName name) {
    return name == ClipboardName::clipboard ? 0 : 1;
}

QClipboard::Mode mode_of(ClipboardName name) {
    return name == ClipboardName::clipboard ? QClipboard::Clipboard : QClipboard::Selection;
}

// What is known of both clipboards without asking the display.
class ClipboardState {
  public:
    static ClipboardState& instance() {
        static ClipboardState* const state = new ClipboardState;
        return *state;
    }

    // On the main thread; hears of changes from now on.
    void follow() {
        if (followed_) {
            return;
        }
        followed_ = true;
        QObject::connect(QGuiApplication::clipboard(), &QClipboard::changed, qApp,
                         [this](QClipboard::Mode mode) {
                             if (mode != QClipboard::FindBuffer) {
                                 changed(mode == QClipboard::Clipboard ? ClipboardName::clipboard
                                                                       : ClipboardName::selection);
                             }
                         });
    }

    void changed(ClipboardName name) EXCLUDES(mutex_) {
        std::function<void(ClipboardName)> listener;
        {
            const MutexLock lock(mutex_);
            ++changes_[index_of(name)];
            listener = listener_;
        }
        if (listener) {
            listener(name);
        }
    }
    std::uint32_t changes(ClipboardName name) EXCLUDES(mutex_) {
        const MutexLock lock(mutex_);
        return changes_[index_of(name)];
    }
    void listen(std::function<void(ClipboardName)> listener) EXCLUDES(mutex_) {
        const MutexLock lock(mutex_);
        listener_ = std::move(listener);
    }
    // The contents while there is no display.
    void keep(ClipboardName name, DataFormats contents) EXCLUDES(mutex_) {
        const MutexLock lock(mutex_);
        kept_[index_of(name)] = std::move(contents);
    }
    DataFormats kept(ClipboardName name, const std::vector<std::string>& types) EXCLUDES(mutex_) {
        const MutexLock lock(mutex_);
        DataFormats found;
        for (const std::string& type : types) {
            if (const std::string* const bytes = kept_[index_of(name)].find(type); bytes != nullptr) {
                found.set(type, *bytes);
            }
        }
        return found;
    }

  private:
    bool followed_ = false; // main thread only
    Mutex mutex_;
    std::array<std::uint32_t, 2> changes_ GUARDED_BY(mutex_) = {};
    std::array<DataFormats, 2> kept_ GUARDED_BY(mutex_);
    std::function<void(ClipboardName)> listener_ GUARDED_BY(mutex_);
};

// A read under way, shared because the reader may give up before the main thread comes to it.
struct Reading {
    Mutex mutex;
    std::condition_variable_any done;
    bool is_done GUARDED_BY(mutex) = false;
    DataFormats contents GUARDED_BY(mutex);
};

} // namespace

DataFormats read_clipboard(ClipboardName name, const std::vector<std::string>& types) {
    if (!display_connected()) {
        return ClipboardState::instance().kept(name, types);
    }
    const auto reading = std::make_shared<Reading>();
    MainThread::instance().add([reading, name, types] {
        ClipboardState::instance().follow();
        const QMimeData* const mime = QGuiApplication::clipboard()->mimeData(mode_of(name));
        DataFormats found = mime != nullptr ? from_mime_data(*mime, types) : DataFormats();
        const MutexLock lock(reading->mutex);
        reading->contents = std::move(found);
        reading->is_done = true;
        reading->done.notify_all();
    });
    MutexLock lock(reading->mutex);
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(1);
    while (!reading->is_done) {
        if (reading->done.wait_until(lock, deadline) == std::cv_status::timeout) {
            break;
        }
    }
    return std::move(reading->contents);
}

void write_clipboard(ClipboardName name, DataFormats contents) {
    if (!display_connected()) {
        ClipboardState::instance().keep(name, std::move(contents));
        ClipboardState::instance().changed(name);
        return;
    }
    MainThread::instance().add([name, contents = std::move(contents)] {
        ClipboardState::instance().follow();
        QGuiApplication::clipboard()->setMimeData(to_mime_data(contents), mode_of(name));
    });
}

std::uint32_t clipboard_changes(ClipboardName name) {
    return ClipboardState::instance().changes(name);
}

void set_clipboard_listener(std::function<void(ClipboardName)> listener) {
    ClipboardState::instance().listen(std::move(listener));
    MainThread::instance().add([] {
        if (display_connected()) {
            ClipboardState::instance().follow();
        }
    });
}

} // namespace host
