// Which program opens what. Internal to the app kit.
#pragma once

#include "host/api/desktop_programs.h"
#include <EntryRef.h>
#include <Errors.h>
#include <SupportDefs.h>

#include <optional>
#include <string>

// A program that was found: an application of the kits, which has a signature, or one of the desktop.
struct FoundApp {
    std::string executable;
    std::string signature;
    uint32 flags = 0;
    // Of a program of the desktop; without one it simply takes arguments.
    std::optional<host::DesktopProgram> desktop;

    bool IsApplication() const { return !signature.empty(); }
};

// Any thread. Errors as BRoster::FindApp().
status_t find_app_by_type(const std::string& mimeType, FoundApp* app);
// The program that opens the file.
status_t find_app_for_file(const entry_ref& file, FoundApp* app);
// True when the file is itself a program, which `app` then is.
bool find_app_that_is(const std::string& path, FoundApp* app);
