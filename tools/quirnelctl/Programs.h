#pragma once

#include <SupportDefs.h>
#include <string>

/// Where what a program says that is started here goes, also later on: to this program's standard error, or
/// nowhere.
enum class LaunchedErrors { shown, dropped };

/// Starts the program of that signature unless it runs; `launched` tells whether it had to be. Empty, or what
/// went wrong.
std::string StartProgram(const std::string& signature, LaunchedErrors errors, bool& launched);
/// What a status of starting it or sending to it means to people.
std::string ProblemOf(const std::string& signature, status_t status);
