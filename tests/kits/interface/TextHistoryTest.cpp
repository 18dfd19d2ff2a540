#include "TextHistory.h"

#include <gtest/gtest.h>

namespace {

typedef TextChange::Kind Kind;

void Do(std::string& text, const TextChange& change) {
    text.replace(static_cast<size_t>(change.offset), change.removed.size(), change.inserted);
}

void Undo(std::string& text, const TextChange& change) {
    text.replace(static_cast<size_t>(change.offset), change.inserted.size(), change.removed);
}

class History : public ::testing::Test {
  protected:
    void Add(const TextChange& change) {
        Do(mText, change);
        mHistory.Add(change);
    }
    std::string UndoOne() {
        const std::optional<TextChange> change = mHistory.Undo();
        if (change) {
            Undo(mText, *change);
        }
        return mText;
    }
    std::string RedoOne() {
        const std::optional<TextChange> change = mHistory.Redo();
        if (change) {
            Do(mText, *change);
        }
        return mText;
    }

    TextHistory mHistory;
    std::string mText;
};

TEST_F(History, TypingIsUndoneAsARun) {
    Add({Kind::Typing, 0, "", "a"});
    Add({Kind::Typing, 1, "", "b"});
    mHistory.EndRun();
    Add({Kind::Typing, 2, "", "c"});
    EXPECT_EQ(UndoOne(), "ab");
    EXPECT_EQ(UndoOne(), "");
    EXPECT_EQ(UndoOne(), "") << "nothing is left";
    EXPECT_EQ(RedoOne(), "ab");
    EXPECT_EQ(RedoOne(), "abc");
    EXPECT_EQ(RedoOne(), "abc");
}

TEST_F(History, ErasingInBothDirectionsIsARun) {
    mText = "abcdef";
    Add({Kind::Erasing, 3, "d", ""});
    Add({Kind::Erasing, 2, "c", ""});
    Add({Kind::Erasing, 2, "e", ""});
    EXPECT_EQ(mText, "abf");
    EXPECT_EQ(UndoOne(), "abcdef");
    EXPECT_EQ(RedoOne(), "abf");
}

TEST_F(History, ChangesOfOtherKindsStandAlone) {
    Add({Kind::Typing, 0, "", "ab"});
    Add({Kind::Paste, 2, "", "cd"});
    Add({Kind::Paste, 4, "", "ef"});
    Add({Kind::Typing, 1, "bcd", "x"});
    EXPECT_EQ(mText, "axef");
    EXPECT_EQ(mHistory.NextToUndo()->kind, Kind::Typing);
    EXPECT_EQ(mHistory.NextToRedo(), nullptr);
    EXPECT_EQ(UndoOne(), "abcdef");
    EXPECT_EQ(mHistory.NextToRedo()->inserted, "x");
    EXPECT_EQ(UndoOne(), "abcd");
    Add({Kind::Typing, 4, "", "!"});
    EXPECT_EQ(RedoOne(), "abcd!") << "what was undone is gone";
    EXPECT_EQ(UndoOne(), "abcd");
    EXPECT_EQ(UndoOne(), "ab");
}

TEST_F(History, TheOldestOfThousandChangesIsForgotten) {
    for (int i = 0; i < 1001; ++i) {
        Add({Kind::Paste, i, "", "x"});
    }
    int undone = 0;
    while (mHistory.NextToUndo() != nullptr) {
        UndoOne();
        ++undone;
    }
    EXPECT_EQ(undone, 1000);
    EXPECT_EQ(mText, "x");
}

} // namespace
