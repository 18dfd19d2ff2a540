#pragma once

#include "host/api/entry.h"

namespace host {

/// The plain file that the calling thread has met last while it read a directory. A program that walks opens
/// what it has just been shown, and need not ask once more what that is. Lasts a twentieth of a second.
///
/// A hint: something else may have taken the file's place since.
void set_seen_file(const EntryRef& ref);
bool was_seen_as_file(const EntryRef& ref);

} // namespace host
