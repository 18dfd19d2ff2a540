// DragSession: what is dragged, on its way between views and the display.
#pragma once

#include <Message.h>
#include <Messenger.h>

#include "host/api/display.h"

#include <memory>
#include <optional>

// What a view of this program drags. Never changes once it is made.
struct OwnDrag {
    BMessage message;
    BMessenger replyTo;
    // The pointer's place in the dragged picture.
    BPoint offset;
};

// The drag that this program has under way, of which there is one at most. Any thread.
class DragSession {
  public:
    static void Begin(std::shared_ptr<const OwnDrag> drag);
    static std::shared_ptr<const OwnDrag> Current();
    static void End();
};

// The forms in which a message is offered: itself, and to programs that know nothing of messages its "refs"
// as a list of files and its field "text/plain" as text. Looks the files up.
host::DataFormats FormatsOf(const BMessage& message);
// The message that the data of another program stand for: the one it has flattened; else B_SIMPLE_DATA with
// the entries of the files in "refs", those that are not there left out; else B_MIME_DATA with "text/plain".
// Null when there is nothing of all that. Looks the files up.
std::unique_ptr<BMessage> MessageOf(const host::DataFormats& data);

// The path of a "file:" address on this machine, with its %-codes resolved. Nothing for other addresses.
std::optional<std::string> PathOfUri(std::string_view uri);
std::string UriOfPath(std::string_view path);
