// BLooper's answers to scripting messages.
#include <Looper.h>

#include <Message.h>

#include <string_view>

void BLooper::MessageReceived(BMessage* message) {
    BMessage specifier;
    const char* property = nullptr;
    if (message->what == B_COUNT_PROPERTIES &&
        message->GetCurrentSpecifier(nullptr, &specifier, nullptr, &property) == B_OK &&
        std::string_view(property) == "Handler") {
        BMessage reply(B_REPLY);
        reply.AddInt32("result", CountHandlers());
        reply.AddInt32("error", B_OK);
        message->SendReply(&reply);
        return;
    }
    BHandler::MessageReceived(message);
}

BHandler* BLooper::ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                    const char* property) {
    if (std::string_view(property) != "Handler")
        return BHandler::ResolveSpecifier(message, index, specifier, form, property);
    if (message->what == B_COUNT_PROPERTIES)
        return this;
    BHandler* found = nullptr;
    if (form == B_INDEX_SPECIFIER) {
        found = HandlerAt(specifier->GetInt32("index", -1));
    } else if (form == B_NAME_SPECIFIER) {
        const std::string_view name = specifier->GetString(B_PROPERTY_NAME_ENTRY, "");
        for (int32 candidate = 0; candidate < CountHandlers() && found == nullptr; candidate++) {
            const char* handlerName = HandlerAt(candidate)->Name();
            if (handlerName != nullptr && name == handlerName)
                found = HandlerAt(candidate);
        }
    }
    if (found != nullptr) {
        message->PopSpecifier();
        return found;
    }
    BMessage reply(B_MESSAGE_NOT_UNDERSTOOD);
    reply.AddInt32("error", B_NAME_NOT_FOUND);
    message->SendReply(&reply);
    return nullptr;
}

status_t BLooper::GetSupportedSuites(BMessage* data) {
    const status_t status = data != nullptr ? data->AddString("suites", "suite/vnd.Be-looper") : B_BAD_VALUE;
    return status == B_OK ? BHandler::GetSupportedSuites(data) : status;
}
