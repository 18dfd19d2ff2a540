// One layer of the SoundPlay player that is open.
#pragma once

#include <OS.h>

class BMessage;
class BMessenger;
// Whatever the caller plays; only kept for it.
class SoundplayBrindleTrack;

// Made by SoundplayScripter::NewLayer(), and gone after DeleteLayer(). The port and the messenger stay until
// the program ends, also when the layer has gone.
struct sptrackinfo {
    // Of the layer's own; this program reads nothing from it.
    port_id port = -1;
    // Whom the layer's commands go to. Never null; not valid when the player has given none.
    BMessenger* messenger = nullptr;
    SoundplayBrindleTrack* track = nullptr;

    // Says on standard output that an answer has come; nothing is read from it.
    void ParseReply(BMessage* reply);
};
