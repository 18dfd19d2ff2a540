#pragma once

#include "host/api/result.h"
#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

// Starting programs. Any thread.

namespace host {

/// The program that this process runs, as an absolute path; empty when the system does not tell.
std::string executable_path();
/// This process's arguments, the program's name first.
std::vector<std::string> command_line_arguments();
/// The directory that relative paths start from; empty when it is gone.
std::string current_directory();

/// A variable of this process's environment; empty when it is not set. take... also removes it, so that
/// programs that are started later do not get it.
std::string environment_variable(const char* name);
std::string take_environment_variable(const char* name);

struct ProcessStart {
    std::string executable;                                     ///< a path; no search, no shell
    std::vector<std::string> arguments;                         ///< after the program's name
    std::vector<std::pair<std::string, std::string>> variables; ///< besides those of this process
};

/// Starts a program in a session of its own, with default signals and no descriptor but the standard ones:
/// input and output are /dev/null; errors go where this process's go, or to /dev/null when that is a pipe,
/// whose reader would otherwise wait for the new program's end too. The process is waited for in the
/// background, so none stays behind as a zombie; `ended`, which may be empty, is then called once in the
/// transport's own thread, with its exit status or 128 and the signal that ended it. The answer is its
/// number; ENOENT, EACCES, ENOEXEC and so on when the program cannot be started.
Result<std::int32_t> start_process(const ProcessStart& start, std::function<void(int status)> ended);

} // namespace host
