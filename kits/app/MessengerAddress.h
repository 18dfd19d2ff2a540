// Where a messenger points, as plain numbers. Internal to the kits.
#pragma once

#include <OS.h>

// A target by token, see TokenTable.h. A plain value; token 0 is no target.
struct MessengerAddress {
    team_id team = -1;
    int32 token = 0;
    // The token is a looper's, and messages go to whichever handler it prefers at that time.
    bool preferred = false;

    bool operator==(const MessengerAddress& other) const = default;
};
