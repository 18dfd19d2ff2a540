// LooperHold: a handler's looper, locked for the length of a block, where it has one. Internal to the kit.
#pragma once

#include <Handler.h>

// For objects that are their owner's alone while they belong to no looper. Any thread.
class LooperHold {
  public:
    explicit LooperHold(BHandler* handler)
        : mHandler(handler != nullptr && handler->LockLooper() ? handler : nullptr) {}
    ~LooperHold() {
        if (mHandler != nullptr) {
            mHandler->UnlockLooper();
        }
    }
    LooperHold(const LooperHold&) = delete;
    LooperHold& operator=(const LooperHold&) = delete;

  private:
    BHandler* const mHandler;
};
