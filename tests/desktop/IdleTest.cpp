// What the program does while nobody asks anything of it: nothing but look at its jobs five times a second.
#include "desktop/IndexerOnDesktop.h"
#include "support/process_facts.h"

#include <sstream>

namespace {

constexpr int kSeconds = 20;

TEST_F(Indexer, AtRestOnlyThePulseWakesAThread) {
    MakeFiles(20);
    Start();
    Click(kIndex);
    ASSERT_TRUE(WaitUntilTagged(20));
    // The job's row is drawn once more, the index is written, the pointer has come to rest.
    sleep(5);
    const test::WaitCounts before = test::wait_counts(mProgram->process());
    ASSERT_FALSE(before.empty());
    sleep(kSeconds);
    const test::WaitCounts after = test::wait_counts(mProgram->process());

    // Five pulses a second are the indexer's, two the find window's. Each goes from the display's thread, the
    // process's first, to the window's. A few for what the desktop tells meanwhile.
    constexpr std::int64_t kPulses = std::int64_t{kSeconds} * (5 + 2);
    const std::string display = std::to_string(mProgram->process()) + " ";
    std::ostringstream list;
    std::int64_t pulsed = 0;
    std::int64_t others = 0;
    for (const auto& [thread, count] : after) {
        const auto known = before.find(thread);
        const std::int64_t wakes = count - (known != before.end() ? known->second : 0);
        list << thread << ": " << wakes << "\n";
        const bool takesPulses =
            thread.starts_with(display) || thread.ends_with(" Indexer") || thread.ends_with(" Find song");
        (takesPulses ? pulsed : others) += wakes;
    }
    EXPECT_LE(pulsed, 2 * kPulses + 20) << list.str();
    EXPECT_LE(others, 10) << list.str();
    RecordProperty("wakes_of_pulsed_threads", static_cast<int>(pulsed));
    End();
}

} // namespace
