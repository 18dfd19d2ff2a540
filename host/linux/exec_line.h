#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace host {

/// The value of a .desktop file's Exec key, taken apart by its rules of quoting: no shell reads it. Field
/// codes stay as they are. Nothing when a quotation is left open or there is no word at all.
std::optional<std::vector<std::string>> split_exec_line(std::string_view line);

} // namespace host
