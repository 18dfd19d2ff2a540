#include "local_endpoint.h"

#include "host/api/directories.h"
#include "local_peers.h"
#include "runtime_files.h"

#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

namespace host {

namespace {

constexpr int waiting_connections = 64;

Result<Descriptor> listening_socket(const Descriptor& directory) {
    Descriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    const std::string path = socket_path(directory, ::getpid());
    std::memcpy(address.sun_path, path.c_str(), path.size() + 1);
    if (!socket.valid() ||
        ::bind(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0 ||
        ::listen(socket.get(), waiting_connections) != 0)
        return Status(errno);
    return socket;
}

// The lock goes with the process, however that ends, and is not inherited.
Result<Descriptor> locked_team_file(const Descriptor& directory) {
    Descriptor file(::openat(directory.get(), team_file_name(::getpid()).c_str(),
                             O_RDWR | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOFOLLOW, S_IRUSR | S_IWUSR));
    struct flock whole = {};
    whole.l_type = F_WRLCK;
    whole.l_whence = SEEK_SET;
    if (!file.valid() || ::fcntl(file.get(), F_SETLK, &whole) != 0)
        return Status(errno);
    return file;
}

} // namespace

LocalEndpoint& LocalEndpoint::instance() {
    static LocalEndpoint* const endpoint = new LocalEndpoint;
    return *endpoint;
}

Status LocalEndpoint::open(LocalReceiver& receiver) {
    MutexLock lock(mutex_);
    const std::string path = runtime_directory();
    if (peers_ != nullptr && path == path_)
        return {};
    Result<Descriptor> directory = open_runtime_directory();
    if (!directory)
        return directory.status();
    if (receiver_ == nullptr) {
        receiver_ = &receiver;
        std::atexit(&LocalEndpoint::remove_files_at_exit);
    }
    close();
    return listen(*std::move(directory), path);
}

Status LocalEndpoint::listen(Descriptor directory, const std::string& path) {
    // Between the old socket's removal and the new one's listening nobody may take it for a stale one.
    const Result<RuntimeLock> runtime_lock = RuntimeLock::take(directory);
    if (!runtime_lock)
        return runtime_lock.status();
    remove_stale_files(directory, *runtime_lock);
    // A process that had this number before, and has ended.
    ::unlinkat(directory.get(), socket_name(::getpid()).c_str(), 0);
    Result<Descriptor> team_file = locked_team_file(directory);
    if (!team_file)
        return team_file.status();
    Result<Descriptor> socket = listening_socket(directory);
    if (!socket)
        return socket.status();
    auto peers = std::make_shared<LocalPeers>(*std::move(socket), *receiver_);
    if (const Status started = peers->start(); !started)
        return started;
    peers_ = std::move(peers);
    team_file_ = *std::move(team_file);
    directory_ = std::move(directory);
    path_ = path;
    owner_ = ::getpid();
    return {};
}

void LocalEndpoint::close() {
    if (peers_ == nullptr)
        return;
    peers_->stop();
    peers_.reset();
    if (owner_ == ::getpid()) {
        ::unlinkat(directory_.get(), socket_name(owner_).c_str(), 0);
        ::unlinkat(directory_.get(), team_file_name(owner_).c_str(), 0);
    }
    team_file_.reset();
    directory_.reset();
}

void LocalEndpoint::remove_files_at_exit() {
    LocalEndpoint& endpoint = instance();
    std::shared_ptr<LocalPeers> peers;
    {
        MutexLock lock(endpoint.mutex_);
        if (endpoint.owner_ != ::getpid())
            return;
        peers = endpoint.peers_;
    }
    // Without the lock: what is received may need it.
    if (peers != nullptr)
        peers->finish_answers();
    MutexLock lock(endpoint.mutex_);
    endpoint.close();
}

LocalReceiver* LocalEndpoint::receiver() const {
    MutexLock lock(mutex_);
    return receiver_;
}

Status LocalEndpoint::write_team_file(const std::string& content) {
    MutexLock lock(mutex_);
    if (peers_ == nullptr)
        return ENOTCONN;
    // Written over what was there: a reader in between sees the old or the new, and never nothing.
    const ssize_t written = ::pwrite(team_file_.get(), content.data(), content.size(), 0);
    if (written < 0 || ::ftruncate(team_file_.get(), written) != 0)
        return errno;
    return static_cast<std::size_t>(written) == content.size() ? Status() : Status(ENOSPC);
}

Status open_local_transport(LocalReceiver& receiver) {
    return LocalEndpoint::instance().open(receiver);
}

} // namespace host
