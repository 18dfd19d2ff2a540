#include "TokenTable.h"

#include "ReplyBox.h"

#include <algorithm>
#include <random>

TokenTable::TokenTable() : mNext(static_cast<int32>(std::random_device()() >> 2) + 1) {}

TokenTable& TokenTable::Instance() {
    // Never destroyed: handlers with static lifetime take their tokens back after every other destructor.
    static TokenTable* const table = new TokenTable;
    return *table;
}

int32 TokenTable::AddHandler(BHandler* handler) {
    GuardLock guard(mMutex);
    const int32 token = mNext++;
    mEntries[token].target.handler = handler;
    return token;
}

void TokenTable::SetLooper(int32 token, std::shared_ptr<LooperState> looper) {
    GuardLock guard(mMutex);
    const auto found = mEntries.find(token);
    if (found != mEntries.end())
        found->second.target.looper = std::move(looper);
}

TokenTable::Target TokenTable::Find(int32 token) const {
    GuardLock guard(mMutex);
    const auto found = mEntries.find(token);
    return found != mEntries.end() ? found->second.target : Target();
}

void TokenTable::Remove(int32 token) {
    GuardLock guard(mMutex);
    mEntries.erase(token);
}

int32 TokenTable::AddReplyBox(std::shared_ptr<ReplyBox> box) {
    GuardLock guard(mMutex);
    const int32 token = mNext++;
    mEntries[token].box = std::move(box);
    return token;
}

std::shared_ptr<ReplyBox> TokenTable::FindReplyBox(int32 token) const {
    GuardLock guard(mMutex);
    const auto found = mEntries.find(token);
    return found != mEntries.end() ? found->second.box : nullptr;
}

void TokenTable::FailReplyBoxes(team_id team, status_t status) {
    std::vector<std::shared_ptr<ReplyBox>> failed;
    {
        GuardLock guard(mMutex);
        for (const auto& [token, entry] : mEntries) {
            if (entry.box != nullptr && entry.box->awaited == team)
                failed.push_back(entry.box);
        }
    }
    for (const std::shared_ptr<ReplyBox>& box : failed)
        box->Fail(status);
}

LooperTable& LooperTable::Instance() {
    static LooperTable* const table = new LooperTable;
    return *table;
}

void LooperTable::Add(std::shared_ptr<LooperState> state) {
    GuardLock guard(mMutex);
    mOrder.push_back(state->looper);
    mLoopers[state->looper] = std::move(state);
}

void LooperTable::Remove(const BLooper* looper) {
    GuardLock guard(mMutex);
    mLoopers.erase(looper);
    std::erase(mOrder, looper);
}

std::shared_ptr<LooperState> LooperTable::Find(const BLooper* looper) const {
    GuardLock guard(mMutex);
    const auto found = mLoopers.find(looper);
    return found != mLoopers.end() ? found->second : nullptr;
}

std::shared_ptr<LooperState> LooperTable::FindByThread(thread_id thread) const {
    GuardLock guard(mMutex);
    for (const auto& [looper, state] : mLoopers) {
        if (state->thread == thread)
            return state;
    }
    return nullptr;
}

std::vector<std::shared_ptr<LooperState>> LooperTable::All() const {
    GuardLock guard(mMutex);
    std::vector<std::shared_ptr<LooperState>> all;
    for (const BLooper* looper : mOrder)
        all.push_back(mLoopers.at(looper));
    return all;
}
