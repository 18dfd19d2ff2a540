#pragma once

#include <string>
#include <vector>

namespace host {

/// The names to look for when a program for a type is wanted, the nearest first: the type, the other names
/// that the shared MIME database has for it, then those of the types that it is a kind of ("text/x-csrc" is
/// "text/plain", which is "application/octet-stream").
std::vector<std::string> names_of_type(const std::string& type);

} // namespace host
