#include <StopWatch.h>

#include <chrono>
#include <cstdio>

namespace {

bigtime_t now() {
    return std::chrono::duration_cast<std::chrono::microseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

} // namespace

BStopWatch::BStopWatch(const char* name, bool silent) : mName(name != nullptr ? name : ""), mSilent(silent) {
    Reset();
}

BStopWatch::~BStopWatch() {
    if (mSilent)
        return;
    std::printf("StopWatch \"%s\": %" B_PRIdBIGTIME " usecs.\n", mName.c_str(), ElapsedTime());
    bigtime_t previous = 0;
    for (size_t lap = 0; lap < mLaps.size(); lap++) {
        std::printf("   [%zu: %" B_PRIdBIGTIME "#%" B_PRIdBIGTIME "]\n", lap + 1, mLaps[lap],
                    mLaps[lap] - previous);
        previous = mLaps[lap];
    }
}

void BStopWatch::Suspend() {
    if (mSuspendedAt == 0)
        mSuspendedAt = now();
}

void BStopWatch::Resume() {
    if (mSuspendedAt == 0)
        return;
    mStart += now() - mSuspendedAt;
    mSuspendedAt = 0;
}

bigtime_t BStopWatch::Lap() {
    if (mSuspendedAt != 0)
        return 0;
    mLaps.push_back(ElapsedTime());
    return mLaps.back();
}

bigtime_t BStopWatch::ElapsedTime() const {
    return (mSuspendedAt != 0 ? mSuspendedAt : now()) - mStart;
}

void BStopWatch::Reset() {
    mStart = now();
    mSuspendedAt = 0;
    mLaps.clear();
}

const char* BStopWatch::Name() const {
    return mName.c_str();
}
