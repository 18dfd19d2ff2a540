#include "support/session_manager.h"

#include <X11/ICE/ICElib.h>
#include <X11/ICE/ICEutil.h>
#include <X11/SM/SMlib.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <mutex>
#include <poll.h>
#include <thread>
#include <vector>

namespace test {

namespace {

constexpr int kPollMilliseconds = 20;
constexpr auto kPatience = std::chrono::seconds(10);

} // namespace

// The library is made for one thread: all calls of it happen in `thread_`, with the lock held; others leave
// work there.
class SessionManager::Session {
  public:
    Session();
    ~Session() {
        thread_ = {};
        unsetenv("SESSION_MANAGER");
    }

    bool works() const { return works_; }
    int clients() {
        const std::lock_guard guard(mutex_);
        return static_cast<int>(clients_.size());
    }
    int restart_style() {
        const std::lock_guard guard(mutex_);
        return restart_style_;
    }
    bool ask_to_save(bool shutdown);
    void tell_all(const std::function<void(SmsConn)>& what) {
        const std::lock_guard guard(mutex_);
        work_.push_back([this, what] {
            for (const Client& client : clients_)
                what(client.connection);
        });
    }

  private:
    struct Client {
        SmsConn connection;
        bool saving;
    };

    static SmsCallbacks callbacks(Session* session);
    static Status add_client(SmsConn connection, SmPointer data, unsigned long* mask, SmsCallbacks* wanted,
                             char** /*failure*/) {
        auto* const self = static_cast<Session*>(data);
        self->clients_.push_back({connection, false});
        *mask = kAllCallbacks;
        *wanted = callbacks(self);
        return 1;
    }
    static void keep_restart_style(SmsConn connection, SmPointer data, int count, SmProp** properties);
    static Status register_client(SmsConn connection, SmPointer data, char* previous);
    static void note_saved(SmsConn connection, SmPointer data, Bool success);
    static void close_connection(SmsConn connection, SmPointer data, int count, char** reasons);

    bool listen();
    void run(const std::stop_token& stop);
    void take_message(IceConn transport);
    void forget(IceConn transport);

    static constexpr unsigned long kAllCallbacks = (1UL << 10) - 1;

    std::mutex mutex_;
    std::condition_variable changed_;
    std::vector<std::function<void()>> work_;
    std::vector<Client> clients_;
    std::vector<IceConn> transports_;
    IceListenObj* listeners_ = nullptr;
    int listener_count_ = 0;
    int restart_style_ = -1;
    bool works_ = false;
    std::jthread thread_;
};

SessionManager::Session::Session() {
    IceSetIOErrorHandler([](IceConn) {}); // by itself it would end the process
    works_ = listen();
    if (works_)
        thread_ = std::jthread([this](const std::stop_token& stop) { run(stop); });
}

bool SessionManager::Session::listen() {
    char problem[256] = "";
    const IceHostBasedAuthProc accept_host = [](char*) -> Bool { return True; };
    if (SmsInitialize("Quirnel's tests", "1", add_client, this, accept_host, sizeof(problem), problem) == 0 ||
        IceListenForConnections(&listener_count_, &listeners_, sizeof(problem), problem) == 0) {
        std::fprintf(stderr, "no session manager: %s\n", problem);
        return false;
    }
    for (int i = 0; i < listener_count_; ++i)
        IceSetHostBasedAuthProc(listeners_[i], accept_host);
    char* const names = IceComposeNetworkIdList(listener_count_, listeners_);
    setenv("SESSION_MANAGER", names, 1);
    std::free(names);
    return true;
}

SmsCallbacks SessionManager::Session::callbacks(Session* session) {
    SmsCallbacks all = {};
    all.register_client = {register_client, session};
    all.interact_request = {[](SmsConn connection, SmPointer, int) { SmsInteract(connection); }, session};
    all.interact_done = {[](SmsConn, SmPointer, Bool) {}, session};
    all.save_yourself_request = {[](SmsConn, SmPointer, int, Bool, int, Bool, Bool) {}, session};
    all.save_yourself_phase2_request = {
        [](SmsConn connection, SmPointer) { SmsSaveYourselfPhase2(connection); }, session};
    all.save_yourself_done = {note_saved, session};
    all.close_connection = {close_connection, session};
    all.set_properties = {keep_restart_style, session};
    all.delete_properties = {[](SmsConn, SmPointer, int count, char** names) {
                                 std::for_each(names, names + count, std::free);
                                 std::free(names);
                             },
                             session};
    all.get_properties = {[](SmsConn connection, SmPointer) { SmsReturnProperties(connection, 0, nullptr); },
                          session};
    return all;
}

Status SessionManager::Session::register_client(SmsConn connection, SmPointer /*data*/, char* previous) {
    if (previous != nullptr) {
        std::free(previous);
        return 0; // no client of an earlier session is known
    }
    char* const id = SmsGenerateClientID(connection);
    SmsRegisterClientReply(connection, id);
    std::free(id);
    // The protocol wants a new client to save its state once at the beginning.
    SmsSaveYourself(connection, SmSaveLocal, False, SmInteractStyleNone, False);
    return 1;
}

void SessionManager::Session::keep_restart_style(SmsConn /*connection*/, SmPointer data, int count,
                                                 SmProp** properties) {
    for (int i = 0; i < count; ++i) {
        if (std::strcmp(properties[i]->name, SmRestartStyleHint) == 0 && properties[i]->num_vals == 1)
            static_cast<Session*>(data)->restart_style_ =
                *static_cast<const unsigned char*>(properties[i]->vals[0].value);
        SmFreeProperty(properties[i]);
    }
    std::free(properties);
}

void SessionManager::Session::note_saved(SmsConn connection, SmPointer data, Bool /*success*/) {
    for (Client& client : static_cast<Session*>(data)->clients_) {
        if (client.connection != connection)
            continue;
        // After a log-out's saving comes Die or ShutdownCancelled instead.
        if (!client.saving)
            SmsSaveComplete(connection);
        client.saving = false;
    }
}

void SessionManager::Session::close_connection(SmsConn connection, SmPointer data, int count,
                                               char** reasons) {
    SmFreeReasons(count, reasons);
    auto* const self = static_cast<Session*>(data);
    std::erase_if(self->clients_, [&](const Client& client) { return client.connection == connection; });
    const IceConn transport = SmsGetIceConnection(connection);
    SmsCleanUp(connection);
    IceSetShutdownNegotiation(transport, False);
    IceCloseConnection(transport);
    std::erase(self->transports_, transport);
}

bool SessionManager::Session::ask_to_save(bool shutdown) {
    std::unique_lock guard(mutex_);
    work_.push_back([this, shutdown] {
        for (Client& client : clients_) {
            client.saving = true;
            SmsSaveYourself(client.connection, SmSaveBoth, shutdown ? True : False,
                            shutdown ? SmInteractStyleAny : SmInteractStyleNone, False);
        }
    });
    return changed_.wait_for(guard, kPatience, [this] {
        return work_.empty() && std::none_of(clients_.begin(), clients_.end(),
                                             [](const Client& client) { return client.saving; });
    });
}

void SessionManager::Session::take_message(IceConn transport) {
    if (IceProcessMessages(transport, nullptr, nullptr) == IceProcessMessagesIOError)
        forget(transport); // gone without a word
}

void SessionManager::Session::forget(IceConn transport) {
    std::erase_if(clients_, [&](const Client& client) {
        if (SmsGetIceConnection(client.connection) != transport)
            return false;
        SmsCleanUp(client.connection);
        return true;
    });
    IceSetShutdownNegotiation(transport, False);
    IceCloseConnection(transport);
    std::erase(transports_, transport);
}

void SessionManager::Session::run(const std::stop_token& stop) {
    while (!stop.stop_requested()) {
        std::vector<pollfd> sockets;
        std::vector<IceConn> transports;
        {
            const std::lock_guard guard(mutex_);
            transports = transports_;
        }
        for (int i = 0; i < listener_count_; ++i)
            sockets.push_back({IceGetListenConnectionNumber(listeners_[i]), POLLIN, 0});
        for (const IceConn transport : transports)
            sockets.push_back({IceConnectionNumber(transport), POLLIN, 0});
        poll(sockets.data(), sockets.size(), kPollMilliseconds);

        const std::lock_guard guard(mutex_);
        for (std::size_t i = 0; i < sockets.size(); ++i) {
            if (sockets[i].revents == 0)
                continue;
            if (i >= static_cast<std::size_t>(listener_count_)) {
                take_message(transports[i - static_cast<std::size_t>(listener_count_)]);
                continue;
            }
            IceAcceptStatus status = IceAcceptSuccess;
            if (const IceConn transport = IceAcceptConnection(listeners_[i], &status); transport != nullptr)
                transports_.push_back(transport);
        }
        for (const std::function<void()>& task : work_)
            task();
        work_.clear();
        changed_.notify_all();
    }
    while (!transports_.empty())
        forget(transports_.back());
    IceFreeListenObjs(listener_count_, listeners_);
}

SessionManager::SessionManager() : session_(std::make_unique<Session>()) {}
SessionManager::~SessionManager() = default;

bool SessionManager::works() const {
    return session_->works();
}

int SessionManager::clients() const {
    return session_->clients();
}

int SessionManager::restart_style() const {
    return session_->restart_style();
}

bool SessionManager::save() {
    if (!session_->ask_to_save(false))
        return false;
    session_->tell_all(SmsSaveComplete);
    return true;
}

bool SessionManager::begin_log_out() {
    return session_->ask_to_save(true);
}

void SessionManager::cancel_log_out() {
    session_->tell_all(SmsShutdownCancelled);
}

void SessionManager::finish_log_out() {
    session_->tell_all(SmsDie);
}

} // namespace test
