#include "host/sqlite/shared_slots.h"
#include <ctime>
#include <fcntl.h>
#include <linux/futex.h>
#include <new>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace host {
namespace {

constexpr std::size_t kBytes = SharedSlots::kSlots * sizeof(ProcessSlot);
constexpr long kLookNanoseconds = 20'000'000;

struct flock byte_lock(short type, std::size_t index) {
    struct flock lock = {};
    lock.l_type = type;
    lock.l_whence = SEEK_SET;
    lock.l_start = static_cast<off_t>(index);
    lock.l_len = 1;
    return lock;
}

long futex(std::atomic<std::uint32_t>& word, int operation, std::uint32_t value, const timespec* timeout) {
    return syscall(SYS_futex, reinterpret_cast<std::uint32_t*>(&word), operation, value, timeout, nullptr, 0);
}

} // namespace

SharedSlots::~SharedSlots() {
    close();
}

bool SharedSlots::lock_slot(std::size_t index) const {
    struct flock lock = byte_lock(F_WRLCK, index);
    return fcntl(descriptor_, F_OFD_SETLK, &lock) == 0;
}

void SharedSlots::unlock_slot(std::size_t index) const {
    struct flock lock = byte_lock(F_UNLCK, index);
    fcntl(descriptor_, F_OFD_SETLK, &lock);
}

bool SharedSlots::is_alive(std::size_t index) const {
    struct flock lock = byte_lock(F_WRLCK, index);
    return fcntl(descriptor_, F_OFD_GETLK, &lock) == 0 && lock.l_type != F_UNLCK;
}

bool SharedSlots::open(const std::string& path) {
    descriptor_ = ::open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, S_IRUSR | S_IWUSR);
    struct stat status = {};
    if (descriptor_ < 0 || fstat(descriptor_, &status) != 0 ||
        (status.st_size < static_cast<off_t>(kBytes) && ftruncate(descriptor_, kBytes) != 0)) {
        close();
        return false;
    }
    void* mapped = mmap(nullptr, kBytes, PROT_READ | PROT_WRITE, MAP_SHARED, descriptor_, 0);
    if (mapped == MAP_FAILED) {
        close();
        return false;
    }
    slots_ = static_cast<ProcessSlot*>(mapped);
    for (std::size_t i = 0; i < kSlots; ++i) {
        // A dead process's slot is left for take_over_dead(), which tells of the loss.
        if (slots_[i].owned.load() != 0 || !lock_slot(i))
            continue;
        if (slots_[i].owned.load() != 0) {
            unlock_slot(i);
            continue;
        }
        own_ = &slots_[i];
        own_->reported = 0;
        own_->committed = 0;
        own_->hurry = 0;
        own_->owned = 1;
        return true;
    }
    return false;
}

void SharedSlots::close() {
    if (own_ != nullptr) {
        own_->reported = 0;
        own_->committed = 0;
        own_->owned = 0;
        wake(*own_);
    }
    own_ = nullptr;
    if (slots_ != nullptr)
        munmap(slots_, kBytes);
    slots_ = nullptr;
    if (descriptor_ >= 0)
        ::close(descriptor_);
    descriptor_ = -1;
}

void SharedSlots::wake(ProcessSlot& slot) {
    slot.signal.fetch_add(1);
    futex(slot.signal, FUTEX_WAKE, 0x7fffffff, nullptr);
}

void SharedSlots::wait_for_others() const {
    if (slots_ == nullptr)
        return;
    for (std::size_t i = 0; i < kSlots; ++i) {
        ProcessSlot& slot = slots_[i];
        if (&slot == own_)
            continue;
        const std::uint64_t reported = slot.reported.load(std::memory_order_seq_cst);
        while (true) {
            const std::uint32_t signal = slot.signal.load();
            const std::uint64_t committed = slot.committed.load(std::memory_order_seq_cst);
            // A slot that was given back starts at zero again.
            if (committed >= reported || slot.reported.load() < reported || !is_alive(i))
                break;
            slot.hurry = 1;
            const timespec timeout = {0, kLookNanoseconds};
            futex(slot.signal, FUTEX_WAIT, signal, &timeout);
        }
    }
}

bool SharedSlots::others_alive() const {
    for (std::size_t i = 0; slots_ != nullptr && i < kSlots; ++i) {
        if (&slots_[i] != own_ && slots_[i].owned.load() != 0 && is_alive(i))
            return true;
    }
    return false;
}

bool SharedSlots::take_over_dead() {
    bool found = false;
    for (std::size_t i = 0; slots_ != nullptr && i < kSlots; ++i) {
        if (&slots_[i] == own_ || slots_[i].owned.load() == 0 || is_alive(i) || !lock_slot(i))
            continue;
        if (slots_[i].owned.load() != 0) {
            found = true;
            slots_[i].reported = 0;
            slots_[i].committed = 0;
            slots_[i].owned = 0;
        }
        unlock_slot(i);
    }
    return found;
}

} // namespace host
