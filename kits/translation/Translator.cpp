#include <Translator.h>

BTranslator::BTranslator() = default;

BTranslator::~BTranslator() = default;

BTranslator* BTranslator::Acquire() {
    mUsers.fetch_add(1);
    return this;
}

BTranslator* BTranslator::Release() {
    if (mUsers.fetch_sub(1) > 1) {
        return this;
    }
    delete this;
    return nullptr;
}

status_t BTranslator::MakeConfigurationView(BMessage* /*settings*/, BView** /*view*/, BRect* /*extent*/) {
    return B_NOT_ALLOWED;
}

status_t BTranslator::GetConfigurationMessage(BMessage* /*settings*/) {
    return B_NOT_ALLOWED;
}
