#include <Errors.h>

#include <cerrno>
#include <cstdio>

namespace {

struct Text {
    status_t code;
    const char* text;
};

constexpr Text kTexts[] = {
    {B_OK, "No error"},
    {B_ERROR, "General error"},

    {B_NO_MEMORY, "Out of memory"},
    {B_IO_ERROR, "Input/output error"},
    {B_PERMISSION_DENIED, "Permission denied"},
    {B_BAD_INDEX, "Index out of range"},
    {B_BAD_TYPE, "Wrong type of data"},
    {B_BAD_VALUE, "Invalid argument"},
    {B_MISMATCHED_VALUES, "Values do not match"},
    {B_NAME_NOT_FOUND, "Name not found"},
    {B_NAME_IN_USE, "Name is already in use"},
    {B_TIMED_OUT, "Operation timed out"},
    {B_INTERRUPTED, "Operation was interrupted"},
    {B_WOULD_BLOCK, "Operation would block"},
    {B_CANCELED, "Operation was cancelled"},
    {B_NO_INIT, "Object is not initialised"},
    {B_BUSY, "Resource is busy"},
    {B_NOT_ALLOWED, "Operation is not allowed"},
    {B_BAD_DATA, "Damaged data"},
    {B_DONT_DO_THAT, "Operation makes no sense here"},

    {B_BAD_SEM_ID, "No such semaphore"},
    {B_NO_MORE_SEMS, "No more semaphores"},
    {B_BAD_THREAD_ID, "No such thread"},
    {B_NO_MORE_THREADS, "No more threads"},
    {B_BAD_THREAD_STATE, "Thread is in the wrong state"},
    {B_BAD_TEAM_ID, "No such team"},
    {B_NO_MORE_TEAMS, "No more teams"},
    {B_BAD_PORT_ID, "No such port"},
    {B_NO_MORE_PORTS, "No more ports"},
    {B_BAD_IMAGE_ID, "No such program image"},
    {B_BAD_ADDRESS, "Bad address"},
    {B_NOT_AN_EXECUTABLE, "Not a program"},
    {B_MISSING_LIBRARY, "A library is missing"},
    {B_MISSING_SYMBOL, "A symbol is missing"},
    {B_DEBUGGER_ALREADY_INSTALLED, "A debugger is already attached"},

    {B_BAD_REPLY, "Reply is not valid"},
    {B_DUPLICATE_REPLY, "Message has been replied to already"},
    {B_MESSAGE_TO_SELF, "Looper cannot wait for a reply from itself"},
    {B_BAD_HANDLER, "Handler is not valid"},
    {B_ALREADY_RUNNING, "Already running"},
    {B_LAUNCH_FAILED, "Program could not be started"},
    {B_AMBIGUOUS_APP_LAUNCH, "Several programs could be started"},
    {B_UNKNOWN_MIME_TYPE, "Type of file is not known"},
    {B_BAD_SCRIPT_SYNTAX, "Scripting message is not valid"},
    {B_LAUNCH_FAILED_NO_RESOLVE_LINK, "Program could not be started: its link leads nowhere"},
    {B_LAUNCH_FAILED_EXECUTABLE, "Program could not be started: it is not executable"},
    {B_LAUNCH_FAILED_APP_NOT_FOUND, "Program could not be started: it was not found"},
    {B_LAUNCH_FAILED_APP_IN_TRASH, "Program could not be started: it lies in the trash"},
    {B_LAUNCH_FAILED_NO_PREFERRED_APP, "No preferred program for this type of file"},
    {B_LAUNCH_FAILED_FILES_APP_NOT_FOUND, "No program found for this file"},
    {B_BAD_MIME_SNIFFER_RULE, "Rule for recognising files is not valid"},
    {B_NOT_A_MESSAGE, "Not a message"},
    {B_SHUTDOWN_CANCELLED, "Shutdown was cancelled"},
    {B_SHUTTING_DOWN, "System is shutting down"},

    {B_NO_TRANSLATOR, "No translator for this data"},
    {B_ILLEGAL_DATA, "Data cannot be translated"},

    {B_FILE_ERROR, "File is not open"},
    {B_FILE_NOT_FOUND, "File not found"},
    {B_FILE_EXISTS, "File or folder already exists"},
    {B_ENTRY_NOT_FOUND, "No such file or folder"},
    {B_NAME_TOO_LONG, "Name is too long"},
    {B_NOT_A_DIRECTORY, "Not a folder"},
    {B_DIRECTORY_NOT_EMPTY, "Folder is not empty"},
    {B_DEVICE_FULL, "No space left on the volume"},
    {B_READ_ONLY_DEVICE, "Volume is read-only"},
    {B_IS_A_DIRECTORY, "Is a folder"},
    {B_NO_MORE_FDS, "Too many open files"},
    {B_CROSS_DEVICE_LINK, "Source and target lie on different volumes"},
    {B_LINK_LIMIT, "Too many links"},
    {B_BUSTED_PIPE, "Nobody reads the other end"},
    {B_UNSUPPORTED, "Operation is not supported"},
    {B_PARTITION_TOO_SMALL, "Partition is too small"},
    {B_PARTIAL_READ, "Less was read than asked for"},
    {B_PARTIAL_WRITE, "Less was written than asked for"},
};

struct Counterpart {
    int errorNumber;
    status_t code;
};

// Where two of the host's numbers share a code, the one that the code's text comes from stands first.
constexpr Counterpart kCounterparts[] = {
    {ENOMEM, B_NO_MEMORY},
    {EIO, B_IO_ERROR},
    {EACCES, B_PERMISSION_DENIED},
    {EINVAL, B_BAD_VALUE},
    {ETIMEDOUT, B_TIMED_OUT},
    {EINTR, B_INTERRUPTED},
    {EAGAIN, B_WOULD_BLOCK},
    {ECANCELED, B_CANCELED},
    {EBUSY, B_BUSY},
    {EPERM, B_NOT_ALLOWED},
    {EFAULT, B_BAD_ADDRESS},
    {ENOEXEC, B_NOT_AN_EXECUTABLE},
    {EBADF, B_FILE_ERROR},
    {EEXIST, B_FILE_EXISTS},
    {ENOENT, B_ENTRY_NOT_FOUND},
    {ENAMETOOLONG, B_NAME_TOO_LONG},
    {ENOTDIR, B_NOT_A_DIRECTORY},
    {ENOTEMPTY, B_DIRECTORY_NOT_EMPTY},
    {ENOSPC, B_DEVICE_FULL},
    {EROFS, B_READ_ONLY_DEVICE},
    {EISDIR, B_IS_A_DIRECTORY},
    {EMFILE, B_NO_MORE_FDS},
    {EXDEV, B_CROSS_DEVICE_LINK},
    {ELOOP, B_LINK_LIMIT},
    {EPIPE, B_BUSTED_PIPE},
    // The same number as EOPNOTSUPP on this host: a file system that has no attributes answers it.
    {ENOTSUP, B_UNSUPPORTED},

    {E2BIG, B_POSIX_E2BIG},
    {ECHILD, B_POSIX_ECHILD},
    {EDEADLK, B_POSIX_EDEADLK},
    {EFBIG, B_POSIX_EFBIG},
    {EMLINK, B_POSIX_EMLINK},
    {ENFILE, B_POSIX_ENFILE},
    {ENODEV, B_POSIX_ENODEV},
    {ENOLCK, B_POSIX_ENOLCK},
    {ENOSYS, B_POSIX_ENOSYS},
    {ENOTTY, B_POSIX_ENOTTY},
    {ENXIO, B_POSIX_ENXIO},
    {ESPIPE, B_POSIX_ESPIPE},
    {ESRCH, B_POSIX_ESRCH},
    {EDOM, B_POSIX_EDOM},
    {ERANGE, B_POSIX_ERANGE},
    {EPROTOTYPE, B_POSIX_EPROTOTYPE},
    {EPROTONOSUPPORT, B_POSIX_EPROTONOSUPPORT},
    {EAFNOSUPPORT, B_POSIX_EAFNOSUPPORT},
    {EADDRINUSE, B_POSIX_EADDRINUSE},
    {EADDRNOTAVAIL, B_POSIX_EADDRNOTAVAIL},
    {ENETDOWN, B_POSIX_ENETDOWN},
    {ENETUNREACH, B_POSIX_ENETUNREACH},
    {ENETRESET, B_POSIX_ENETRESET},
    {ECONNABORTED, B_POSIX_ECONNABORTED},
    {ECONNRESET, B_POSIX_ECONNRESET},
    {EISCONN, B_POSIX_EISCONN},
    {ENOTCONN, B_POSIX_ENOTCONN},
    {ECONNREFUSED, B_POSIX_ECONNREFUSED},
    {EHOSTUNREACH, B_POSIX_EHOSTUNREACH},
    {ENOPROTOOPT, B_POSIX_ENOPROTOOPT},
    {ENOBUFS, B_POSIX_ENOBUFS},
    {EINPROGRESS, B_POSIX_EINPROGRESS},
    {EALREADY, B_POSIX_EALREADY},
    {EILSEQ, B_POSIX_EILSEQ},
    {ENOMSG, B_POSIX_ENOMSG},
    {ESTALE, B_POSIX_ESTALE},
    {EOVERFLOW, B_POSIX_EOVERFLOW},
    {EMSGSIZE, B_POSIX_EMSGSIZE},
    {ENOTSOCK, B_POSIX_ENOTSOCK},
    {EBADMSG, B_POSIX_EBADMSG},
    {EDESTADDRREQ, B_POSIX_EDESTADDRREQ},
    {EDQUOT, B_POSIX_EDQUOT},
    {ENODATA, B_POSIX_ENODATA},
    {EPROTO, B_POSIX_EPROTO},
    {ETXTBSY, B_POSIX_ETXTBSY},
};

// For the family of a code that has no text of its own.
constexpr Text kFamilies[] = {
    {B_GENERAL_ERROR_BASE, "General"},
    {B_OS_ERROR_BASE, "Kernel kit"},
    {B_APP_ERROR_BASE, "Application kit"},
    {B_INTERFACE_ERROR_BASE, "Interface kit"},
    {B_MEDIA_ERROR_BASE, "Media"},
    {B_TRANSLATION_ERROR_BASE, "Translation kit"},
    {B_MIDI_ERROR_BASE, "Midi"},
    {B_STORAGE_ERROR_BASE, "Storage kit"},
    {B_POSIX_ERROR_BASE, "System"},
    {B_MAIL_ERROR_BASE, "Mail"},
    {B_PRINT_ERROR_BASE, "Print"},
    {B_DEVICE_ERROR_BASE, "Device"},
    {B_GENERAL_ERROR_BASE + 0xB000, nullptr},
};

const char* describe_unknown(status_t code) {
    thread_local char text[64];
    const char* family = nullptr;
    for (const Text& candidate : kFamilies) {
        if (candidate.code <= code)
            family = candidate.text;
    }
    if (family != nullptr)
        std::snprintf(text, sizeof(text), "%s error 0x%08x", family, static_cast<unsigned>(code));
    else
        std::snprintf(text, sizeof(text), "Error %d", code);
    return text;
}

} // namespace

const char* status_text(status_t code) {
    for (const Text& candidate : kTexts) {
        if (candidate.code == code)
            return candidate.text;
    }
    if (code > 0)
        return (strerror)(code);
    // The parentheses above and below keep the macro away: this is the C library's function.
    for (const Counterpart& counterpart : kCounterparts) {
        if (counterpart.code == code)
            return (strerror)(counterpart.errorNumber);
    }
    if (code == B_POSIX_EOPNOTSUPP)
        return (strerror)(EOPNOTSUPP);
    return describe_unknown(code);
}

status_t status_from_errno(int errorNumber) {
    if (errorNumber <= 0)
        return errorNumber;
    for (const Counterpart& counterpart : kCounterparts) {
        if (counterpart.errorNumber == errorNumber)
            return counterpart.code;
    }
    return B_ERROR;
}
