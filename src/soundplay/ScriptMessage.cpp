#include "soundplay/ScriptMessage.h"

ScriptMessage::ScriptMessage(int32 command) : BMessage(kScriptMessage) {
    AddInt32("command", command);
}
