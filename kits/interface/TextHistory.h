// TextHistory: the changes of an edited text that can be undone and done again.
#pragma once

#include <SupportDefs.h>

#include <optional>
#include <string>
#include <vector>

// At `offset`, `removed` was replaced by `inserted`.
struct TextChange {
    enum class Kind { Typing, Erasing, Cut, Paste, Clear, Drop };

    Kind kind = Kind::Typing;
    int32 offset = 0;
    std::string removed;
    std::string inserted;
};

// Typing, and erasing character by character, is one change as long as it goes on at the same place. The
// latest thousand changes are kept. Changes nothing itself: whoever takes a change does or undoes it.
class TextHistory {
  public:
    // What had been undone cannot be done again after this.
    void Add(TextChange change);
    // What is typed next is a change of its own.
    void EndRun() { mRunEnded = true; }
    void Clear();

    // Null when there is none. Valid until the next call that is not const.
    const TextChange* NextToUndo() const;
    const TextChange* NextToRedo() const;
    std::optional<TextChange> Undo();
    std::optional<TextChange> Redo();

  private:
    bool JoinsLast(const TextChange& change);

    std::vector<TextChange> mChanges;
    size_t mDone = 0; // changes before this one are done, those from it on are undone
    bool mRunEnded = false;
};
