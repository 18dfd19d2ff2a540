// BSymLink: a symbolic link itself.
#pragma once

#include <Node.h>

class BPath;

// One thread at a time.
class BSymLink : public BNode {
  public:
    BSymLink();
    BSymLink(const entry_ref* ref);
    BSymLink(const BEntry* entry);
    BSymLink(const char* path);
    BSymLink(const BDirectory* directory, const char* path);
    BSymLink(const BSymLink& other);
    BSymLink& operator=(const BSymLink& other);
    ~BSymLink() override;

    // The text of the link, cut where the buffer ends and always terminated. The length of the whole text;
    // B_BAD_VALUE when the node is not a link.
    ssize_t ReadLink(char* buffer, size_t size);

    // The path that the link names, relative to the directory that holds it; it is not followed further. The
    // length of the path.
    ssize_t MakeLinkedPath(const char* directoryPath, BPath* path);
    ssize_t MakeLinkedPath(const BDirectory* directory, BPath* path);

    bool IsAbsolute();

  private:
    status_t ReadTarget(std::string& target) const;
};
