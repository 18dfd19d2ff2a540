// Well-known MIME types, the sizes of icons, and the attributes in which a file keeps both.
#pragma once

#include <SupportDefs.h>

// Pixels on a side.
enum icon_size {
    B_LARGE_ICON = 32,
    B_MINI_ICON = 16,
};

inline constexpr const char* B_APP_MIME_TYPE = "application/x-vnd.be-elfexecutable";
inline constexpr const char* B_ELF_APP_MIME_TYPE = "application/x-vnd.be-elfexecutable";
inline constexpr const char* B_RESOURCE_MIME_TYPE = "application/x-be-resource";
inline constexpr const char* B_FILE_MIME_TYPE = "application/octet-stream";
