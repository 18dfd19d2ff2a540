#include <ThreadIdentity.h>

#include <atomic>

namespace {

std::atomic<thread_id> sNext{1};
thread_local thread_id tIdentity = 0;

} // namespace

thread_id current_thread_identity() {
    if (tIdentity == 0)
        tIdentity = reserve_thread_identity();
    return tIdentity;
}

thread_id reserve_thread_identity() {
    return sNext.fetch_add(1, std::memory_order_relaxed);
}

void adopt_thread_identity(thread_id reserved) {
    tIdentity = reserved;
}
