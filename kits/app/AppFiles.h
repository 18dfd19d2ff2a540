// Files as the roster needs them, which knows nothing of the storage kit: where refs lie, and what the MIME
// database and a file's own attributes say about opening it. Internal to the app kit.
#pragma once

#include <EntryRef.h>
#include <Errors.h>

#include <string>

// Any thread.

// The absolute path, links in it resolved; empty when there is no such file.
std::string path_of_ref(const entry_ref& ref);
// False when there is no such file, or its directory is gone.
bool ref_of_path(const std::string& path, entry_ref* ref);

// From a type's record (docs/mime.md); empty for none.
std::string preferred_app_of_type(const std::string& type);
std::string application_path_of_type(const std::string& type);

// From the attributes of a file (its own type and preferred application); empty for none.
std::string preferred_app_of_file(const entry_ref& ref);
std::string own_type_of_file(const entry_ref& ref);

// A regular file that the system runs by itself: a script, which its reader might only want to read, is a
// document.
bool is_program(const std::string& path);
