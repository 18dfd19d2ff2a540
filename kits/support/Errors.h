// Every status code of the kits, with the platform's values, and the texts for them.
// Success is B_OK (0) or a positive answer such as a count or an id; every failure is negative.
#pragma once

#include <cstring>
#include <stdint.h>

typedef int32_t status_t;

inline constexpr status_t B_GENERAL_ERROR_BASE = INT32_MIN;
inline constexpr status_t B_OS_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x1000;
inline constexpr status_t B_APP_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x2000;
inline constexpr status_t B_INTERFACE_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x3000;
inline constexpr status_t B_MEDIA_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x4000;
inline constexpr status_t B_TRANSLATION_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x4800;
inline constexpr status_t B_MIDI_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x5000;
inline constexpr status_t B_STORAGE_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x6000;
inline constexpr status_t B_POSIX_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x7000;
inline constexpr status_t B_MAIL_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x8000;
inline constexpr status_t B_PRINT_ERROR_BASE = B_GENERAL_ERROR_BASE + 0x9000;
inline constexpr status_t B_DEVICE_ERROR_BASE = B_GENERAL_ERROR_BASE + 0xA000;
// Codes from here on are free for applications.
inline constexpr status_t B_ERRORS_END = B_GENERAL_ERROR_BASE + 0xFFFF;

inline constexpr status_t B_OK = 0;
inline constexpr status_t B_NO_ERROR = 0;
inline constexpr status_t B_ERROR = -1;

inline constexpr status_t B_NO_MEMORY = B_GENERAL_ERROR_BASE;
inline constexpr status_t B_IO_ERROR = B_GENERAL_ERROR_BASE + 1;
inline constexpr status_t B_PERMISSION_DENIED = B_GENERAL_ERROR_BASE + 2;
inline constexpr status_t B_BAD_INDEX = B_GENERAL_ERROR_BASE + 3;
inline constexpr status_t B_BAD_TYPE = B_GENERAL_ERROR_BASE + 4;
inline constexpr status_t B_BAD_VALUE = B_GENERAL_ERROR_BASE + 5;
inline constexpr status_t B_MISMATCHED_VALUES = B_GENERAL_ERROR_BASE + 6;
inline constexpr status_t B_NAME_NOT_FOUND = B_GENERAL_ERROR_BASE + 7;
inline constexpr status_t B_NAME_IN_USE = B_GENERAL_ERROR_BASE + 8;
inline constexpr status_t B_TIMED_OUT = B_GENERAL_ERROR_BASE + 9;
inline constexpr status_t B_INTERRUPTED = B_GENERAL_ERROR_BASE + 10;
inline constexpr status_t B_WOULD_BLOCK = B_GENERAL_ERROR_BASE + 11;
inline constexpr status_t B_CANCELED = B_GENERAL_ERROR_BASE + 12;
inline constexpr status_t B_NO_INIT = B_GENERAL_ERROR_BASE + 13;
inline constexpr status_t B_BUSY = B_GENERAL_ERROR_BASE + 14;
inline constexpr status_t B_NOT_ALLOWED = B_GENERAL_ERROR_BASE + 15;
inline constexpr status_t B_BAD_DATA = B_GENERAL_ERROR_BASE + 16;
inline constexpr status_t B_DONT_DO_THAT = B_GENERAL_ERROR_BASE + 17;

inline constexpr status_t B_BAD_SEM_ID = B_OS_ERROR_BASE;
inline constexpr status_t B_NO_MORE_SEMS = B_OS_ERROR_BASE + 1;
inline constexpr status_t B_BAD_THREAD_ID = B_OS_ERROR_BASE + 0x100;
inline constexpr status_t B_NO_MORE_THREADS = B_OS_ERROR_BASE + 0x101;
inline constexpr status_t B_BAD_THREAD_STATE = B_OS_ERROR_BASE + 0x102;
inline constexpr status_t B_BAD_TEAM_ID = B_OS_ERROR_BASE + 0x103;
inline constexpr status_t B_NO_MORE_TEAMS = B_OS_ERROR_BASE + 0x104;
inline constexpr status_t B_BAD_PORT_ID = B_OS_ERROR_BASE + 0x200;
inline constexpr status_t B_NO_MORE_PORTS = B_OS_ERROR_BASE + 0x201;
inline constexpr status_t B_BAD_IMAGE_ID = B_OS_ERROR_BASE + 0x300;
inline constexpr status_t B_BAD_ADDRESS = B_OS_ERROR_BASE + 0x301;
inline constexpr status_t B_NOT_AN_EXECUTABLE = B_OS_ERROR_BASE + 0x302;
inline constexpr status_t B_MISSING_LIBRARY = B_OS_ERROR_BASE + 0x303;
inline constexpr status_t B_MISSING_SYMBOL = B_OS_ERROR_BASE + 0x304;
inline constexpr status_t B_DEBUGGER_ALREADY_INSTALLED = B_OS_ERROR_BASE + 0x400;

inline constexpr status_t B_BAD_REPLY = B_APP_ERROR_BASE;
inline constexpr status_t B_DUPLICATE_REPLY = B_APP_ERROR_BASE + 1;
inline constexpr status_t B_MESSAGE_TO_SELF = B_APP_ERROR_BASE + 2;
inline constexpr status_t B_BAD_HANDLER = B_APP_ERROR_BASE + 3;
inline constexpr status_t B_ALREADY_RUNNING = B_APP_ERROR_BASE + 4;
inline constexpr status_t B_LAUNCH_FAILED = B_APP_ERROR_BASE + 5;
inline constexpr status_t B_AMBIGUOUS_APP_LAUNCH = B_APP_ERROR_BASE + 6;
inline constexpr status_t B_UNKNOWN_MIME_TYPE = B_APP_ERROR_BASE + 7;
inline constexpr status_t B_BAD_SCRIPT_SYNTAX = B_APP_ERROR_BASE + 8;
inline constexpr status_t B_LAUNCH_FAILED_NO_RESOLVE_LINK = B_APP_ERROR_BASE + 9;
inline constexpr status_t B_LAUNCH_FAILED_EXECUTABLE = B_APP_ERROR_BASE + 10;
inline constexpr status_t B_LAUNCH_FAILED_APP_NOT_FOUND = B_APP_ERROR_BASE + 11;
inline constexpr status_t B_LAUNCH_FAILED_APP_IN_TRASH = B_APP_ERROR_BASE + 12;
inline constexpr status_t B_LAUNCH_FAILED_NO_PREFERRED_APP = B_APP_ERROR_BASE + 13;
inline constexpr status_t B_LAUNCH_FAILED_FILES_APP_NOT_FOUND = B_APP_ERROR_BASE + 14;
inline constexpr status_t B_BAD_MIME_SNIFFER_RULE = B_APP_ERROR_BASE + 15;
inline constexpr status_t B_NOT_A_MESSAGE = B_APP_ERROR_BASE + 16;
inline constexpr status_t B_SHUTDOWN_CANCELLED = B_APP_ERROR_BASE + 17;
inline constexpr status_t B_SHUTTING_DOWN = B_APP_ERROR_BASE + 18;

inline constexpr status_t B_TRANSLATION_BASE_ERROR = B_TRANSLATION_ERROR_BASE;
inline constexpr status_t B_NO_TRANSLATOR = B_TRANSLATION_ERROR_BASE;
inline constexpr status_t B_ILLEGAL_DATA = B_TRANSLATION_ERROR_BASE + 1;

inline constexpr status_t B_FILE_ERROR = B_STORAGE_ERROR_BASE;
inline constexpr status_t B_FILE_NOT_FOUND = B_STORAGE_ERROR_BASE + 1;
inline constexpr status_t B_FILE_EXISTS = B_STORAGE_ERROR_BASE + 2;
inline constexpr status_t B_ENTRY_NOT_FOUND = B_STORAGE_ERROR_BASE + 3;
inline constexpr status_t B_NAME_TOO_LONG = B_STORAGE_ERROR_BASE + 4;
inline constexpr status_t B_NOT_A_DIRECTORY = B_STORAGE_ERROR_BASE + 5;
inline constexpr status_t B_DIRECTORY_NOT_EMPTY = B_STORAGE_ERROR_BASE + 6;
inline constexpr status_t B_DEVICE_FULL = B_STORAGE_ERROR_BASE + 7;
inline constexpr status_t B_READ_ONLY_DEVICE = B_STORAGE_ERROR_BASE + 8;
inline constexpr status_t B_IS_A_DIRECTORY = B_STORAGE_ERROR_BASE + 9;
inline constexpr status_t B_NO_MORE_FDS = B_STORAGE_ERROR_BASE + 10;
inline constexpr status_t B_CROSS_DEVICE_LINK = B_STORAGE_ERROR_BASE + 11;
inline constexpr status_t B_LINK_LIMIT = B_STORAGE_ERROR_BASE + 12;
inline constexpr status_t B_BUSTED_PIPE = B_STORAGE_ERROR_BASE + 13;
inline constexpr status_t B_UNSUPPORTED = B_STORAGE_ERROR_BASE + 14;
inline constexpr status_t B_PARTITION_TOO_SMALL = B_STORAGE_ERROR_BASE + 15;
inline constexpr status_t B_PARTIAL_READ = B_STORAGE_ERROR_BASE + 16;
inline constexpr status_t B_PARTIAL_WRITE = B_STORAGE_ERROR_BASE + 17;

// The system errors that have no code above. The E... macros themselves keep this host's positive values.
inline constexpr status_t B_POSIX_E2BIG = B_POSIX_ERROR_BASE + 1;
inline constexpr status_t B_POSIX_ECHILD = B_POSIX_ERROR_BASE + 2;
inline constexpr status_t B_POSIX_EDEADLK = B_POSIX_ERROR_BASE + 3;
inline constexpr status_t B_POSIX_EFBIG = B_POSIX_ERROR_BASE + 4;
inline constexpr status_t B_POSIX_EMLINK = B_POSIX_ERROR_BASE + 5;
inline constexpr status_t B_POSIX_ENFILE = B_POSIX_ERROR_BASE + 6;
inline constexpr status_t B_POSIX_ENODEV = B_POSIX_ERROR_BASE + 7;
inline constexpr status_t B_POSIX_ENOLCK = B_POSIX_ERROR_BASE + 8;
inline constexpr status_t B_POSIX_ENOSYS = B_POSIX_ERROR_BASE + 9;
inline constexpr status_t B_POSIX_ENOTTY = B_POSIX_ERROR_BASE + 10;
inline constexpr status_t B_POSIX_ENXIO = B_POSIX_ERROR_BASE + 11;
inline constexpr status_t B_POSIX_ESPIPE = B_POSIX_ERROR_BASE + 12;
inline constexpr status_t B_POSIX_ESRCH = B_POSIX_ERROR_BASE + 13;
inline constexpr status_t B_POSIX_EDOM = B_POSIX_ERROR_BASE + 16;
inline constexpr status_t B_POSIX_ERANGE = B_POSIX_ERROR_BASE + 17;
inline constexpr status_t B_POSIX_EPROTOTYPE = B_POSIX_ERROR_BASE + 18;
inline constexpr status_t B_POSIX_EPROTONOSUPPORT = B_POSIX_ERROR_BASE + 19;
inline constexpr status_t B_POSIX_EAFNOSUPPORT = B_POSIX_ERROR_BASE + 21;
inline constexpr status_t B_POSIX_EADDRINUSE = B_POSIX_ERROR_BASE + 22;
inline constexpr status_t B_POSIX_EADDRNOTAVAIL = B_POSIX_ERROR_BASE + 23;
inline constexpr status_t B_POSIX_ENETDOWN = B_POSIX_ERROR_BASE + 24;
inline constexpr status_t B_POSIX_ENETUNREACH = B_POSIX_ERROR_BASE + 25;
inline constexpr status_t B_POSIX_ENETRESET = B_POSIX_ERROR_BASE + 26;
inline constexpr status_t B_POSIX_ECONNABORTED = B_POSIX_ERROR_BASE + 27;
inline constexpr status_t B_POSIX_ECONNRESET = B_POSIX_ERROR_BASE + 28;
inline constexpr status_t B_POSIX_EISCONN = B_POSIX_ERROR_BASE + 29;
inline constexpr status_t B_POSIX_ENOTCONN = B_POSIX_ERROR_BASE + 30;
inline constexpr status_t B_POSIX_ECONNREFUSED = B_POSIX_ERROR_BASE + 32;
inline constexpr status_t B_POSIX_EHOSTUNREACH = B_POSIX_ERROR_BASE + 33;
inline constexpr status_t B_POSIX_ENOPROTOOPT = B_POSIX_ERROR_BASE + 34;
inline constexpr status_t B_POSIX_ENOBUFS = B_POSIX_ERROR_BASE + 35;
inline constexpr status_t B_POSIX_EINPROGRESS = B_POSIX_ERROR_BASE + 36;
inline constexpr status_t B_POSIX_EALREADY = B_POSIX_ERROR_BASE + 37;
inline constexpr status_t B_POSIX_EILSEQ = B_POSIX_ERROR_BASE + 38;
inline constexpr status_t B_POSIX_ENOMSG = B_POSIX_ERROR_BASE + 39;
inline constexpr status_t B_POSIX_ESTALE = B_POSIX_ERROR_BASE + 40;
inline constexpr status_t B_POSIX_EOVERFLOW = B_POSIX_ERROR_BASE + 41;
inline constexpr status_t B_POSIX_EMSGSIZE = B_POSIX_ERROR_BASE + 42;
inline constexpr status_t B_POSIX_EOPNOTSUPP = B_POSIX_ERROR_BASE + 43;
inline constexpr status_t B_POSIX_ENOTSOCK = B_POSIX_ERROR_BASE + 44;
inline constexpr status_t B_POSIX_EBADMSG = B_POSIX_ERROR_BASE + 46;
inline constexpr status_t B_POSIX_EDESTADDRREQ = B_POSIX_ERROR_BASE + 48;
inline constexpr status_t B_POSIX_EDQUOT = B_POSIX_ERROR_BASE + 49;
inline constexpr status_t B_POSIX_ENODATA = B_POSIX_ERROR_BASE + 52;
inline constexpr status_t B_POSIX_EPROTO = B_POSIX_ERROR_BASE + 57;
inline constexpr status_t B_POSIX_ETXTBSY = B_POSIX_ERROR_BASE + 59;

// A readable English text for any code: the kits' own (negative), zero, and this host's errno values
// (positive). The text is never null and never freed. It lives for ever, except that of a code nobody
// defined, which holds until the calling thread's next call. Any thread.
[[nodiscard]] const char* status_text(status_t code);

// Application code asks strerror() for the text of a status code. The C library knows only its own positive
// numbers, so after this header the plain call strerror(code) means status_text(code).
#define strerror(code) status_text(code)

// The status code for a value of this host's errno: 0 gives B_OK, an unknown one B_ERROR. A value that is
// negative already is taken for a status code and comes back as it is. Any thread.
[[nodiscard]] status_t status_from_errno(int errorNumber);
