#pragma once

#include "host/api/result.h"
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

namespace host {

/// Reads the entries of an open directory without a stat or an allocation per entry. Borrows the descriptor
/// and moves its read position, so a descriptor that is shared (DirectoryCache) must not be streamed: open it
/// anew with reopen_directory(). One thread at a time.
class DirectoryStream {
  public:
    struct Entry {
        std::string_view leaf;   ///< terminated by a zero byte; valid until the next call
        std::uint64_t inode = 0; ///< of the covered directory where something is mounted on it
        unsigned char type = 0;  ///< DT_REG, DT_DIR, ... or DT_UNKNOWN where the file system does not say
    };

    explicit DirectoryStream(int descriptor, std::size_t buffer_size = 32768);

    /// False at the end or on failure; error() tells them apart. "." and ".." are left out.
    bool next(Entry& entry);
    int error() const { return error_; }

  private:
    int descriptor_ = -1;
    std::size_t buffer_size_ = 0;
    std::unique_ptr<char[]> buffer_;
    std::size_t used_ = 0;
    std::size_t position_ = 0;
    int error_ = 0;
};

} // namespace host
