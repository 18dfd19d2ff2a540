// A command to the SoundPlay player or to one of its layers (docs/soundplay.md).
#pragma once

#include <Message.h>

// Number 2 means nothing.
enum : int32 {
    // To the player, which answers with the new layer's "messenger". "name" (string) is the file's leaf name,
    // "port" (int32) a port of the sender.
    SCRIPTNEWLAYER = 1,
    // To a layer, like all that follow: it ends.
    SCRIPTDELETELAYER = 3,
    // Exactly one of "newref" (entry_ref, the file to play), "pitch", "abspos" (seconds), "volume" (doubles;
    // a pitch and a volume of 1.0 are the track's own).
    SCRIPTSETVALUES = 4,
    SCRIPTGETVALUES = 5,
};

inline constexpr uint32 kScriptMessage = 'abra';

// Carries its number in "command" (int32) from the beginning.
class ScriptMessage : public BMessage {
  public:
    explicit ScriptMessage(int32 command);
};
