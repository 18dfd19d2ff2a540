// What a companion program says to its user.
#pragma once

#include <string>

// Writes "PROGRAM: TEXT" as one line on standard error. Any thread.
void SayError(const char* program, const std::string& text);

// A name without control characters, which are shown as \xHH: names are bytes, a line must stay one, and a
// terminal unharmed.
std::string PrintableName(const std::string& name);
