#pragma once

/// From now on Ctrl+C, a hang-up or a request to end is noted instead of ending the program; a second one
/// ends it.
void CatchInterruptions();
bool Interrupted();
