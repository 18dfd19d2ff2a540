// find_directory: where the directories of the system and the user are.
#pragma once

#include <SupportDefs.h>

class BPath;
class BVolume;

// Any int may be asked for, so that a wrong number is an answer and not an accident.
enum directory_which : int {
    B_DESKTOP_DIRECTORY = 0,
    B_TRASH_DIRECTORY,

    B_COMMON_DIRECTORY = 2000,
    B_COMMON_SYSTEM_DIRECTORY,
    B_COMMON_ADDONS_DIRECTORY,
    B_COMMON_BOOT_DIRECTORY,
    B_COMMON_FONTS_DIRECTORY,
    B_COMMON_LIB_DIRECTORY,
    B_COMMON_SERVERS_DIRECTORY,
    B_COMMON_BIN_DIRECTORY,
    B_COMMON_ETC_DIRECTORY,
    B_COMMON_DOCUMENTATION_DIRECTORY,
    B_COMMON_SETTINGS_DIRECTORY,
    B_COMMON_DEVELOP_DIRECTORY,
    B_COMMON_LOG_DIRECTORY,
    B_COMMON_SPOOL_DIRECTORY,
    B_COMMON_TEMP_DIRECTORY,
    B_COMMON_VAR_DIRECTORY,
    B_COMMON_TRANSLATORS_DIRECTORY,
    B_COMMON_MEDIA_NODES_DIRECTORY,
    B_COMMON_SOUNDS_DIRECTORY,

    B_USER_DIRECTORY = 3000,
    B_USER_CONFIG_DIRECTORY,
    B_USER_ADDONS_DIRECTORY,
    B_USER_BOOT_DIRECTORY,
    B_USER_FONTS_DIRECTORY,
    B_USER_LIB_DIRECTORY,
    B_USER_SETTINGS_DIRECTORY,
    B_USER_DESKBAR_DIRECTORY,
    B_USER_PRINTERS_DIRECTORY,
    B_USER_TRANSLATORS_DIRECTORY,
    B_USER_MEDIA_NODES_DIRECTORY,
    B_USER_SOUNDS_DIRECTORY,

    B_APPS_DIRECTORY = 4000,
    B_PREFERENCES_DIRECTORY,
    B_UTILITIES_DIRECTORY,
};
static_assert(B_COMMON_SETTINGS_DIRECTORY == 2010);

// The common and the user's directories are this user's own, by the desktop's rules for base directories;
// there is one settings directory. The result is B_ENTRY_NOT_FOUND when the directory does not exist and is
// not to be made, B_BAD_VALUE for a null path or a number that names none, B_UNSUPPORTED for a directory that
// this system does not have, or what making it answers. The volume makes no difference and may be null. Any
// thread.
status_t find_directory(directory_which which, BPath* path, bool createIt = false, BVolume* volume = nullptr);
// The same as text; B_BAD_VALUE when the buffer is too small.
status_t find_directory(directory_which which, dev_t device, bool createIt, char* path, int32 length);
