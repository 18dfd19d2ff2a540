#pragma once

#include <memory>
#include <string>

namespace test {

/// A desktop's session of a test's own, kept by the X Session Management Protocol (X Consortium standard,
/// version 1.0): programs that this process starts from now on join it, by SESSION_MANAGER, which the
/// destructor takes away. Its thread serves them.
class SessionManager {
  public:
    SessionManager();
    ~SessionManager();
    SessionManager(const SessionManager&) = delete;
    SessionManager& operator=(const SessionManager&) = delete;

    /// False when no socket could be listened on; the reason is on standard error.
    bool works() const;
    /// Programs that are in the session now.
    int clients() const;
    /// What the clients have asked for: SmRestartNever and so on; -1 when none has asked for anything.
    int restart_style() const;

    /// Each waits, ten seconds at most, until all clients have said that they have saved; false when not.
    /// As a desktop does that keeps the session as it is, and goes on.
    bool save();
    /// As a desktop does whose user is logging out...
    bool begin_log_out();
    /// ...and thinks better of it,
    void cancel_log_out();
    /// or is gone: every client is told to end.
    void finish_log_out();

  private:
    class Session;
    std::unique_ptr<Session> session_;
};

} // namespace test
