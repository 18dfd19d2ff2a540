#include <SymLink.h>

#include <CopyText.h>
#include <Directory.h>
#include <Entry.h>
#include <HostConversions.h>
#include <Path.h>

#include "host/api/file_system.h"

#include <string.h>

BSymLink::BSymLink() = default;

BSymLink::BSymLink(const entry_ref* ref) : BNode(ref) {}
BSymLink::BSymLink(const BEntry* entry) : BNode(entry) {}
BSymLink::BSymLink(const char* path) : BNode(path) {}
BSymLink::BSymLink(const BDirectory* directory, const char* path) : BNode(directory, path) {}

BSymLink::BSymLink(const BSymLink& other) = default;
BSymLink& BSymLink::operator=(const BSymLink& other) = default;
BSymLink::~BSymLink() = default;

status_t BSymLink::ReadTarget(std::string& target) const {
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    if (!IsSymLink())
        return B_BAD_VALUE;
    host::Result<std::string> text = host::file_system().read_symbolic_link(HostRef(FoundAt()));
    if (text)
        target = *std::move(text);
    return StatusOf(text);
}

ssize_t BSymLink::ReadLink(char* buffer, size_t size) {
    if (buffer == nullptr && size > 0)
        return B_BAD_VALUE;
    std::string target;
    if (status_t status = ReadTarget(target); status != B_OK)
        return status;
    CopyText(buffer, size, target.c_str());
    return static_cast<ssize_t>(target.size());
}

ssize_t BSymLink::MakeLinkedPath(const char* directoryPath, BPath* path) {
    if (directoryPath == nullptr || path == nullptr)
        return B_BAD_VALUE;
    std::string target;
    status_t status = ReadTarget(target);
    if (status == B_OK)
        status = target.starts_with('/') ? path->SetTo(target.c_str())
                                         : path->SetTo(directoryPath, target.c_str());
    return status == B_OK ? static_cast<ssize_t>(strlen(path->Path())) : status;
}

ssize_t BSymLink::MakeLinkedPath(const BDirectory* directory, BPath* path) {
    if (directory == nullptr)
        return B_BAD_VALUE;
    BPath base(directory);
    return base.InitCheck() == B_OK ? MakeLinkedPath(base.Path(), path) : base.InitCheck();
}

bool BSymLink::IsAbsolute() {
    std::string target;
    return ReadTarget(target) == B_OK && target.starts_with('/');
}
