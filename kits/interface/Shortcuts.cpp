#include "Shortcuts.h"

#include <InterfaceDefs.h>

#include <algorithm>

namespace {

auto HasKey(uint32 key, uint32 modifiers) {
    return [key = Shortcuts::PlainKey(key),
            modifiers = Shortcuts::PlainModifiers(modifiers)](const Shortcuts::Shortcut& shortcut) {
        return shortcut.key == key && shortcut.modifiers == modifiers;
    };
}

} // namespace

uint32 Shortcuts::PlainKey(uint32 key) {
    return key >= 'a' && key <= 'z' ? key - 'a' + 'A' : key;
}

uint32 Shortcuts::PlainModifiers(uint32 modifiers) {
    return (modifiers & (B_SHIFT_KEY | B_OPTION_KEY)) | B_COMMAND_KEY;
}

void Shortcuts::Add(uint32 key, uint32 modifiers, std::unique_ptr<BMessage> message, Target target,
                    BHandler* handler) {
    Remove(key, modifiers);
    mShortcuts.push_back({PlainKey(key), PlainModifiers(modifiers), std::move(message), target, handler});
}

void Shortcuts::Remove(uint32 key, uint32 modifiers) {
    const auto end = std::remove_if(mShortcuts.begin(), mShortcuts.end(), HasKey(key, modifiers));
    mShortcuts.erase(end, mShortcuts.end());
}

const Shortcuts::Shortcut* Shortcuts::Find(uint32 key, uint32 modifiers) const {
    const auto found = std::find_if(mShortcuts.begin(), mShortcuts.end(), HasKey(key, modifiers));
    return found == mShortcuts.end() ? nullptr : &*found;
}
