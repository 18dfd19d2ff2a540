#include "NoNewThreads.h"

#include "gui/ColumnListView/MouseWatcher.h"

#include "kits/interface/ViewStage.h"

#include <OS.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace {

// Writes down what the watchers send.
class WatchedView : public BView {
  public:
    explicit WatchedView(std::vector<BMessage>& messages)
        : BView(BRect(10, 0, 99, 99), "watched", B_FOLLOW_NONE, B_WILL_DRAW), mMessages(messages) {}
    void MessageReceived(BMessage* message) override {
        if ((message->what & 0xFFFFFF00) == ('Mw-\0' & 0xFFFFFF00)) {
            mMessages.push_back(*message);
            return;
        }
        BView::MessageReceived(message);
    }

  private:
    std::vector<BMessage>& mMessages;
};

// The pointer is the test's; looks are counted, so that a test knows what has been seen.
class WatcherStage : public ViewStage {
  public:
    WatcherStage() : ViewStage(100, 100), view(new WatchedView(mMessages)) { Add(view); }
    ~WatcherStage() override { Close(); }

    // In the view's coordinates.
    void SetMouse(float x, float y, uint32 buttons) {
        Locked([&] {
            mPointer = BPoint(x + 10, y);
            mButtons = buttons;
            mLooks = 0;
        });
    }
    void WaitForLooks(int count) {
        for (int i = 0; i < 2000 && Looks() < count; ++i) {
            snooze(5000);
        }
        EXPECT_GE(Looks(), count) << "nobody looks at the mouse";
    }
    // "M 12,5 1 0": the code's last letter, the place, buttons and modifiers.
    std::vector<std::string> Take() {
        // Answered after all that was sent before.
        BMessage ask('ask?');
        Send(view, ask);
        std::vector<BMessage> taken;
        Locked([&] { taken.swap(mMessages); });
        std::vector<std::string> lines;
        for (const BMessage& message : taken) {
            BPoint where;
            EXPECT_EQ(message.CountNames(B_ANY_TYPE), 3);
            EXPECT_EQ(message.FindPoint("where", &where), B_OK);
            lines.push_back(std::string(1, static_cast<char>(message.what & 0xFF)) + " " +
                            std::to_string(static_cast<int>(where.x)) + "," +
                            std::to_string(static_cast<int>(where.y)) + " " +
                            std::to_string(message.GetInt32("buttons", -1)) + " " +
                            std::to_string(message.GetInt32("modifiers", -1)));
        }
        return lines;
    }
    thread_id Start(thread_id (*watcher)(BView*)) {
        thread_id thread = -1;
        Locked([&] { thread = watcher(view); });
        EXPECT_GT(thread, 0);
        return thread;
    }

    WatchedView* const view;

  private:
    int Looks() {
        int looks = 0;
        Locked([&] { looks = mLooks; });
        return looks;
    }
    bool GetMouse(BView* /*view*/, BPoint* surfacePoint, uint32* buttons, bool checkQueue) override {
        EXPECT_FALSE(checkQueue);
        *surfacePoint = mPointer;
        *buttons = mButtons;
        ++mLooks;
        return true;
    }

    std::vector<BMessage> mMessages;
    BPoint mPointer;
    uint32 mButtons = 0;
    int mLooks = 0;
};

typedef std::vector<std::string> Lines;

void WaitFor(thread_id thread) {
    status_t status = B_ERROR;
    (void)wait_for_thread(thread, &status);
}

TEST(MouseWatcher, ItsMessagesHaveTheirCodes) {
    EXPECT_EQ(MW_MOUSE_DOWN, 0x4D772D44U);
    EXPECT_EQ(MW_MOUSE_MOVED, 0x4D772D4DU);
    EXPECT_EQ(MW_MOUSE_UP, 0x4D772D55U);
    EXPECT_EQ(MW_CLICK, 0x4D772D43U);
    EXPECT_EQ(MW_DRAG, 0x4D772D64U);
    EXPECT_EQ(MW_POPUP, 0x4D772D50U);
}

TEST(MouseWatcher, APressThatIsReleasedAtOnceYieldsOneMessage) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 0);

    WaitFor(stage.Start(StartMouseWatcher));

    EXPECT_EQ(stage.Take(), (Lines{"U 12,5 0 0"}));
}

TEST(MouseWatcher, APointerAwayFromTheStartIsReportedAtEachLookUntilItIsBack) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 1);
    const thread_id thread = stage.Start(StartMouseWatcher);
    stage.WaitForLooks(3);
    EXPECT_EQ(stage.Take(), Lines()) << "as long as it rests where it started";

    stage.SetMouse(13, 5, 1);
    stage.WaitForLooks(3);
    // The look that is counted may not have been reported yet.
    EXPECT_GE(stage.Take().size(), 2U);

    stage.SetMouse(12, 5, 1);
    stage.WaitForLooks(2);
    stage.Take();
    stage.WaitForLooks(4);
    EXPECT_EQ(stage.Take(), Lines()) << "back at the very place";

    stage.SetMouse(40, 50, 0);
    WaitFor(thread);
    EXPECT_EQ(stage.Take(), (Lines{"U 40,50 0 0"}));
}

TEST(MouseWatcher, OtherButtonsThanAtTheStartAreToldApart) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 1);
    const thread_id thread = stage.Start(StartMouseWatcher);
    stage.WaitForLooks(1);

    stage.SetMouse(20, 5, 3);
    stage.WaitForLooks(3);
    const Lines lines = stage.Take();
    ASSERT_FALSE(lines.empty());
    EXPECT_EQ(lines.front(), "D 20,5 3 0");
    EXPECT_EQ(lines.back(), "D 20,5 3 0");

    stage.SetMouse(20, 5, 0);
    WaitFor(thread);
    EXPECT_EQ(stage.Take().back(), "U 20,5 0 0");
}

TEST(MouseWatcher, ItsThreadHasANameAndAPriority) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 1);
    const struct {
        thread_id (*start)(BView*);
        const char* name;
    } kCases[] = {{StartMouseWatcher, "MouseWatcher"},
                  {StartMouseDragOrPopupWatcher, "MouseDragOrPopupWatcher"}};
    for (const auto& each : kCases) {
        const thread_id thread = stage.Start(each.start);
        thread_info info;
        ASSERT_EQ(get_thread_info(thread, &info), B_OK);
        EXPECT_STREQ(info.name, each.name);
        EXPECT_EQ(info.priority, 10);
        stage.SetMouse(12, 5, 0);
        WaitFor(thread);
        stage.SetMouse(12, 5, 1);
    }
}

TEST(MouseWatcher, ItEndsWhenItsViewOrLooperGoesAway) {
    for (const auto& start : {StartMouseWatcher, StartMouseDragOrPopupWatcher}) {
        std::vector<thread_id> threads;
        {
            WatcherStage stage;
            stage.SetMouse(12, 5, 1);
            threads.push_back(stage.Start(start));
            stage.WaitForLooks(1);
            threads.push_back(stage.Start(start));
            stage.SetMouse(13, 5, 1);
        }
        for (const thread_id thread : threads) {
            WaitFor(thread);
        }
    }
    std::vector<BMessage> messages;
    WatchedView loose(messages);
    WaitFor(StartMouseWatcher(&loose));
    WaitFor(StartMouseDragOrPopupWatcher(&loose));
    EXPECT_TRUE(messages.empty()) << "a view without a looper hears nothing";
}

TEST(MouseWatcher, OneThatCannotBeStartedIsRefusedAndStartsLater) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 0);
    for (const auto& start : {StartMouseWatcher, StartMouseDragOrPopupWatcher}) {
        {
            const NoNewThreads none;
            stage.Locked([&] { EXPECT_EQ(start(stage.view), static_cast<thread_id>(B_NO_MORE_THREADS)); });
        }
        EXPECT_EQ(stage.Take(), Lines());
        WaitFor(stage.Start(start));
        EXPECT_EQ(stage.Take().size(), 1U);
    }
}

TEST(MouseDragOrPopupWatcher, APressThatIsReleasedIsAClick) {
    WatcherStage stage;
    stage.SetMouse(12, 5, 0);
    WaitFor(stage.Start(StartMouseDragOrPopupWatcher));
    EXPECT_EQ(stage.Take(), (Lines{"C 12,5 0 0"}));

    stage.SetMouse(12, 5, 1);
    const thread_id thread = stage.Start(StartMouseDragOrPopupWatcher);
    stage.WaitForLooks(1);
    stage.SetMouse(13, 6, 3);
    WaitFor(thread);
    EXPECT_EQ(stage.Take(), (Lines{"C 13,6 3 0"})) << "and so is one with another button";
}

TEST(MouseDragOrPopupWatcher, OnePixelIsNoDragTwoAre) {
    const bigtime_t kLong = 60000000;
    bigtime_t before = 0;
    ASSERT_EQ(get_click_speed(&before), B_OK);
    (void)set_click_speed(kLong);
    const struct {
        float x;
        float y;
        const char* expected;
    } kCases[] = {{11, 5, "C 11,5 0 0"}, {13, 6, "C 13,6 0 0"}, {14, 5, "d 14,5 1 0"},
                  {10, 5, "d 10,5 1 0"}, {12, 3, "d 12,3 1 0"}, {12, 7, "d 12,7 1 0"}};
    for (const auto& each : kCases) {
        WatcherStage stage;
        stage.SetMouse(12, 5, 1);
        const thread_id thread = stage.Start(StartMouseDragOrPopupWatcher);
        stage.WaitForLooks(1);
        stage.SetMouse(each.x, each.y, 1);
        if (each.expected[0] == 'C') {
            stage.WaitForLooks(2);
            EXPECT_EQ(stage.Take(), Lines());
            stage.SetMouse(each.x, each.y, 0);
        }
        WaitFor(thread);
        EXPECT_EQ(stage.Take(), (Lines{each.expected}));
    }
    (void)set_click_speed(before);
}

TEST(MouseDragOrPopupWatcher, APressThatIsHeldStillAsksForAPopup) {
    bigtime_t before = 0;
    ASSERT_EQ(get_click_speed(&before), B_OK);
    (void)set_click_speed(60000);
    WatcherStage stage;
    stage.SetMouse(12, 5, 1);
    const bigtime_t started = system_time();

    WaitFor(stage.Start(StartMouseDragOrPopupWatcher));

    EXPECT_GE(system_time() - started, 120000) << "twice the time of a double click";
    EXPECT_EQ(stage.Take(), (Lines{"P 12,5 1 0"}));
    (void)set_click_speed(before);
}

} // namespace
