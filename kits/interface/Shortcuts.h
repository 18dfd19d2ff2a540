// Shortcuts: the keys that mean a message in a window.
#pragma once

#include <Message.h>

#include <memory>
#include <vector>

class BHandler;

// Letters count without regard to case. Of the modifiers B_COMMAND_KEY, which is always meant, B_SHIFT_KEY
// and B_OPTION_KEY count; B_CONTROL_KEY is the same key as B_COMMAND_KEY. One thread at a time.
class Shortcuts {
  public:
    enum class Target { window, focus, handler };
    struct Shortcut {
        uint32 key = 0;
        uint32 modifiers = 0;
        // Null: the key means nothing.
        std::unique_ptr<BMessage> message;
        Target target = Target::window;
        // Compared with the looper's handlers before it is used; it may be gone.
        BHandler* handler = nullptr;
    };

    // In the place of the one that had that key.
    void Add(uint32 key, uint32 modifiers, std::unique_ptr<BMessage> message, Target target,
             BHandler* handler);
    void Remove(uint32 key, uint32 modifiers);
    // Null when there is none.
    const Shortcut* Find(uint32 key, uint32 modifiers) const;

    static uint32 PlainKey(uint32 key);
    static uint32 PlainModifiers(uint32 modifiers);

  private:
    std::vector<Shortcut> mShortcuts;
};
