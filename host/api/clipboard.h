// The desktop's clipboards.
//
// Thread rule: any thread but the main one; calls may wait for the main thread, and reading for the program
// that owns the contents, one second at most. Without a display the contents stay in this process.
#pragma once

#include "host/api/display.h"

namespace host {

enum class ClipboardName : std::uint8_t { clipboard, selection };

// Only the formats named are read.
DataFormats read_clipboard(ClipboardName name, const std::vector<std::string>& types);
void write_clipboard(ClipboardName name, DataFormats contents);
// Counts up with every change by any program that has come to our notice. Never waits.
std::uint32_t clipboard_changes(ClipboardName name);
// Called on the main thread after each change; must return at once.
void set_clipboard_listener(std::function<void(ClipboardName)> listener);

} // namespace host
