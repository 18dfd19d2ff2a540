// Handlers: their chain, filters, observers and archives.
#include "SeenMessages.h"

#include <MessageFilter.h>
#include <MessageQueue.h>
#include <Messenger.h>

#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace {

// Handles every message in the calling thread, so that a test sees the effect at once.
void Dispatch(BLooper* looper, uint32 code, BHandler* handler) {
    BMessage message(code);
    bool detached = false;
    looper->DispatchExternalMessage(&message, handler, detached);
    EXPECT_FALSE(detached);
}

class CountedFilter : public BMessageFilter {
  public:
    CountedFilter(uint32 command, int& living) : BMessageFilter(command), mLiving(living) { mLiving++; }
    ~CountedFilter() override { mLiving--; }

  private:
    int& mLiving;
};

} // namespace

TEST(HandlerTest, WhatAHandlerDoesNotKnowGoesToTheNextOne) {
    Seen first;
    Seen looperSeen;
    BHandler ignorant("ignorant");
    BHandler middle("middle");
    CountingHandler last(first);
    BLooper* looper = new CountingLooper(looperSeen);
    looper->AddHandler(&ignorant);
    looper->AddHandler(&middle);
    looper->AddHandler(&last);
    EXPECT_EQ(ignorant.NextHandler(), looper);
    Dispatch(looper, 'work', &ignorant);
    EXPECT_EQ(looperSeen.messages, 1);

    ignorant.SetNextHandler(&middle);
    middle.SetNextHandler(&last);
    Dispatch(looper, 'work', &ignorant);
    EXPECT_EQ(first.messages, 1);
    EXPECT_EQ(looperSeen.messages, 1);
    looper->Quit();
    EXPECT_EQ(ignorant.NextHandler(), nullptr);
    EXPECT_EQ(last.Looper(), nullptr);
}

TEST(HandlerTest, TheNextHandlerMustBelongToTheSameLooper) {
    Seen seen;
    BHandler handler;
    BHandler stranger;
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&handler);
    handler.SetNextHandler(&stranger);
    EXPECT_EQ(handler.NextHandler(), looper);
    handler.SetNextHandler(nullptr);
    EXPECT_EQ(handler.NextHandler(), nullptr);
    looper->Quit();
}

TEST(HandlerTest, AHandlerBelongsToOneLooperAtATime) {
    Seen seen;
    BHandler handler;
    BLooper* first = new CountingLooper(seen);
    BLooper* second = new CountingLooper(seen);
    first->AddHandler(&handler);
    second->AddHandler(&handler);
    EXPECT_EQ(handler.Looper(), first);
    EXPECT_FALSE(second->RemoveHandler(&handler));
    EXPECT_TRUE(first->RemoveHandler(&handler));
    EXPECT_EQ(handler.Looper(), nullptr);
    second->AddHandler(&handler);
    EXPECT_EQ(handler.Looper(), second);
    first->Quit();
    second->Quit();
}

TEST(HandlerTest, LockLooperLocksTheHandlersLooper) {
    Seen seen;
    BHandler handler;
    EXPECT_FALSE(handler.LockLooper());
    EXPECT_EQ(handler.LockLooperWithTimeout(0), B_BAD_VALUE);
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&handler);
    std::thread([&] {
        EXPECT_EQ(handler.LockLooperWithTimeout(1000), B_TIMED_OUT);
        EXPECT_EQ(handler.LockLooperWithTimeout(0), B_WOULD_BLOCK);
    }).join();
    EXPECT_TRUE(handler.LockLooper());
    EXPECT_EQ(looper->CountLocks(), 2);
    handler.UnlockLooper();
    looper->Unlock();
    std::thread([&] {
        EXPECT_TRUE(handler.LockLooper());
        EXPECT_TRUE(looper->IsLocked());
        handler.UnlockLooper();
    }).join();
    ASSERT_TRUE(looper->Lock());
    looper->Quit();
}

TEST(HandlerTest, ACommonFilterStopsAMessage) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    looper->AddCommonFilter(
        new BMessageFilter('skip', [](BMessage*, BHandler**, BMessageFilter*) { return B_SKIP_MESSAGE; }));
    looper->PostMessage('skip');
    looper->PostMessage('work');
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(seen.messages, 1);
}

TEST(HandlerTest, AFilterSendsAMessageToAnotherHandler) {
    static BHandler* other = nullptr;
    Seen looperSeen;
    Seen otherSeen;
    CountingHandler handler(otherSeen);
    other = &handler;
    BLooper* looper = new CountingLooper(looperSeen);
    looper->AddHandler(&handler);
    looper->AddFilter(new BMessageFilter('turn', [](BMessage*, BHandler** target, BMessageFilter*) {
        *target = other;
        return B_DISPATCH_MESSAGE;
    }));
    looper->PostMessage('turn');
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(looperSeen.messages, 0);
    EXPECT_EQ(otherSeen.messages, 1);
}

TEST(HandlerTest, FiltersAreAskedInOrderUntilOneSkips) {
    static std::vector<std::string> asked;
    asked.clear();
    Seen seen;
    CountingHandler handler(seen);
    Seen looperSeen;
    BLooper* looper = new CountingLooper(looperSeen);
    looper->AddHandler(&handler);
    looper->AddCommonFilter(
        new BMessageFilter(B_ANY_DELIVERY, B_ANY_SOURCE, [](BMessage*, BHandler**, BMessageFilter*) {
            asked.push_back("common");
            return B_DISPATCH_MESSAGE;
        }));
    handler.AddFilter(new BMessageFilter('stop', [](BMessage*, BHandler**, BMessageFilter*) {
        asked.push_back("stop");
        return B_SKIP_MESSAGE;
    }));
    handler.AddFilter(
        new BMessageFilter(B_ANY_DELIVERY, B_LOCAL_SOURCE, [](BMessage*, BHandler**, BMessageFilter*) {
            asked.push_back("local");
            return B_DISPATCH_MESSAGE;
        }));
    handler.AddFilter(
        new BMessageFilter(B_DROPPED_DELIVERY, B_ANY_SOURCE, [](BMessage*, BHandler**, BMessageFilter*) {
            asked.push_back("dropped");
            return B_SKIP_MESSAGE;
        }));
    looper->PostMessage('stop', &handler);
    looper->PostMessage('work', &handler);
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(seen.messages, 1);
    // What follows is the looper's own request to end.
    asked.resize(4);
    EXPECT_EQ(asked, (std::vector<std::string>{"common", "stop", "common", "local"}));
}

TEST(HandlerTest, FiltersBelongToTheirHandlerUntilTheyAreRemoved) {
    int living = 0;
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    {
        BHandler handler;
        looper->AddHandler(&handler);
        auto* kept = new CountedFilter('kept', living);
        auto* given = new CountedFilter('give', living);
        handler.AddFilter(kept);
        handler.AddFilter(given);
        EXPECT_EQ(handler.FilterList()->CountItems(), 2);
        EXPECT_EQ(given->Looper(), looper);
        EXPECT_TRUE(handler.RemoveFilter(given));
        EXPECT_FALSE(handler.RemoveFilter(given));
        EXPECT_EQ(given->Looper(), nullptr);
        delete given;
        EXPECT_EQ(living, 1);
        handler.SetFilterList(nullptr);
        EXPECT_EQ(living, 0);
        EXPECT_EQ(handler.FilterList(), nullptr);

        auto* list = new BList;
        list->AddItem(new CountedFilter('one_', living));
        handler.SetFilterList(list);
        EXPECT_EQ(living, 1);
    }
    EXPECT_EQ(living, 0);
    looper->AddCommonFilter(new CountedFilter('all_', living));
    looper->Quit();
    EXPECT_EQ(living, 0);
}

TEST(HandlerTest, ObserversGetNotices) {
    Seen seen;
    BHandler subject;
    CountingHandler observer(seen);
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&subject);
    looper->AddHandler(&observer);
    EXPECT_EQ(subject.StartWatching(&observer, 7), B_OK);
    EXPECT_TRUE(subject.IsWatched());
    subject.SendNotices(7);
    subject.SendNotices(8);
    EXPECT_EQ(looper->MessageQueue()->CountMessages(), 1);
    BMessage* notice = looper->MessageQueue()->FindMessage(int32{0});
    ASSERT_NE(notice, nullptr);
    EXPECT_EQ(notice->what, uint32{B_OBSERVER_NOTICE_CHANGE});
    EXPECT_EQ(notice->GetInt32(B_OBSERVE_WHAT_CHANGE, 0), 7);
    EXPECT_EQ(subject.StopWatching(&observer, 7), B_OK);
    EXPECT_EQ(subject.StopWatching(&observer, 7), B_NAME_NOT_FOUND);
    EXPECT_FALSE(subject.IsWatched());
    looper->Quit();
}

TEST(HandlerTest, ANoticeCarriesTheSubjectsFieldsAndItsOwnCode) {
    Seen seen;
    BHandler subject;
    CountingHandler observer(seen);
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&subject);
    looper->AddHandler(&observer);
    ASSERT_EQ(subject.StartWatchingAll(&observer), B_OK);
    BMessage change('chng');
    change.AddString("title", "new");
    subject.SendNotices(12, &change);
    BMessage* notice = looper->MessageQueue()->FindMessage(int32{0});
    ASSERT_NE(notice, nullptr);
    EXPECT_EQ(notice->what, uint32{'NTCH'});
    EXPECT_STREQ(notice->GetString("title"), "new");
    EXPECT_EQ(notice->GetInt32("be:observe_change_what", 0), 12);
    EXPECT_EQ(notice->GetInt32("be:observe_orig_what", 0), int32{'chng'});
    EXPECT_EQ(change.what, uint32{'chng'});
    EXPECT_EQ(subject.StopWatchingAll(&observer), B_OK);
    EXPECT_EQ(subject.StopWatchingAll(&observer), B_NAME_NOT_FOUND);
    subject.SendNotices(12, &change);
    EXPECT_EQ(looper->MessageQueue()->CountMessages(), 1);
    looper->Quit();
}

TEST(HandlerTest, ObserversThatAreGoneAreForgotten) {
    Seen seen;
    BHandler subject;
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&subject);
    {
        CountingHandler observer(seen);
        EXPECT_EQ(subject.StartWatching(&observer, 7), B_BAD_HANDLER);
        looper->AddHandler(&observer);
        EXPECT_EQ(subject.StartWatching(&observer, 7), B_OK);
    }
    EXPECT_TRUE(subject.IsWatched());
    subject.SendNotices(7);
    EXPECT_FALSE(subject.IsWatched());
    EXPECT_TRUE(looper->MessageQueue()->IsEmpty());
    looper->Quit();
}

TEST(HandlerTest, AnArchiveKeepsTheName) {
    BMessage archive;
    ASSERT_EQ(BHandler("named").Archive(&archive), B_OK);
    EXPECT_STREQ(archive.GetString("class"), "BHandler");
    EXPECT_STREQ(archive.GetString("_name"), "named");
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    auto* handler = dynamic_cast<BHandler*>(object.get());
    ASSERT_NE(handler, nullptr);
    EXPECT_STREQ(handler->Name(), "named");

    BMessage nameless;
    ASSERT_EQ(BHandler().Archive(&nameless), B_OK);
    EXPECT_FALSE(nameless.HasString("_name"));
    EXPECT_EQ(BHandler().Name(), nullptr);
}

TEST(HandlerTest, ScriptsAskAHandlerForItsNameAndSuites) {
    Seen seen;
    BHandler handler("asked");
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&handler);
    const BMessenger messenger(&handler);
    looper->Run();
    BMessage question(B_GET_PROPERTY);
    question.AddSpecifier("InternalName");
    BMessage answer;
    ASSERT_EQ(messenger.SendMessage(&question, &answer), B_OK);
    EXPECT_EQ(answer.what, uint32{B_REPLY});
    EXPECT_STREQ(answer.GetString("result"), "asked");
    EXPECT_EQ(answer.GetInt32("error", -1), 0);

    ASSERT_EQ(messenger.SendMessage(B_GET_SUPPORTED_SUITES, &answer), B_OK);
    EXPECT_STREQ(answer.GetString("suites"), "suite/vnd.Be-handler");

    BMessage nonsense(B_GET_PROPERTY);
    nonsense.AddSpecifier("Colour");
    ASSERT_EQ(messenger.SendMessage(&nonsense, &answer), B_OK);
    EXPECT_EQ(answer.what, uint32{B_MESSAGE_NOT_UNDERSTOOD});
    QuitLooper(looper);
}
