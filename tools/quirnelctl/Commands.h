#pragma once

#include "Output.h"
#include <string>
#include <vector>

/// What the command line asks for.
struct Request {
    std::string command;
    std::vector<std::string> arguments;
    bool fields = false;   ///< --fields: a table of the songs' fields instead of paths
    bool launch = false;   ///< --launch: start the program when it does not run
    std::string signature; ///< --to: whom a message goes to; empty for Quirnel
    bool verbose = false;  ///< --verbose: the classes' own diagnostics on standard error
};

/// Writes "quirnelctl: TEXT" on standard error; 1.
int Fail(const std::string& text);

/// Every command answers the program's exit status: 0, or 1 after one line on standard error.
int ListVolumes(const Request& request, Output& output);
int IndexVolumes(const Request& request, Output& output);
int StripVolumes(const Request& request, Output& output);
int ReindexVolumes(const Request& request, Output& output);
int FindSongs(const Request& request, Output& output);
int QueryFiles(const Request& request, Output& output);
int ShowAttributes(const Request& request, Output& output);
int SetCover(const Request& request, Output& output);
int SendCode(const Request& request, Output& output);
int ControlLayer(const Request& request, Output& output);
