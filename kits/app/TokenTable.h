// Who is behind a number: handlers and waiting senders by token, loopers by address. Internal to the kits.
#pragma once

#include "LooperState.h"
#include <ThreadSafety.h>

#include <memory>
#include <unordered_map>
#include <vector>

class BHandler;
class ReplyBox;

// Tokens count up and are not given out twice, so one that has been taken back never finds somebody else.
// They begin anywhere, so that one of a process that has ended hardly finds somebody in the process that gets
// its number next.
// Any thread; the table's lock is the innermost one, nothing is called with it held.
class TokenTable {
  public:
    static TokenTable& Instance();

    struct Target {
        // Only to be looked at with the looper's lock held, after Find() has been asked again.
        BHandler* handler = nullptr;
        // Null while the handler belongs to no looper.
        std::shared_ptr<LooperState> looper;
    };

    int32 AddHandler(BHandler* handler);
    void SetLooper(int32 token, std::shared_ptr<LooperState> looper);
    // Both pointers null for a token that is not, or no longer, a handler's.
    Target Find(int32 token) const;
    void Remove(int32 token);

    int32 AddReplyBox(std::shared_ptr<ReplyBox> box);
    std::shared_ptr<ReplyBox> FindReplyBox(int32 token) const;
    // Tells everybody who waits for a reply from that team.
    void FailReplyBoxes(team_id team, status_t status);

  private:
    TokenTable();

    struct Entry {
        Target target;
        std::shared_ptr<ReplyBox> box;
    };

    mutable GuardMutex mMutex;
    int32 mNext GUARDED_BY(mMutex);
    std::unordered_map<int32, Entry> mEntries GUARDED_BY(mMutex);
};

// The loopers that are alive. Asking about the address of one that is gone is what this table is for: the
// pointer is compared and never followed. Any thread.
class LooperTable {
  public:
    static LooperTable& Instance();

    void Add(std::shared_ptr<LooperState> state);
    void Remove(const BLooper* looper);
    std::shared_ptr<LooperState> Find(const BLooper* looper) const;
    std::shared_ptr<LooperState> FindByThread(thread_id thread) const;
    // In the order in which they were made.
    std::vector<std::shared_ptr<LooperState>> All() const;

  private:
    mutable GuardMutex mMutex;
    std::unordered_map<const BLooper*, std::shared_ptr<LooperState>> mLoopers GUARDED_BY(mMutex);
    std::vector<const BLooper*> mOrder GUARDED_BY(mMutex);
};
