#pragma once

#include "host/linux/attribute_store.h"
#include "host/linux/directory_cache.h"
#include "host/linux/opening.h"
#include "host/linux/volume_table.h"
#include "support/temporary_environment.h"
#include <fcntl.h>
#include <string>
#include <sys/xattr.h>
#include <vector>

namespace test {

inline constexpr std::uint32_t kText = 0x43535452;   // 'CSTR'
inline constexpr std::uint32_t kNumber = 0x4c4f4e47; // 'LONG'

/// An open file for the attribute functions, made when it is not there.
class OpenFile {
  public:
    explicit OpenFile(const std::string& path) : path_(path) {
        descriptor_ = host::Descriptor(::open(path.c_str(), O_RDONLY | O_CREAT | O_CLOEXEC, 0644));
        const host::Result<host::DeviceId> volume = host::volumes().volume_of(path);
        device_ = volume.ok() ? *volume : 0;
    }

    const std::string& path() const { return path_; }
    host::AttributeFile file() const { return {descriptor_.get(), device_}; }
    host::DeviceId device() const { return device_; }

    host::Status write(const std::string& name, const std::string& value, std::uint32_t type = kText) const {
        return host::write_attribute(file(), name.c_str(), type, 0, value.data(), value.size());
    }
    host::Status write_at(const std::string& name, std::int64_t offset, const std::string& value) const {
        return host::write_attribute(file(), name.c_str(), kText, offset, value.data(), value.size());
    }
    /// The whole value; "<errno N>" when it cannot be read.
    std::string read(const std::string& name) const {
        const host::Result<host::AttributeInfo> info = host::attribute_info(file(), name.c_str());
        if (!info.ok())
            return "<errno " + std::to_string(info.error()) + ">";
        std::string value(static_cast<std::size_t>(info->size), '\0');
        const host::Result<std::size_t> count =
            host::read_attribute(file(), name.c_str(), 0, value.data(), value.size());
        if (!count.ok())
            return "<errno " + std::to_string(count.error()) + ">";
        value.resize(*count);
        return value;
    }
    /// The extended attribute as it lies on disk.
    std::string raw(const std::string& extended_name) const {
        std::string value(65536, '\0');
        const ssize_t size =
            ::fgetxattr(descriptor_.get(), extended_name.c_str(), value.data(), value.size());
        value.resize(size < 0 ? 0 : static_cast<std::size_t>(size));
        return value;
    }
    bool is_spilled(const std::string& name) const {
        const std::string stored = raw("user.be." + name);
        return stored.size() == 52 && stored.compare(0, 4, std::string("\0blb", 4)) == 0;
    }

  private:
    std::string path_;
    host::Descriptor descriptor_;
    host::DeviceId device_ = 0;
};

/// Bytes that no compression or repetition helps with, the same for the same seed.
inline std::string noise(std::size_t size, unsigned seed) {
    std::string bytes(size, '\0');
    std::uint64_t state = seed * 2654435761u + 1;
    for (char& byte : bytes) {
        state = state * 6364136223846793005u + 1442695040888963407u;
        byte = static_cast<char>(state >> 56);
    }
    return bytes;
}

} // namespace test
