#pragma once

#include "host/api/result.h"
#include "host/linux/descriptor.h"

namespace host {

/// Opens a file, directory, FIFO ... for looking at it: never blocks, never follows a symbolic link at the
/// end, never becomes a controlling terminal, and leaves the access time alone where the system allows.
/// Symbolic links, sockets and devices come back as bare references (O_PATH), which have no attributes.
/// `leaf` may be any path relative to `directory` (a descriptor, or AT_FDCWD).
Result<Descriptor> open_for_reading(int directory, const char* leaf);

/// Opens a directory for reading its entries and as a base for openat. ENOTDIR, also for a symbolic link.
Result<Descriptor> open_directory(int directory, const char* leaf);

/// A second descriptor of an open directory with a read position of its own.
Result<Descriptor> reopen_directory(int directory);

} // namespace host
