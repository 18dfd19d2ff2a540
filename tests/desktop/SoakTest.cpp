// The program at work for a long time: its memory must not grow.
//
// QUIRNEL_SOAK_SECONDS says how long; an hour when it is not set.
#include "desktop/IndexerOnDesktop.h"
#include "support/process_facts.h"

#include <algorithm>
#include <chrono>
#include <cstdio>

namespace {

constexpr int kFiles = 500;
constexpr std::int64_t kMegabyte = 1 << 20;

std::chrono::seconds SoakTime() {
    const char* const seconds = std::getenv("QUIRNEL_SOAK_SECONDS");
    return std::chrono::seconds(seconds != nullptr ? std::atoi(seconds) : 3600);
}

std::int64_t Median(std::vector<std::int64_t> values) {
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

class Soak : public Indexer {
  protected:
    // Everything that a user can do with the window, once.
    void UseEverything() {
        Click(kIndex);
        EXPECT_TRUE(WaitUntilTagged(kFiles));
        WaitForButtons();
        for (const int width : {500, 800, 451})
            Resize(width, width / 2);
        Press("F10");
        Press("Down");
        Press("Down");
        Press("Escape");
        Press("Escape");
        // Files that come and go between the jobs.
        MakeFile("passing/Artist - Passing.mp3");
        Click(kStrip);
        EXPECT_TRUE(WaitUntilTagged(0));
        WaitForButtons();
        std::filesystem::remove_all(Volume() + "/passing");
        Click(kIndex);
        usleep(100000);
        Click(kStop);
        WaitForButtons();
        Click(kStrip);
        EXPECT_TRUE(WaitUntilTagged(0));
        WaitForButtons();
    }
    // A job's end is seen, and the buttons follow, with the next pulse.
    static void WaitForButtons() { usleep(1000000); }
};

TEST_F(Soak, MemoryDoesNotGrow) {
    // Freed memory that a checker keeps back would look like growth.
    setenv("ASAN_OPTIONS", "quarantine_size_mb=1:thread_local_quarantine_size_kb=64", 1);
    MakeFiles(kFiles);
    Start();
    const auto end = std::chrono::steady_clock::now() + SoakTime();
    std::vector<std::int64_t> memory;
    while (std::chrono::steady_clock::now() < end && !HasFailure()) {
        UseEverything();
        memory.push_back(test::resident_bytes(mProgram->process()));
    }
    End();
    ASSERT_GE(memory.size(), 8U) << "too short to tell anything";
    const auto quarter = static_cast<std::ptrdiff_t>(memory.size() / 4);
    // The first quarter fills caches.
    const std::int64_t early = Median({memory.begin() + quarter, memory.begin() + 2 * quarter});
    const std::int64_t late = Median({memory.end() - quarter, memory.end()});
    std::printf("%zu rounds; memory %.1f MB early, %.1f MB late\n", memory.size(),
                static_cast<double>(early) / kMegabyte, static_cast<double>(late) / kMegabyte);
    EXPECT_LE(late, early + early / 50 + kMegabyte);
}

} // namespace
