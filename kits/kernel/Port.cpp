#include <CopyText.h>
#include <IdTable.h>
#include <KernelCounts.h>
#include <OS.h>
#include <WaitLimit.h>

#include "host/api/threads.h"

#include <algorithm>
#include <cstring>
#include <deque>
#include <vector>

namespace {

struct PortMessage {
    int32 code;
    std::vector<char> bytes;
};

struct Port {
    char name[B_OS_NAME_LENGTH] = {};
    int32 capacity = 0;
    mutable GuardMutex mutex;
    // Notified for every message, and when the port is closed or deleted.
    std::condition_variable filled;
    std::condition_variable emptied;
    std::deque<PortMessage> queue GUARDED_BY(mutex);
    int32 totalCount GUARDED_BY(mutex) = 0;
    bool closed GUARDED_BY(mutex) = false;
    bool deleted GUARDED_BY(mutex) = false;

    // B_OK once a message waits.
    status_t AwaitMessage(GuardLock& guard, WaitLimit& limit) REQUIRES(mutex) {
        bool mayWait = true;
        while (!deleted && queue.empty() && !closed && mayWait)
            mayWait = limit.Wait(filled, guard);
        if (deleted || (queue.empty() && closed))
            return B_BAD_PORT_ID;
        return queue.empty() ? limit.Expired() : B_OK;
    }

    // B_OK once there is room for a message.
    status_t AwaitRoom(GuardLock& guard, WaitLimit& limit) REQUIRES(mutex) {
        bool mayWait = true;
        while (!closed && !deleted && IsFull() && mayWait)
            mayWait = limit.Wait(emptied, guard);
        if (closed || deleted)
            return B_BAD_PORT_ID;
        return IsFull() ? limit.Expired() : B_OK;
    }

    bool IsFull() const REQUIRES(mutex) { return queue.size() >= static_cast<size_t>(capacity); }
};

// Never destroyed: threads may use it while the process ends.
IdTable<Port>& ports() {
    static IdTable<Port>* const table = new IdTable<Port>;
    return *table;
}

} // namespace

port_id create_port(int32 capacity, const char* name) {
    if (capacity < 1 || capacity > B_PORT_MAX_CAPACITY)
        return B_BAD_VALUE;
    auto port = std::make_shared<Port>();
    CopyText(port->name, name);
    port->capacity = capacity;
    return ports().Add(std::move(port));
}

port_id find_port(const char* name) {
    if (name == nullptr)
        return B_BAD_VALUE;
    const port_id id = ports().FindIf([name](const Port& port) { return std::strcmp(port.name, name) == 0; });
    return id != 0 ? id : B_NAME_NOT_FOUND;
}

status_t write_port(port_id port, int32 code, const void* buffer, size_t size) {
    return write_port_etc(port, code, buffer, size, 0, 0);
}

status_t write_port_etc(port_id id, int32 code, const void* buffer, size_t size, uint32 flags,
                        bigtime_t timeout) {
    if (size > B_PORT_MAX_MESSAGE_SIZE || (buffer == nullptr && size > 0))
        return B_BAD_VALUE;
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    const char* const first = static_cast<const char*>(buffer);
    PortMessage message{code, std::vector<char>(first, first + size)};
    WaitLimit limit(flags, timeout);
    GuardLock guard(port->mutex);
    const status_t status = port->AwaitRoom(guard, limit);
    if (status != B_OK)
        return status;
    port->queue.push_back(std::move(message));
    port->totalCount++;
    // All of them: who only asks for the size leaves the message to others.
    port->filled.notify_all();
    return B_OK;
}

ssize_t read_port(port_id port, int32* code, void* buffer, size_t size) {
    return read_port_etc(port, code, buffer, size, 0, 0);
}

ssize_t read_port_etc(port_id id, int32* code, void* buffer, size_t size, uint32 flags, bigtime_t timeout) {
    if (buffer == nullptr && size > 0)
        return B_BAD_VALUE;
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    WaitLimit limit(flags, timeout);
    PortMessage message;
    {
        GuardLock guard(port->mutex);
        const status_t status = port->AwaitMessage(guard, limit);
        if (status != B_OK)
            return status;
        message = std::move(port->queue.front());
        port->queue.pop_front();
        port->emptied.notify_one();
    }
    if (code != nullptr)
        *code = message.code;
    const size_t copied = std::min(size, message.bytes.size());
    if (copied > 0)
        std::memcpy(buffer, message.bytes.data(), copied);
    return static_cast<ssize_t>(copied);
}

ssize_t port_buffer_size(port_id port) {
    return port_buffer_size_etc(port, 0, 0);
}

ssize_t port_buffer_size_etc(port_id id, uint32 flags, bigtime_t timeout) {
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    WaitLimit limit(flags, timeout);
    GuardLock guard(port->mutex);
    const status_t status = port->AwaitMessage(guard, limit);
    return status == B_OK ? static_cast<ssize_t>(port->queue.front().bytes.size()) : status;
}

ssize_t port_count(port_id id) {
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    GuardLock guard(port->mutex);
    return static_cast<ssize_t>(port->queue.size());
}

status_t close_port(port_id id) {
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    GuardLock guard(port->mutex);
    port->closed = true;
    port->filled.notify_all();
    port->emptied.notify_all();
    return B_OK;
}

status_t delete_port(port_id id) {
    const std::shared_ptr<Port> port = ports().Remove(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    GuardLock guard(port->mutex);
    port->deleted = true;
    port->filled.notify_all();
    port->emptied.notify_all();
    return B_OK;
}

status_t set_port_owner(port_id port, team_id team) {
    if (ports().Find(port) == nullptr)
        return B_BAD_PORT_ID;
    return team == B_CURRENT_TEAM || team == host::current_process() ? B_OK : B_BAD_TEAM_ID;
}

status_t get_port_info(port_id id, port_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    const std::shared_ptr<Port> port = ports().Find(id);
    if (port == nullptr)
        return B_BAD_PORT_ID;
    *info = {};
    info->port = id;
    info->team = host::current_process();
    CopyText(info->name, port->name);
    info->capacity = port->capacity;
    GuardLock guard(port->mutex);
    info->queue_count = static_cast<int32>(port->queue.size());
    info->total_count = port->totalCount;
    return B_OK;
}

uint32 count_ports() {
    return ports().Count();
}
