#pragma once

#include <functional>
#include <string>
#include <vector>

/// What each of many frames costs, told apart from what the machine does to any thread meanwhile.
namespace bench {

enum class Time { onTheClock, ofAProcessor };

/// One frame, or one round of arithmetic. Everything is the measuring thread's own.
struct FrameCost {
    double passed = 0;  // milliseconds
    double used = 0;    // milliseconds that the system counts as spent on a processor
    long faults = 0;    // pages that the system had to give
    long preempted = 0; // times that the processor was taken away
    long waited = 0;    // times that it was given away

    double In(Time time) const { return time == Time::onTheClock ? passed : used; }
};

struct FrameCosts {
    std::vector<FrameCost> frames;
    /// As many rounds, one after each frame, each as long as the median frame before it: a chain of
    /// multiplications in registers, without memory, system calls or locks. What makes a round slow is the
    /// machine.
    std::vector<FrameCost> arithmetic;
};

/// Draws frames 0 .. `count` - 1 by `draw`, which may be asked for the same frame again.
FrameCosts MeasureFrames(int count, const std::function<void(int)>& draw);

/// The limits of a row of frames, in milliseconds.
struct FrameLimits {
    double ninetyFivePercent = 0;
    double slowest = 0;
    std::string name;
};

/// Prints the 95th percentile and the slowest frame beside their limits, and the same of the arithmetic. Each
/// frame that is too slow, up to ten, is drawn again after the frames that came before it: work of ours is as
/// slow then. (Not where more than one in twenty is too slow: then all are.)
/// Answers whether both limits are kept.
bool ReportFrames(const std::string& what, const FrameCosts& costs, const FrameLimits& limits, Time time,
                  const std::function<void(int)>& draw);

} // namespace bench
