#include <EntryRef.h>

#include <cstdlib>
#include <cstring>
#include <utility>

entry_ref::entry_ref() : device(static_cast<dev_t>(-1)), directory(static_cast<ino_t>(-1)), name(nullptr) {}

entry_ref::entry_ref(dev_t dev, ino_t dir, const char* leaf) : device(dev), directory(dir), name(nullptr) {
    set_name(leaf);
}

entry_ref::entry_ref(const entry_ref& other) : entry_ref(other.device, other.directory, other.name) {}

entry_ref::entry_ref(entry_ref&& other) noexcept
    : device(other.device), directory(other.directory), name(std::exchange(other.name, nullptr)) {}

entry_ref::~entry_ref() {
    std::free(name);
}

entry_ref& entry_ref::operator=(const entry_ref& other) {
    if (this != &other) {
        device = other.device;
        directory = other.directory;
        set_name(other.name);
    }
    return *this;
}

entry_ref& entry_ref::operator=(entry_ref&& other) noexcept {
    if (this != &other) {
        device = other.device;
        directory = other.directory;
        std::free(name);
        name = std::exchange(other.name, nullptr);
    }
    return *this;
}

status_t entry_ref::set_name(const char* newName) {
    char* copy = nullptr;
    if (newName != nullptr) {
        copy = strdup(newName);
        if (copy == nullptr)
            return B_NO_MEMORY;
    }
    std::free(name);
    name = copy;
    return B_OK;
}

bool entry_ref::operator==(const entry_ref& other) const {
    if (device != other.device || directory != other.directory)
        return false;
    if (name == nullptr || other.name == nullptr)
        return name == other.name;
    return std::strcmp(name, other.name) == 0;
}

bool entry_ref::operator!=(const entry_ref& other) const {
    return !(*this == other);
}
