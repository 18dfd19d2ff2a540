#include "ViewHost.h"

ViewHost::~ViewHost() = default;

bool ViewHost::GetMouse(BView* /*view*/, BPoint* surfacePoint, uint32* buttons, bool /*checkMessageQueue*/) {
    surfacePoint->Set(-1, -1);
    *buttons = 0;
    return false;
}

status_t ViewHost::SetMouseEventMask(BView* /*view*/, uint32 /*mask*/, uint32 /*options*/) {
    return B_ERROR;
}
