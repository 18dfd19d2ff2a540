// What the program does while nobody asks anything of it: nothing but look at its jobs five times a second.
#include "desktop/IndexerOnDesktop.h"
#include "support/process_facts.h"

#include <sstream>

namespace {

constexpr int kSeconds = 20;

struct Wakes {
    // Of the threads that pulses go through: from the display's, the process's first, to the windows'.
    std::int64_t pulsed = 0;
    std::int64_t others = 0;
    std::string list;
};

Wakes WakesWithin(int seconds, int process) {
    const test::WaitCounts before = test::wait_counts(process);
    EXPECT_FALSE(before.empty());
    sleep(static_cast<unsigned>(seconds));
    const std::string display = std::to_string(process) + " ";
    Wakes wakes;
    std::ostringstream list;
    for (const auto& [thread, count] : test::wait_counts(process)) {
        const auto known = before.find(thread);
        const std::int64_t some = count - (known != before.end() ? known->second : 0);
        list << thread << ": " << some << "\n";
        const bool takesPulses =
            thread.starts_with(display) || thread.ends_with(" Indexer") || thread.ends_with(" Find song");
        (takesPulses ? wakes.pulsed : wakes.others) += some;
    }
    wakes.list = list.str();
    return wakes;
}

TEST_F(Indexer, AtRestOnlyThePulseWakesAThread) {
    MakeFiles(20);
    Start();
    Click(kIndex);
    ASSERT_TRUE(WaitUntilTagged(20));
    // The job's row is drawn once more, the index is written, the pointer comes to rest: with much else to do
    // the machine takes its time.
    for (int rounds = 0; rounds < 12 && WakesWithin(5, mProgram->process()).others > 2; ++rounds)
        continue;
    const Wakes wakes = WakesWithin(kSeconds, mProgram->process());

    // Five pulses a second are the indexer's, two the find window's. A few for what the desktop tells
    // meanwhile.
    constexpr std::int64_t kPulses = std::int64_t{kSeconds} * (5 + 2);
    EXPECT_LE(wakes.pulsed, 2 * kPulses + 20) << wakes.list;
    EXPECT_LE(wakes.others, 10) << wakes.list;
    RecordProperty("wakes_of_pulsed_threads", static_cast<int>(wakes.pulsed));
    End();
}

} // namespace
