// WindowTraits: title, look, feel and flags of a window, and what they mean to the display.
#pragma once

#include "WindowGeometry.h"

#include <Window.h>

#include "host/api/display.h"

#include <string>

// A plain value.
struct WindowTraits {
    std::string title;
    window_look look = B_TITLED_WINDOW_LOOK;
    window_feel feel = B_NORMAL_WINDOW_FEEL;
    uint32 flags = 0;

    bool IsModal() const;
    bool IsFloating() const;
    bool IsPopUp() const;
    window_type Type() const;
    // False, with nothing changed, for a number that is no type.
    bool SetType(window_type type);
    host::WindowOptions Options(const WindowGeometry& geometry) const;
};
