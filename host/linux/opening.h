#pragma once

#include "host/api/result.h"
#include "host/linux/descriptor.h"
#include <sys/stat.h>

namespace host {

/// Opens a file, directory, FIFO ... for looking at it: never blocks, never follows a symbolic link at the
/// end, never becomes a controlling terminal, and leaves the access time alone where the system allows.
/// Symbolic links, sockets and devices come back as bare references (O_PATH), which have no attributes.
/// `leaf` may be any path relative to `directory` (a descriptor, or AT_FDCWD).
///
/// `status`, where given, receives what it was found to be just before; all zero when there is nothing.
Result<Descriptor> open_for_reading(int directory, const char* leaf, struct stat* status = nullptr);

/// The same for what is known to be a plain file: not looked at before it is opened.
Result<Descriptor> open_file_for_reading(int directory, const char* leaf);

enum class SymbolicLink { refuse, follow };

/// Opens a directory for reading its entries and as a base for openat; one that may be passed through but not
/// read serves as a base only. ENOTDIR, also for a symbolic link at the end that is not to be followed.
Result<Descriptor> open_directory(int directory, const char* leaf,
                                  SymbolicLink symbolic_link = SymbolicLink::refuse);

/// A second descriptor of an open directory with a read position of its own. EACCES when it may not be read.
Result<Descriptor> reopen_directory(int directory);

} // namespace host
