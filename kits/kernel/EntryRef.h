// entry_ref and node_ref: how files are named between programs' parts without their paths.
#pragma once

#include <SupportDefs.h>

#include <sys/types.h>

// A file or folder by its leaf name and the folder it lies in. It stays right when a folder above is renamed
// or moved, not when the entry itself is. The file need not exist. dev_t and ino_t are this host's: 64 bits
// each. A default entry_ref has device (dev_t)-1, directory (ino_t)-1 and no name. A plain value that owns
// its name: not synchronised.
struct entry_ref {
    entry_ref();
    // `name` is copied and may be null.
    entry_ref(dev_t dev, ino_t dir, const char* name);
    entry_ref(const entry_ref& other);
    // Leaves the other one without a name.
    entry_ref(entry_ref&& other) noexcept;
    ~entry_ref();
    entry_ref& operator=(const entry_ref& other);
    entry_ref& operator=(entry_ref&& other) noexcept;

    // Copies the name; null takes it away. B_OK, or B_NO_MEMORY with the old name kept.
    status_t set_name(const char* name);

    // Same device, directory and name, byte for byte. Two without a name are equal in that.
    bool operator==(const entry_ref& other) const;
    bool operator!=(const entry_ref& other) const;

    dev_t device;
    ino_t directory;
    // Owned by the ref, made by strdup(); change it through set_name() only. Null when there is none.
    char* name;
};

// A file by its number on its device, wherever it lies and whatever it is called.
struct node_ref {
    constexpr node_ref() = default;
    constexpr node_ref(dev_t dev, ino_t inode) : device(dev), node(inode) {}

    constexpr bool operator==(const node_ref& other) const {
        return device == other.device && node == other.node;
    }
    constexpr bool operator!=(const node_ref& other) const { return !(*this == other); }
    constexpr bool operator<(const node_ref& other) const {
        return device != other.device ? device < other.device : node < other.node;
    }

    dev_t device = static_cast<dev_t>(-1);
    ino_t node = static_cast<ino_t>(-1);
};
