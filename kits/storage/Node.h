// BNode: an open file, directory or symbolic link, and its attributes.
#pragma once

#include <EntryRef.h>
#include <Statable.h>
#include <fs_attr.h>

#include <memory>
#include <string>
#include <vector>

class BDirectory;
class BEntry;
class BString;

namespace host {
class Node;
}

// The node stays open, and the same file, through renaming and removal, until the object is set anew or
// destroyed. Symbolic links are opened themselves, never followed. Contents are reached through the derived
// classes. Copies share the open node (not the position in the list of attributes): one thread at a time for
// all of them.
//
// Attributes: a name of at most B_ATTR_NAME_LENGTH bytes, a type code and bytes. A method of a node that is
// not open answers B_NO_INIT, one that is given null B_BAD_VALUE. What this program changes is read at once;
// what another program changes may be read as it was up to a tenth of a millisecond before.
class BNode : public BStatable {
  public:
    BNode();
    BNode(const entry_ref* ref);
    BNode(const BEntry* entry);
    BNode(const char* path);
    BNode(const BDirectory* directory, const char* path);
    BNode(const BNode& other);
    BNode& operator=(const BNode& other);
    ~BNode() override;

    // B_OK, B_NO_INIT, or why opening failed: B_ENTRY_NOT_FOUND, B_PERMISSION_DENIED, B_NO_MORE_FDS, ...
    status_t InitCheck() const;

    status_t SetTo(const entry_ref* ref);
    status_t SetTo(const BEntry* entry);
    status_t SetTo(const char* path);
    status_t SetTo(const BDirectory* directory, const char* path);
    void Unset();

    // Advisory: keeps out others that lock too. B_BUSY when one holds it.
    status_t Lock();
    status_t Unlock();
    // Returns when contents and attributes are on the disk.
    status_t Sync();

    // The number of bytes moved. Reading takes at most `length` bytes from `offset` on, whatever type is
    // asked for; B_ENTRY_NOT_FOUND when there is no such attribute. Writing at offset 0 replaces the value;
    // at another it replaces what follows, with zero bytes in a gap. A failed write (B_READ_ONLY_DEVICE,
    // B_DEVICE_FULL, B_PERMISSION_DENIED, B_UNSUPPORTED where the volume has no attributes) leaves the old
    // value.
    ssize_t WriteAttr(const char* name, type_code type, off_t offset, const void* buffer, size_t length);
    ssize_t ReadAttr(const char* name, type_code type, off_t offset, void* buffer, size_t length) const;
    status_t RemoveAttr(const char* name);
    // Takes the place of an attribute that has the new name already.
    status_t RenameAttr(const char* from, const char* to);
    status_t GetAttrInfo(const char* name, attr_info* info) const;

    // Into a buffer of B_ATTR_NAME_LENGTH bytes; B_ENTRY_NOT_FOUND at the end. The names are those at the
    // time of the first call after RewindAttrs().
    status_t GetNextAttrName(char* buffer);
    status_t RewindAttrs();

    // The value as a text, with its terminating zero. A value that has none is read whole.
    status_t WriteAttrString(const char* name, const BString* text);
    status_t ReadAttrString(const char* name, BString* text) const;

    // Equal when both are open on the same file, or both are not open.
    bool operator==(const BNode& other) const;
    bool operator!=(const BNode& other) const { return !(*this == other); }

  protected:
    // Takes over an open node (or none, with the reason) that was found at `ref`.
    status_t Adopt(std::shared_ptr<host::Node> node, const entry_ref& ref, status_t status);
    host::Node* HostNode() const { return mNode.get(); }
    // Where the node was found; by now the file may be called otherwise.
    const entry_ref& FoundAt() const { return mRef; }

  private:
    friend class BNodeInfo;

    status_t ReadStat(host::NodeStat* stat) const override;
    status_t WriteStat(const struct stat& stat, uint32 what) override;

    std::shared_ptr<host::Node> mNode;
    entry_ref mRef;
    status_t mStatus = B_NO_INIT;
    std::vector<std::string> mAttributeNames;
    size_t mNextAttribute = 0;
    bool mAttributesListed = false;
};
