#include "host/qt/input_translation.h"

#include <QInputMethodEvent>

#include <gtest/gtest.h>

namespace host {

TEST(InputTranslation, WhatAnInputMethodWorksOnHasItsCaretInBytes) {
    const struct {
        const char* composed;
        int cursor; // in Qt's units; -1 for none
        int caret;
    } cases[] = {
        {"", -1, 0},
        {"abc", -1, 3},
        {"abc", 1, 1},
        {"\u3042\u3044", 1, 3},
        {"\u3042\u3044", 2, 6},
        {"\u3042\u3044", -1, 6},
        {"\U0001F600x", 2, 4},
        {"ab", 99, 2},
    };
    for (const auto& each : cases) {
        QList<QInputMethodEvent::Attribute> attributes;
        if (each.cursor >= 0) {
            attributes.append(QInputMethodEvent::Attribute(QInputMethodEvent::Cursor, each.cursor, 1));
        }
        const QInputMethodEvent event(QString::fromUtf8(each.composed), attributes);
        const InputMethodText text = to_input_method_text(event);
        EXPECT_EQ(text.composed, each.composed);
        EXPECT_EQ(text.caret, each.caret) << each.composed;
        EXPECT_EQ(text.committed, "");
    }
}

TEST(InputTranslation, FinishedTextComesWithWhatIsGoingOn) {
    QInputMethodEvent event("rest", {});
    event.setCommitString(QString::fromUtf8("\u65e5\u672c"));
    const InputMethodText text = to_input_method_text(event);
    EXPECT_EQ(text.committed, "\u65e5\u672c");
    EXPECT_EQ(text.composed, "rest");
}

} // namespace host
