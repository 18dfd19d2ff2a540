// Which type a file has and which icon its type has, kept in memory. Internal to the storage kit.
//
// Changes of the MIME database by this process are seen at once, those of other processes within half a
// second. Any thread.
#pragma once

#include <IconBits.h>

#include <string>
#include <string_view>

class BBitmap;
struct node_ref;

inline constexpr std::string_view kVolumeType = "application/x-vnd.be-volume";
inline constexpr std::string_view kDirectoryType = "application/x-vnd.be-directory";
inline constexpr std::string_view kSymLinkType = "application/x-vnd.be-symlink";

// Fills the bitmap with the icon of a type: its record's, else its supertype's record's, else the desktop's.
// B_BAD_VALUE for a bitmap that is not exactly as large.
[[nodiscard]] status_t GetTypeIcon(std::string_view type, BBitmap* icon, icon_size size);

// The type that a name's extension has in the MIME database, or by the desktop's rules; empty when it says
// nothing.
[[nodiscard]] std::string TypeOfName(std::string_view leaf);

// kVolumeType for the root of a volume, else kDirectoryType.
[[nodiscard]] std::string_view TypeOfDirectory(const node_ref& directory);

// After this process has changed the database.
void ForgetTypeIcons();
