// BStopWatch: measures how long something takes.
#pragma once

#include <SupportDefs.h>

#include <string>
#include <vector>

// Starts running when it is made. Times are in microseconds. When it is destroyed it prints the elapsed time
// with its name on standard output, unless it was made silent. Not synchronised: one thread at a time.
class BStopWatch {
  public:
    explicit BStopWatch(const char* name, bool silent = false);
    virtual ~BStopWatch();
    BStopWatch(const BStopWatch&) = delete;
    BStopWatch& operator=(const BStopWatch&) = delete;

    void Suspend();
    void Resume();
    // Notes a lap and answers the time since the start; 0 while suspended. All laps are printed at the end.
    bigtime_t Lap();
    // The time since the start or the last Reset(), without the suspended spans.
    bigtime_t ElapsedTime() const;
    // Starts again from zero and forgets the laps.
    void Reset();
    // Owned by the watch.
    const char* Name() const;

  private:
    const std::string mName;
    const bool mSilent;
    bigtime_t mStart = 0;
    // When the watch was stopped; 0 while it runs.
    bigtime_t mSuspendedAt = 0;
    std::vector<bigtime_t> mLaps;
};
