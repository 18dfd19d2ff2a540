#include <CopyText.h>
#include <ThreadTable.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>
#include <system_error>
#include <utility>

namespace {

status_t start(ThreadRecord& record) {
    GuardLock guard(record.mutex);
    if (record.state != ThreadRecord::State::kSpawned)
        return B_BAD_THREAD_STATE;
    try {
        record.handle = std::thread(run_thread, record.shared_from_this());
    } catch (const std::system_error&) {
        return B_NO_MORE_THREADS;
    }
    record.state = ThreadRecord::State::kRunning;
    return B_OK;
}

// Waits until the thread has ended and one of the waiting threads has joined it.
status_t await_end(ThreadRecord& record) {
    GuardLock guard(record.mutex);
    while (record.state != ThreadRecord::State::kEnded)
        record.changed.wait(guard.Native());
    if (record.handle.joinable()) {
        std::thread handle = std::move(record.handle);
        guard.Unlock();
        handle.join();
        guard.Lock();
        record.joined = true;
        record.changed.notify_all();
    }
    while (!record.joined && record.native != 0 && record.function != nullptr)
        record.changed.wait(guard.Native());
    return record.exitStatus;
}

} // namespace

thread_id spawn_thread(thread_func function, const char* name, int32 priority, void* data) {
    if (function == nullptr)
        return B_BAD_VALUE;
    auto record = std::make_shared<ThreadRecord>(reserve_thread_identity(), name, priority);
    record->function = function;
    record->data = data;
    const thread_id id = record->id;
    ThreadTable::Get().Add(std::move(record));
    return id;
}

status_t resume_thread(thread_id thread) {
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    return record != nullptr ? start(*record) : B_BAD_THREAD_ID;
}

status_t suspend_thread(thread_id thread) {
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    GuardLock guard(record->mutex);
    return record->state == ThreadRecord::State::kSpawned ? B_BAD_THREAD_STATE : B_UNSUPPORTED;
}

status_t kill_thread(thread_id thread) {
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    if (record.get() == known_current_thread_record())
        exit_thread(B_ERROR);
    return ThreadTable::Get().EndBeforeStart(*record, B_CANCELED) ? B_OK : B_UNSUPPORTED;
}

void exit_thread(status_t status) {
    const ThreadRecord* const record = known_current_thread_record();
    if (record != nullptr && record->function != nullptr)
        throw ThreadExit{status};
    if (host::current_native_thread() == host::current_process())
        std::exit(status);
    host::end_calling_thread();
}

status_t wait_for_thread(thread_id thread, status_t* exitStatus) {
    if (thread == current_thread_identity())
        return B_BAD_THREAD_ID;
    status_t status = B_OK;
    bool unobserved = false;
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().FindToWaitFor(thread, status, unobserved);
    if (record == nullptr && !unobserved)
        return B_BAD_THREAD_ID;
    if (record != nullptr) {
        if (start(*record) == B_NO_MORE_THREADS) {
            GuardLock guard(record->mutex);
            record->waiting--;
            return B_NO_MORE_THREADS;
        }
        status = await_end(*record);
    }
    if (exitStatus != nullptr)
        *exitStatus = status;
    return B_OK;
}

status_t on_exit_thread(void (*function)(void* data), void* data) {
    if (function == nullptr)
        return B_BAD_VALUE;
    ThreadRecord* const self = current_thread_record();
    if (self == nullptr)
        return B_BAD_THREAD_STATE;
    self->exitHooks.push_back({function, data});
    return B_OK;
}

thread_id find_thread(const char* name) {
    if (name == nullptr) {
        const ThreadRecord* const self = current_thread_record();
        return self != nullptr ? self->id : current_thread_identity();
    }
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().FindByName(name);
    return record != nullptr ? record->id : B_NAME_NOT_FOUND;
}

status_t rename_thread(thread_id thread, const char* newName) {
    if (newName == nullptr)
        return B_BAD_VALUE;
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    GuardLock guard(record->mutex);
    CopyText(record->name, newName);
    if (record->native != 0)
        host::set_thread_name(record->native, record->name);
    return B_OK;
}

status_t set_thread_priority(thread_id thread, int32 newPriority) {
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    GuardLock guard(record->mutex);
    if (record->native != 0)
        apply_priority(record->native, newPriority);
    return std::exchange(record->priority, newPriority);
}

status_t get_thread_info(thread_id thread, thread_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    if (thread == current_thread_identity())
        current_thread_record();
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    record->Describe(*info);
    return B_OK;
}

status_t get_next_thread_info(team_id team, int32* cookie, thread_info* info) {
    if (cookie == nullptr || info == nullptr)
        return B_BAD_VALUE;
    if (team != B_CURRENT_TEAM && team != host::current_process())
        return B_BAD_TEAM_ID;
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().FindAfter(*cookie);
    if (record == nullptr)
        return B_BAD_VALUE;
    record->Describe(*info);
    *cookie = record->id;
    return B_OK;
}

status_t send_data(thread_id thread, int32 code, const void* buffer, size_t size) {
    if (buffer == nullptr && size > 0)
        return B_BAD_VALUE;
    const thread_id sender = find_thread(nullptr);
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    std::vector<char> bytes;
    if (size > PTRDIFF_MAX)
        return B_NO_MEMORY;
    try {
        const char* const first = static_cast<const char*>(buffer);
        bytes.assign(first, first + size);
    } catch (const std::exception&) {
        return B_NO_MEMORY;
    }
    GuardLock guard(record->mutex);
    while (record->slotFull.load(std::memory_order_relaxed)) {
        if (thread == sender)
            return B_WOULD_BLOCK;
        record->changed.wait(guard.Native());
    }
    if (record->state == ThreadRecord::State::kEnded)
        return B_BAD_THREAD_ID;
    record->slotSender = sender;
    record->slotCode = code;
    record->slotBytes = std::move(bytes);
    record->slotFull.store(true, std::memory_order_release);
    record->changed.notify_all();
    return B_OK;
}

int32 receive_data(thread_id* sender, void* buffer, size_t size) {
    ThreadRecord* const self = current_thread_record();
    if (self == nullptr)
        return B_BAD_THREAD_ID;
    GuardLock guard(self->mutex);
    self->receiving = true;
    while (!self->slotFull.load(std::memory_order_relaxed))
        self->changed.wait(guard.Native());
    self->receiving = false;
    if (sender != nullptr)
        *sender = self->slotSender;
    const size_t copied = buffer != nullptr ? std::min(size, self->slotBytes.size()) : 0;
    if (copied > 0)
        std::memcpy(buffer, self->slotBytes.data(), copied);
    self->slotBytes = {};
    self->slotFull.store(false, std::memory_order_release);
    self->changed.notify_all();
    return self->slotCode;
}

int32 has_data(thread_id thread) {
    const ThreadRecord* const self = known_current_thread_record();
    if (self != nullptr && self->id == thread)
        return self->slotFull.load(std::memory_order_acquire) ? 1 : 0;
    if (thread == current_thread_identity())
        current_thread_record();
    const std::shared_ptr<ThreadRecord> record = ThreadTable::Get().Find(thread);
    if (record == nullptr)
        return B_BAD_THREAD_ID;
    return record->slotFull.load(std::memory_order_acquire) ? 1 : 0;
}
