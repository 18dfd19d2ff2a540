#include "support/Frames.h"

#include "support/Figures.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <sys/resource.h>

namespace bench {

namespace {

constexpr int kCalibrations = 5;
constexpr std::int64_t kCalibrationSteps = 200000;
// What a frame finds in the caches of texts was left there by fewer frames before it.
constexpr int kFramesBefore = 100;
// The fastest counts: work that is too long is so each time.
constexpr int kTimesAgain = 3;
constexpr int kMostDrawnAgain = 10;

template <typename Work>
FrameCost CostOf(const Work& work) {
    rusage before{};
    rusage after{};
    getrusage(RUSAGE_THREAD, &before);
    const Stopwatch passed;
    const ProcessorStopwatch used;
    work();
    FrameCost cost;
    cost.used = used.Seconds() * 1e3;
    cost.passed = passed.Seconds() * 1e3;
    getrusage(RUSAGE_THREAD, &after);
    cost.faults = after.ru_minflt - before.ru_minflt + after.ru_majflt - before.ru_majflt;
    cost.preempted = after.ru_nivcsw - before.ru_nivcsw;
    cost.waited = after.ru_nvcsw - before.ru_nvcsw;
    return cost;
}

std::vector<double> Times(const std::vector<FrameCost>& costs, Time time) {
    std::vector<double> times;
    for (const FrameCost& cost : costs) {
        times.push_back(cost.In(time));
    }
    std::sort(times.begin(), times.end());
    return times;
}

double PartAt(const std::vector<double>& sorted, double part) {
    return sorted[static_cast<std::size_t>(part * static_cast<double>(sorted.size() - 1))];
}

void PrintSpread(const char* name, const std::vector<FrameCost>& costs, Time time) {
    const std::vector<double> sorted = Times(costs, time);
    const double median = Median(sorted);
    const auto slow = sorted.end() - std::upper_bound(sorted.begin(), sorted.end(), 2 * median);
    const auto slowest = std::max_element(
        costs.begin(), costs.end(), [&](const auto& a, const auto& b) { return a.In(time) < b.In(time); });
    std::printf(
        "    %-10s median %.2f, 95 %% %.2f, 99 %% %.2f, slowest %.2f ms (%.2f of a processor); %.1f %% "
        "take more than twice the median\n",
        name, median, PartAt(sorted, 0.95), PartAt(sorted, 0.99), sorted.back(), slowest->used,
        100.0 * static_cast<double>(slow) / static_cast<double>(sorted.size()));
}

} // namespace

// These two are never inlined: `frame_instructions` has them found by their names.
[[gnu::noinline]] void DrawFrame(const std::function<void(int)>& draw, int frame) {
    draw(frame);
    asm volatile("" ::: "memory"); // not a jump: it is left when the frame is drawn
}

[[gnu::noinline]] std::uint32_t Arithmetic(std::int64_t steps, std::uint32_t value) {
    for (std::int64_t i = 0; i < steps; ++i) {
        value = value * 1664525U + 1013904223U;
    }
    return value;
}

FrameCosts MeasureFrames(int count, const std::function<void(int)>& draw) {
    volatile std::uint32_t result = 1;
    double fastest = 0;
    for (int i = 0; i < kCalibrations; ++i) {
        const double used = CostOf([&] { result = Arithmetic(kCalibrationSteps, result); }).used;
        fastest = i == 0 ? used : std::min(fastest, used);
    }
    FrameCosts costs;
    std::vector<double> used;
    for (int i = 0; i < count; ++i) {
        costs.frames.push_back(CostOf([&] { DrawFrame(draw, i); }));
        used.push_back(costs.frames.back().used);
        const auto steps = static_cast<std::int64_t>(Median(used) / fastest * kCalibrationSteps);
        costs.arithmetic.push_back(CostOf([&] { result = Arithmetic(steps, result); }));
    }
    return costs;
}

bool ReportFrames(const std::string& what, const FrameCosts& costs, const FrameLimits& limits, Time time,
                  const std::function<void(int)>& draw) {
    const std::vector<double> frames = Times(costs.frames, time);
    bool reached = Report(what + "95 %", PartAt(frames, 0.95), "ms", limits.name, limits.ninetyFivePercent, 1,
                          Better::lower);
    reached &= Report(what + "slowest", frames.back(), "ms", limits.name, limits.slowest, 1, Better::lower);
    PrintSpread("frames", costs.frames, time);
    PrintSpread("arithmetic", costs.arithmetic, time);
    if (PartAt(frames, 0.95) > limits.slowest) {
        std::fflush(stdout);
        return false;
    }
    int slow = 0;
    for (std::size_t i = 0; i < costs.frames.size(); ++i) {
        const FrameCost& cost = costs.frames[i];
        if (cost.In(time) <= limits.slowest || ++slow > kMostDrawnAgain) {
            continue;
        }
        const int count = static_cast<int>(costs.frames.size());
        const int frame = static_cast<int>(i);
        double fastest = 0;
        for (int round = 0; round < kTimesAgain; ++round) {
            for (int before = std::min(kFramesBefore, count - 1); before > 0; --before) {
                draw((frame - before + count) % count);
            }
            const double again = CostOf([&] { draw(frame); }).In(time);
            fastest = round == 0 ? again : std::min(fastest, again);
        }
        std::printf("    frame %d: %.1f ms, %.1f of them on a processor, %ld faults, %ld times preempted, "
                    "%ld waits; drawn again %.1f ms\n",
                    frame, cost.passed, cost.used, cost.faults, cost.preempted, cost.waited, fastest);
    }
    if (slow > kMostDrawnAgain) {
        std::printf("    and %d others\n", slow - kMostDrawnAgain);
    }
    std::fflush(stdout);
    return reached;
}

} // namespace bench
