// BVolume: a mounted file system, or a directory that stands for one.
#pragma once

#include <Mime.h>
#include <StorageDefs.h>

class BBitmap;
class BDirectory;

// Nothing is kept but the volume's number: every answer is fresh, and B_NO_INIT, B_BAD_VALUE (the volume has
// gone) or false when there is none. Any thread for reading.
class BVolume {
  public:
    BVolume();
    BVolume(dev_t device);
    BVolume(const BVolume& other);
    BVolume& operator=(const BVolume& other);
    virtual ~BVolume();

    status_t InitCheck() const;
    // B_BAD_VALUE when there is no such volume.
    status_t SetTo(dev_t device);
    void Unset();
    // ~0 when not set.
    dev_t Device() const;

    status_t GetRootDirectory(BDirectory* directory) const;

    // Bytes.
    off_t Capacity() const;
    off_t FreeBytes() const;
    off_t BlockSize() const;

    // Into a buffer of B_FILE_NAME_LENGTH bytes.
    status_t GetName(char* name) const;
    // Always B_NOT_ALLOWED: a volume is called as its file system or directory is.
    status_t SetName(const char* name);
    status_t GetIcon(BBitmap* icon, icon_size size) const;

    bool IsRemovable() const;
    bool IsReadOnly() const;
    // False for file systems that live in memory.
    bool IsPersistent() const;
    // Reached over a network.
    bool IsShared() const;
    bool KnowsMime() const;
    bool KnowsAttr() const;
    bool KnowsQuery() const;

    bool operator==(const BVolume& other) const;
    bool operator!=(const BVolume& other) const { return !(*this == other); }

  private:
    dev_t mDevice;
    status_t mStatus = B_NO_INIT;
};
