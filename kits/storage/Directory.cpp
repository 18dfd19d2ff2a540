#include <Directory.h>

#include <Entry.h>
#include <File.h>
#include <FoundEntry.h>
#include <HostConversions.h>
#include <Path.h>
#include <SymLink.h>

#include "host/api/file_system.h"

#include <string.h>

namespace {

bool IsOfFlavor(host::NodeKind kind, int32 flags) {
    switch (kind) {
    case host::NodeKind::directory:
        return (flags & B_DIRECTORY_NODE) != 0;
    case host::NodeKind::symbolic_link:
        return (flags & B_SYMLINK_NODE) != 0;
    default:
        return (flags & B_FILE_NODE) != 0;
    }
}

// The entry at a path below a directory, or below the current one when `directory` is not set.
status_t EntryBelow(const BDirectory& directory, const char* path, BEntry& entry) {
    if (path == nullptr || path[0] == '\0')
        return B_BAD_VALUE;
    if (directory.InitCheck() == B_OK)
        return entry.SetTo(&directory, path);
    return directory.InitCheck() == B_NO_INIT ? entry.SetTo(path) : B_NO_INIT;
}

} // namespace

BDirectory::BDirectory() = default;

BDirectory::BDirectory(const entry_ref* ref) {
    SetTo(ref);
}

BDirectory::BDirectory(const node_ref* ref) {
    SetTo(ref);
}

BDirectory::BDirectory(const BEntry* entry) {
    SetTo(entry);
}

BDirectory::BDirectory(const char* path) {
    SetTo(path);
}

BDirectory::BDirectory(const BDirectory* directory, const char* path) {
    SetTo(directory, path);
}

BDirectory::BDirectory(const BDirectory& other) : BNode(other), mDirectory(other.mDirectory) {}

BDirectory& BDirectory::operator=(const BDirectory& other) {
    if (this != &other) {
        BNode::operator=(other);
        mDirectory = other.mDirectory;
        mReader.reset();
        mPending.reset();
    }
    return *this;
}

BDirectory::~BDirectory() = default;

status_t BDirectory::SetTo(const entry_ref* ref) {
    Unset();
    if (ref == nullptr || ref->name == nullptr)
        return Adopt(nullptr, entry_ref(), B_BAD_VALUE);
    host::OpenOptions options;
    options.access = host::Access::none;
    options.follow = host::Follow::yes;
    host::Result<std::unique_ptr<host::Node>> node = host::file_system().open(HostRef(*ref), options);
    if (!node)
        return Adopt(nullptr, entry_ref(), StatusOf(node));
    host::Result<host::NodeStat> stat = (*node)->stat();
    if (!stat)
        return Adopt(nullptr, entry_ref(), StatusOf(stat));
    if (stat->kind != host::NodeKind::directory)
        return Adopt(nullptr, entry_ref(), B_NOT_A_DIRECTORY);
    mDirectory = node_ref(stat->id.device, stat->id.inode);
    return Adopt(*std::move(node), *ref, B_OK);
}

status_t BDirectory::SetTo(const node_ref* ref) {
    if (ref == nullptr) {
        Unset();
        return Adopt(nullptr, entry_ref(), B_BAD_VALUE);
    }
    host::Result<host::EntryRef> entry = host::file_system().entry_of_directory({ref->device, ref->node});
    if (!entry) {
        Unset();
        return Adopt(nullptr, entry_ref(), StatusOf(entry));
    }
    entry_ref found = KitRef(*entry);
    return SetTo(&found);
}

status_t BDirectory::SetTo(const BEntry* entry) {
    entry_ref ref;
    status_t status = entry != nullptr ? entry->GetRef(&ref) : B_BAD_VALUE;
    if (status == B_OK)
        return SetTo(&ref);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

status_t BDirectory::SetTo(const char* path) {
    BEntry entry;
    status_t status = entry.SetTo(path);
    if (status == B_OK)
        return SetTo(&entry);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

status_t BDirectory::SetTo(const BDirectory* directory, const char* path) {
    BEntry entry;
    status_t status = path != nullptr ? entry.SetTo(directory, path) : B_BAD_VALUE;
    if (status == B_OK)
        return SetTo(&entry);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

void BDirectory::Unset() {
    BNode::Unset();
    mDirectory = node_ref();
    mReader.reset();
    mPending.reset();
}

status_t BDirectory::GetEntry(BEntry* entry) const {
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    if (entry == nullptr)
        return B_BAD_VALUE;
    host::Result<host::EntryRef> ref =
        host::file_system().entry_of_directory({mDirectory.device, mDirectory.node});
    if (!ref) {
        entry->Unset();
        return StatusOf(ref);
    }
    entry_ref found = KitRef(*ref);
    return entry->SetTo(&found);
}

bool BDirectory::IsRootDirectory() const {
    if (InitCheck() != B_OK)
        return false;
    host::Result<host::NodeId> root = host::file_system().root_of(mDirectory.device);
    return root && root->inode == mDirectory.node;
}

status_t BDirectory::FindEntry(const char* path, BEntry* entry, bool traverse) const {
    if (entry == nullptr)
        return B_BAD_VALUE;
    entry->Unset();
    BEntry found;
    status_t status = EntryBelow(*this, path, found);
    if (status == B_OK && traverse && found.IsSymLink()) {
        entry_ref ref;
        status = found.GetRef(&ref);
        if (status == B_OK)
            status = found.SetTo(&ref, true);
    }
    if (status != B_OK)
        return status;
    if (!found.Exists())
        return B_ENTRY_NOT_FOUND;
    *entry = found;
    return B_OK;
}

bool BDirectory::Contains(const char* path, int32 nodeFlags) const {
    BEntry entry;
    return InitCheck() == B_OK && EntryBelow(*this, path, entry) == B_OK && Contains(&entry, nodeFlags);
}

bool BDirectory::Contains(const BEntry* entry, int32 nodeFlags) const {
    if (InitCheck() != B_OK || entry == nullptr)
        return false;
    BEntry self;
    BPath directory;
    BPath path;
    if (GetEntry(&self) != B_OK || self.GetPath(&directory) != B_OK || entry->GetPath(&path) != B_OK)
        return false;
    std::string prefix = directory.Path();
    if (!prefix.ends_with('/'))
        prefix += '/';
    if (!std::string_view(path.Path()).starts_with(prefix) || prefix == path.Path())
        return false;
    entry_ref ref;
    entry->GetRef(&ref);
    host::Result<host::NodeStat> stat = host::file_system().stat(HostRef(ref));
    return stat && IsOfFlavor(stat->kind, nodeFlags);
}

status_t BDirectory::GetStatFor(const char* path, struct stat* stat) const {
    if (stat == nullptr)
        return B_BAD_VALUE;
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    if (path == nullptr || path[0] == '\0')
        return GetStat(stat);
    BEntry entry;
    status_t status = EntryBelow(*this, path, entry);
    return status == B_OK ? entry.GetStat(stat) : status;
}

status_t BDirectory::NextEntry(FoundEntry& entry) {
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    if (mPending != nullptr) {
        entry = std::move(*mPending);
        mPending.reset();
        return B_OK;
    }
    if (mReader == nullptr) {
        auto reader = host::file_system().read_directory({mDirectory.device, mDirectory.node});
        if (!reader)
            return StatusOf(reader);
        mReader = *std::move(reader);
    }
    host::DirectoryReader::Entry read;
    host::Status status = mReader->next(read);
    if (status) {
        entry.ref = {mDirectory.device, mDirectory.node, std::move(read.leaf)};
        entry.inode = read.inode;
    }
    return StatusOf(status);
}

status_t BDirectory::GetNextEntry(BEntry* entry, bool traverse) {
    if (entry == nullptr)
        return B_BAD_VALUE;
    entry_ref ref;
    status_t status = GetNextRef(&ref);
    if (status == B_OK)
        return entry->SetTo(&ref, traverse);
    entry->Unset();
    return status;
}

status_t BDirectory::GetNextRef(entry_ref* ref) {
    if (ref == nullptr)
        return B_BAD_VALUE;
    FoundEntry entry;
    status_t status = NextEntry(entry);
    if (status == B_OK)
        *ref = KitRef(entry.ref);
    return status;
}

int32 BDirectory::GetNextDirents(struct dirent* buffer, size_t length, int32 count) {
    return FillDirents(
        buffer, length, count, [this](FoundEntry& entry) { return NextEntry(entry); }, mPending);
}

status_t BDirectory::Rewind() {
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    mPending.reset();
    return mReader != nullptr ? StatusOf(mReader->rewind()) : B_OK;
}

int32 BDirectory::CountEntries() {
    if (InitCheck() != B_OK)
        return B_NO_INIT;
    auto reader = host::file_system().read_directory({mDirectory.device, mDirectory.node});
    if (!reader)
        return StatusOf(reader);
    int32 count = 0;
    host::DirectoryReader::Entry entry;
    host::Status status;
    while ((status = (*reader)->next(entry)))
        count++;
    return status.error() == ENOENT ? count : StatusOf(status);
}

status_t BDirectory::CreateDirectory(const char* path, BDirectory* directory) {
    BEntry entry;
    entry_ref ref;
    status_t status = EntryBelow(*this, path, entry);
    if (status == B_OK)
        status = entry.GetRef(&ref);
    constexpr std::uint32_t kMode = 0777;
    if (status == B_OK)
        status = StatusOf(host::file_system().make_directory(HostRef(ref), kMode));
    if (status == B_OK && directory != nullptr)
        status = directory->SetTo(&ref);
    return status;
}

status_t BDirectory::CreateFile(const char* path, BFile* file, bool failIfExists) {
    BEntry entry;
    status_t status = EntryBelow(*this, path, entry);
    if (status != B_OK)
        return status;
    BFile unwanted;
    uint32 mode = B_READ_WRITE | B_CREATE_FILE | (failIfExists ? B_FAIL_IF_EXISTS : B_ERASE_FILE);
    return (file != nullptr ? file : &unwanted)->SetTo(&entry, mode);
}

status_t BDirectory::CreateSymLink(const char* path, const char* linkToPath, BSymLink* link) {
    if (linkToPath == nullptr)
        return B_BAD_VALUE;
    BEntry entry;
    entry_ref ref;
    status_t status = EntryBelow(*this, path, entry);
    if (status == B_OK)
        status = entry.GetRef(&ref);
    if (status == B_OK)
        status = StatusOf(host::file_system().make_symbolic_link(HostRef(ref), linkToPath));
    if (status == B_OK && link != nullptr)
        status = link->SetTo(&ref);
    return status;
}

status_t create_directory(const char* path, mode_t mode) {
    if (path == nullptr || path[0] == '\0')
        return B_BAD_VALUE;
    std::string absolute = path;
    if (status_t status = MakeAbsolute(absolute); status != B_OK)
        return status;
    for (size_t end = absolute.find('/', 1);; end = absolute.find('/', end + 1)) {
        std::string part = absolute.substr(0, end);
        // Doubled and trailing slashes name nothing new.
        if (part.empty() || part.ends_with('/')) {
            if (end == std::string::npos)
                return B_OK;
            continue;
        }
        BEntry entry(part.c_str(), true);
        entry_ref ref;
        status_t status = entry.InitCheck() == B_OK ? entry.GetRef(&ref) : entry.InitCheck();
        if (status == B_OK && !entry.Exists())
            status = StatusOf(host::file_system().make_directory(HostRef(ref), mode));
        // Another process may have been quicker.
        if (status == B_FILE_EXISTS)
            status = B_OK;
        if (status == B_OK && !entry.IsDirectory())
            status = B_NOT_A_DIRECTORY;
        if (status != B_OK || end == std::string::npos)
            return status;
    }
}
