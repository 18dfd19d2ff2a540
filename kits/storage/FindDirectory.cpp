#include <FindDirectory.h>

#include <CopyText.h>
#include <Directory.h>
#include <Entry.h>
#include <HostConversions.h>
#include <Path.h>

#include "host/api/directories.h"

namespace {

// Where a directory is; empty for one that this system does not have. False for a number that names none.
bool PathOf(directory_which which, std::string& path) {
    switch (which) {
    case B_DESKTOP_DIRECTORY:
        path = host::desktop_directory();
        return true;
    case B_TRASH_DIRECTORY:
        path = host::trash_directory();
        return true;
    case B_USER_DIRECTORY:
        path = host::home_directory();
        return true;
    case B_COMMON_DIRECTORY:
    case B_COMMON_SYSTEM_DIRECTORY:
    case B_USER_CONFIG_DIRECTORY:
        path = host::config_directory();
        return true;
    case B_COMMON_SETTINGS_DIRECTORY:
    case B_USER_SETTINGS_DIRECTORY:
        path = host::config_directory() + "/settings";
        return true;
    case B_COMMON_ADDONS_DIRECTORY:
    case B_USER_ADDONS_DIRECTORY:
        path = host::data_directory() + "/add-ons";
        return true;
    case B_COMMON_TRANSLATORS_DIRECTORY:
    case B_USER_TRANSLATORS_DIRECTORY:
        path = host::data_directory() + "/add-ons/Translators";
        return true;
    case B_COMMON_MEDIA_NODES_DIRECTORY:
    case B_USER_MEDIA_NODES_DIRECTORY:
        path = host::data_directory() + "/add-ons/media";
        return true;
    case B_COMMON_FONTS_DIRECTORY:
    case B_USER_FONTS_DIRECTORY:
        path = host::data_directory() + "/fonts";
        return true;
    case B_COMMON_SOUNDS_DIRECTORY:
    case B_USER_SOUNDS_DIRECTORY:
        path = host::data_directory() + "/sounds";
        return true;
    case B_COMMON_VAR_DIRECTORY:
        path = host::data_directory();
        return true;
    case B_COMMON_LOG_DIRECTORY:
        path = host::data_directory() + "/log";
        return true;
    case B_COMMON_SPOOL_DIRECTORY:
        path = host::data_directory() + "/spool";
        return true;
    case B_COMMON_TEMP_DIRECTORY:
        path = host::temporary_directory();
        return true;
    default:
        break;
    }
    path.clear();
    return (which >= B_COMMON_DIRECTORY && which <= B_COMMON_SOUNDS_DIRECTORY) ||
           (which >= B_USER_DIRECTORY && which <= B_USER_SOUNDS_DIRECTORY) ||
           (which >= B_APPS_DIRECTORY && which <= B_UTILITIES_DIRECTORY);
}

status_t FindPath(directory_which which, bool createIt, std::string& path) {
    if (!PathOf(which, path))
        return B_BAD_VALUE;
    if (path.empty())
        return B_UNSUPPORTED;
    if (createIt) {
        if (host::Status status = host::make_directories(path); !status)
            return StatusOf(status);
    }
    BEntry entry(path.c_str(), true);
    if (entry.InitCheck() != B_OK)
        return entry.InitCheck();
    if (!entry.Exists())
        return B_ENTRY_NOT_FOUND;
    return entry.IsDirectory() ? B_OK : B_NOT_A_DIRECTORY;
}

} // namespace

status_t find_directory(directory_which which, BPath* path, bool createIt, BVolume*) {
    if (path == nullptr)
        return B_BAD_VALUE;
    std::string found;
    status_t status = FindPath(which, createIt, found);
    return status == B_OK ? path->SetTo(found.c_str()) : status;
}

status_t find_directory(directory_which which, dev_t, bool createIt, char* path, int32 length) {
    if (path == nullptr || length <= 0)
        return B_BAD_VALUE;
    std::string found;
    if (status_t status = FindPath(which, createIt, found); status != B_OK)
        return status;
    return CopyText(path, static_cast<size_t>(length), found.c_str()) ? B_OK : B_BAD_VALUE;
}
