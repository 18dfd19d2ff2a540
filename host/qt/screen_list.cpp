#include "screen_list.h"

#include "screen_window.h"

#include <QGuiApplication>
#include <QScreen>

namespace host {

namespace {

Area to_area(const QRect& rect) {
    return {rect.x(), rect.y(), rect.width(), rect.height()};
}

} // namespace

ScreenList& ScreenList::instance() {
    static ScreenList* const list = new ScreenList;
    return *list;
}

void ScreenList::follow() {
    const auto watch = [this](QScreen* screen) {
        QObject::connect(screen, &QScreen::geometryChanged, qApp, [this] { changed(); });
        QObject::connect(screen, &QScreen::availableGeometryChanged, qApp, [this] { refresh(); });
    };
    for (QScreen* screen : QGuiApplication::screens()) {
        watch(screen);
    }
    QObject::connect(qApp, &QGuiApplication::screenAdded, qApp, [this, watch](QScreen* screen) {
        watch(screen);
        changed();
    });
    QObject::connect(qApp, &QGuiApplication::screenRemoved, qApp, [this] { changed(); });
    QObject::connect(qApp, &QGuiApplication::primaryScreenChanged, qApp, [this] { changed(); });
    refresh();
}

void ScreenList::refresh() {
    std::vector<ScreenFacts> facts;
    QList<QScreen*> screens = QGuiApplication::screens();
    if (QScreen* const main = QGuiApplication::primaryScreen(); main != nullptr) {
        screens.removeAll(main);
        screens.prepend(main);
    }
    for (const QScreen* screen : screens) {
        facts.push_back({screen->name().toStdString(), to_area(screen->geometry()),
                         to_area(screen->availableGeometry()), screen->devicePixelRatio(), screen->depth(),
                         screen->refreshRate()});
    }
    const MutexLock lock(mutex_);
    screens_ = std::move(facts);
}

void ScreenList::changed() {
    refresh();
    for (QWindow* window : QGuiApplication::allWindows()) {
        if (auto* const ours = dynamic_cast<ScreenWindow*>(window); ours != nullptr) {
            ours->screens_changed();
        }
    }
}

std::vector<ScreenFacts> ScreenList::all() {
    const MutexLock lock(mutex_);
    return screens_;
}

std::vector<ScreenFacts> screens() {
    return ScreenList::instance().all();
}

} // namespace host
