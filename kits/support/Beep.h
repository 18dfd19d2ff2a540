// The system's signal sound.
#pragma once

#include <SupportDefs.h>

// Rings the terminal's bell on standard error, when that is a terminal. B_OK, or B_ERROR when there is none
// to ring.
status_t beep();
