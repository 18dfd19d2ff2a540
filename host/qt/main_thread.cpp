#include "main_thread.h"

#include <QCoreApplication>
#include <QEvent>
#include <QObject>
#include <QThread>

#include <utility>

namespace host {

// Wakes the main thread. The tasks themselves do not travel through Qt: our own lock is what thread checkers
// see.
class MainThread::Bell : public QObject {
  public:
    explicit Bell(MainThread& owner) : owner_(owner) {}
    bool event(QEvent* event) override {
        if (event->type() != QEvent::User) {
            return QObject::event(event);
        }
        owner_.carry_out();
        return true;
    }

  private:
    MainThread& owner_;
};

MainThread& MainThread::instance() {
    static MainThread* const queue = new MainThread;
    return *queue;
}

void MainThread::add(std::function<void()> task) {
    Bell* bell = nullptr;
    {
        const MutexLock lock(mutex_);
        tasks_.push_back(std::move(task));
        if (bell_ != nullptr && !rung_) {
            rung_ = true;
            bell = bell_;
        }
    }
    if (bell != nullptr) {
        QCoreApplication::postEvent(bell, new QEvent(QEvent::User));
    }
}

void MainThread::start() {
    const MutexLock lock(mutex_);
    if (bell_ == nullptr) {
        bell_ = new Bell(*this);
        rung_ = true;
        QCoreApplication::postEvent(bell_, new QEvent(QEvent::User));
    }
}

bool MainThread::is_current() const {
    const QCoreApplication* const application = QCoreApplication::instance();
    return application != nullptr && application->thread() == QThread::currentThread();
}

void MainThread::carry_out() {
    for (;;) {
        std::function<void()> task;
        {
            const MutexLock lock(mutex_);
            if (tasks_.empty()) {
                rung_ = false;
                return;
            }
            task = std::move(tasks_.front());
            tasks_.pop_front();
        }
        // A task may run a loop of events of its own (a drag); what is added meanwhile must ring again there.
        {
            const MutexLock lock(mutex_);
            rung_ = false;
        }
        task();
    }
}

} // namespace host
