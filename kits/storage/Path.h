// BPath: an absolute path name.
#pragma once

#include <Flattenable.h>
#include <StorageDefs.h>

#include <string>

class BDirectory;
class BEntry;
struct entry_ref;

// A path is a text: it does not follow its file. It is always absolute, has no trailing slash, no doubled
// slashes and no "." or ".." parts; a relative path is completed with the current directory. Where a path
// holds "." or ".." parts, doubled or trailing slashes, or where it is asked for, it is normalised through
// the file system: the directory must exist then (B_ENTRY_NOT_FOUND), the leaf need not; symbolic links at
// the leaf stay.
//
// Flattened (type B_REF_TYPE) it is the entry's reference, so that it finds its file after a directory above
// it was renamed. One thread at a time.
class BPath : public BFlattenable {
  public:
    BPath();
    BPath(const char* directory, const char* leaf = nullptr, bool normalize = false);
    BPath(const BDirectory* directory, const char* leaf = nullptr, bool normalize = false);
    BPath(const BEntry* entry);
    BPath(const entry_ref* ref);
    BPath(const BPath& other);
    BPath& operator=(const BPath& other);
    BPath& operator=(const char* path);
    ~BPath() override;

    status_t InitCheck() const;

    // B_BAD_VALUE for null, an empty path, or a leaf that begins with a slash.
    status_t SetTo(const char* path, const char* leaf = nullptr, bool normalize = false);
    status_t SetTo(const BDirectory* directory, const char* leaf = nullptr, bool normalize = false);
    status_t SetTo(const BEntry* entry);
    status_t SetTo(const entry_ref* ref);
    void Unset();

    status_t Append(const char* path, bool normalize = false);

    // Owned by the path, valid until it changes; null while it is not set.
    const char* Path() const;
    // The part after the last slash; empty for "/".
    const char* Leaf() const;
    // B_ENTRY_NOT_FOUND for "/".
    status_t GetParent(BPath* path) const;
    bool IsAbsolute() const;

    bool operator==(const BPath& other) const;
    bool operator==(const char* path) const;
    bool operator!=(const BPath& other) const { return !(*this == other); }
    bool operator!=(const char* path) const { return !(*this == path); }

    bool IsFixedSize() const override;
    type_code TypeCode() const override;
    ssize_t FlattenedSize() const override;
    status_t Flatten(void* buffer, ssize_t size) const override;
    bool AllowsTypeCode(type_code code) const override;
    status_t Unflatten(type_code code, const void* buffer, ssize_t size) override;

  private:
    status_t Fail(status_t status);

    std::string mPath;
    size_t mLeaf = 0;
    status_t mStatus = B_NO_INIT;
};
