#include "host/linux/directory_stream.h"

#include "host/linux/system_calls.h"
#include <cerrno>
#include <cstring>
#include <dirent.h>

namespace host {

DirectoryStream::DirectoryStream(int descriptor, std::size_t buffer_size)
    : descriptor_(descriptor), buffer_size_(buffer_size), buffer_(new char[buffer_size]) {}

bool DirectoryStream::next(Entry& entry) {
    for (;;) {
        if (position_ >= used_) {
            ssize_t count = -1;
            do {
                count = system_calls().getdents(descriptor_, buffer_.get(), buffer_size_);
            } while (count < 0 && errno == EINTR);
            if (count <= 0) {
                // A directory that was removed while it is read ends here; that is no failure.
                error_ = count < 0 && errno != ENOENT ? errno : 0;
                return false;
            }
            used_ = static_cast<std::size_t>(count);
            position_ = 0;
        }
        // The kernel's record is struct dirent64: inode, offset, length, type, name.
        const char* record = buffer_.get() + position_;
        unsigned short length = 0;
        std::memcpy(&length, record + offsetof(struct dirent64, d_reclen), sizeof(length));
        position_ += length;

        const char* name = record + offsetof(struct dirent64, d_name);
        if (name[0] == '.' && (name[1] == '\0' || (name[1] == '.' && name[2] == '\0')))
            continue;
        std::memcpy(&entry.inode, record + offsetof(struct dirent64, d_ino), sizeof(entry.inode));
        entry.type = static_cast<unsigned char>(record[offsetof(struct dirent64, d_type)]);
        entry.leaf = std::string_view(name);
        return true;
    }
}

} // namespace host
