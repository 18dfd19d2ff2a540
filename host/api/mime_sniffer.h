// Which MIME type a file has, from its name and its first bytes, by the desktop's shared MIME database.
//
// Thread rule: any thread.
#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <string_view>

namespace host {

// The number of first bytes that is enough for every rule of the database.
inline constexpr std::size_t sniff_size = 16384;

inline constexpr std::string_view unknown_type = "application/octet-stream";

// The type by name and contents together: the name decides where it is clear, the bytes where it is not.
// `leaf` is the file's name without folders, any bytes; `first_bytes` may be empty. unknown_type when nothing
// fits.
[[nodiscard]] std::string type_of_file(std::string_view leaf, std::span<const std::byte> first_bytes);

// The same for a file on disk, whose first bytes are read only when its name leaves the type open. Folders,
// mount points, devices, pipes and sockets get their "inode/..." types. Empty when there is no such file.
[[nodiscard]] std::string type_of_path(const std::string& path);

// By name alone; unknown_type when the name says nothing.
[[nodiscard]] std::string type_of_name(std::string_view leaf);

// By contents alone.
[[nodiscard]] std::string type_of_data(std::span<const std::byte> first_bytes);

// The name by which the kits know a type that the desktop's database calls otherwise ("audio/mpeg" is
// "audio/x-mpeg" there); names without such an alias come back as they are. The functions above already
// answer with the kits' names.
[[nodiscard]] std::string_view kit_type_of(std::string_view desktop_type);

// The way back, for asking the desktop about a type.
[[nodiscard]] std::string_view desktop_type_of(std::string_view kit_type);

// The database's words for a type ("MP3 audio"); empty for a type that it does not know.
[[nodiscard]] std::string describe_type(std::string_view type);

} // namespace host
