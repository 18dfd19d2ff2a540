#include "TextHistory.h"

#include <utility>

namespace {

constexpr size_t kMostChanges = 1000;

} // namespace

void TextHistory::Add(TextChange change) {
    mChanges.erase(mChanges.begin() + static_cast<ptrdiff_t>(mDone), mChanges.end());
    if (!JoinsLast(change)) {
        mChanges.push_back(std::move(change));
        if (mChanges.size() > kMostChanges) {
            mChanges.erase(mChanges.begin());
        }
    }
    mDone = mChanges.size();
    mRunEnded = false;
}

bool TextHistory::JoinsLast(const TextChange& change) {
    if (mChanges.empty() || mRunEnded || mChanges.back().kind != change.kind) {
        return false;
    }
    TextChange& last = mChanges.back();
    const auto lastEnd = last.offset + static_cast<int32>(last.inserted.size());
    if (change.kind == TextChange::Kind::Typing && change.removed.empty() && change.offset == lastEnd) {
        last.inserted += change.inserted;
        return true;
    }
    if (change.kind != TextChange::Kind::Erasing) {
        return false;
    }
    if (change.offset + static_cast<int32>(change.removed.size()) == last.offset) {
        last.removed.insert(0, change.removed);
        last.offset = change.offset;
        return true;
    }
    if (change.offset == last.offset) {
        last.removed += change.removed;
        return true;
    }
    return false;
}

void TextHistory::Clear() {
    *this = TextHistory();
}

const TextChange* TextHistory::NextToUndo() const {
    return mDone > 0 ? &mChanges[mDone - 1] : nullptr;
}

const TextChange* TextHistory::NextToRedo() const {
    return mDone < mChanges.size() ? &mChanges[mDone] : nullptr;
}

std::optional<TextChange> TextHistory::Undo() {
    if (mDone == 0) {
        return std::nullopt;
    }
    mRunEnded = true;
    return mChanges[--mDone];
}

std::optional<TextChange> TextHistory::Redo() {
    if (mDone == mChanges.size()) {
        return std::nullopt;
    }
    mRunEnded = true;
    return mChanges[mDone++];
}
