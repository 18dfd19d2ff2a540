#pragma once

#include "host/api/result.h"
#include <string>
#include <vector>

// The user's preferred programs, as the desktop keeps them. Any thread.

namespace host {

/// A program of the desktop, from its .desktop file.
struct DesktopProgram {
    std::string id;         ///< "org.example.Player.desktop"
    std::string file;       ///< absolute path of that file
    std::string name;       ///< for people
    std::string icon;       ///< as the file has it; may be empty
    std::string executable; ///< absolute path
    /// After the program's name, with field codes such as "%U" still in them.
    std::vector<std::string> arguments;
    bool in_terminal = false;
};

/// The preferred program for a MIME type: the user's choice (mimeapps.list), else the first installed one
/// that says it opens the type, or one that the type is a kind of. Names that the MIME database calls
/// otherwise count as the same. ENOENT when there is none that is installed and can be run.
Result<DesktopProgram> preferred_program(const std::string& mime_type);

/// The arguments for opening these files (absolute paths, any bytes): one list for each time that the program
/// has to be started, since some open one file at a time.
std::vector<std::vector<std::string>> arguments_for(const DesktopProgram& program,
                                                    const std::vector<std::string>& paths);

/// A program by its name along $PATH, as an absolute path; empty when it is not there.
std::string program_in_path(const std::string& name);

/// "file://" and the path, every byte outside the plain letters as %XX.
std::string file_uri(const std::string& path);

} // namespace host
