// Rates of the index and strip jobs beside bare loops that make the same system calls on the same kind of
// tree.
//
// Usage: job_rates [FILES [ROUNDS [FOLDER]]]     100000 files, 5 rounds, a temporary folder (which must hold
// attributes)

#include "app/QuirnelApp.h"
#include "support/BareLoops.h"
#include "support/Figures.h"
#include "support/Jobs.h"
#include "support/ProcessMemory.h"
#include "support/Surroundings.h"
#include <IndexMaintenance.h>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <sqlite3.h>
#include <string>

namespace {

namespace fs = std::filesystem;

struct Rates {
    std::vector<double> tag, read, strip;
};

double Rate(const std::function<bench::Visited()>& loop, std::size_t expected) {
    const bench::Stopwatch watch;
    const bench::Visited visited = loop();
    if (visited.files != expected) {
        std::fprintf(stderr, "the bare loop came to %zu files instead of %zu\n", visited.files, expected);
        std::exit(1);
    }
    return static_cast<double>(expected) / watch.Seconds();
}

/// The same rounds at one size: our jobs on one tree, bare loops on its twin, in turn.
void Measure(const fs::path& folder, std::size_t count, int rounds, Rates& ours, Rates& bare) {
    const fs::path volume_root = folder / ("volume-" + std::to_string(count));
    const fs::path twin = folder / ("twin-" + std::to_string(count));
    bench::MakeLibrary(volume_root, count);
    bench::MakeLibrary(twin, count);
    setenv("BEKITS_VOLUMES", volume_root.c_str(), 1);
    sync();
    const BVolume volume = bench::OnlyVolume();
    QuirnelApp app;
    app.CheckCreateIndices();
    // What one side leaves for the file system to write back is paid by the other, so they take turns at
    // going first.
    const auto in_turn = [](int round, const auto& first, const auto& second) {
        if (round % 2 == 0) {
            first();
            second();
        } else {
            second();
            first();
        }
    };
    for (int round = 0; round < rounds; ++round) {
        in_turn(
            round, [&] { bare.tag.push_back(Rate([&] { return bench::BareTag(twin); }, count)); },
            [&] { ours.tag.push_back(bench::RunJob(volume, bench::Job::index, count)); });
        in_turn(
            round, [&] { bare.read.push_back(Rate([&] { return bench::BareRead(twin); }, count)); },
            [&] { ours.read.push_back(bench::RunJob(volume, bench::Job::index, count)); });
        in_turn(
            round, [&] { bare.strip.push_back(Rate([&] { return bench::BareStrip(twin); }, count)); },
            [&] { ours.strip.push_back(bench::RunJob(volume, bench::Job::strip, count)); });
    }
    close_indices();
    fs::remove_all(volume_root);
    fs::remove_all(twin);
}

/// The memory of a program that tags a volume, while it does so: it must not grow with the files.
bool MeasureMemory(const fs::path& folder, std::size_t count) {
    const fs::path volume_root = folder / "memory";
    bench::MakeLibrary(volume_root, count);
    setenv("BEKITS_VOLUMES", volume_root.c_str(), 1);
    const BVolume volume = bench::OnlyVolume();
    QuirnelApp app;
    app.CheckCreateIndices();
    constexpr std::array<std::size_t, 5> kPercent = {10, 25, 50, 75, 100};
    std::vector<double> resident;
    // Without the pages of the index file, which the kernel takes back when it wants them, and without the
    // database's cache of pages, which fills up to its limit and no further.
    std::vector<double> own;
    const auto note_from = [&](std::size_t files) {
        while (own.size() < kPercent.size() && files * 100 >= count * kPercent[own.size()]) {
            resident.push_back(bench::ResidentBytes() / 1e6);
            const auto cached = static_cast<double>(sqlite3_memory_used());
            own.push_back((bench::StatusBytes("RssAnon") - cached) / 1e6);
        }
    };
    bench::RunJob(volume, bench::Job::index, count, note_from);
    note_from(count);
    std::printf("(memory of the index job at 10, 25, 50, 75, 100 %% of its files, with the index's caches:");
    for (std::size_t i = 0; i < own.size(); ++i)
        std::printf(" %.1f (%.1f)", own[i], resident[i]);
    std::printf(" MB)\n");
    const bool flat = bench::Report("memory at the end of the index job", own[4], "MB", "half-way through",
                                    own[2], 1.1, bench::Better::lower);
    close_indices();
    fs::remove_all(volume_root);
    return flat;
}

} // namespace

int main(int argc, char** argv) {
    const std::size_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 100'000;
    const int rounds = argc > 2 ? std::atoi(argv[2]) : 5;
    const bench::Surroundings surroundings(argc > 3 ? argv[3] : nullptr);
    const fs::path& folder = surroundings.Folder();

    const fs::path small_rates = folder / "small-rates";
    bool reached = bench::Apart([&] {
        Rates ours;
        Rates bare;
        Measure(folder, count / 10, rounds, ours, bare);
        std::ofstream(small_rates) << bench::Median(ours.tag) << '\n';
        return true;
    });
    reached =
        bench::Apart([&] {
            const double before = bench::ResidentBytes();
            Rates ours;
            Rates bare;
            Measure(folder, count, rounds, ours, bare);
            using bench::Better;
            bool all = bench::Report("index job, untagged files", bench::Median(ours.tag), "files/s",
                                     "bare loop, 7 fsetxattr", bench::Median(bare.tag), 0.75, Better::higher);
            all &= bench::Report("index job, tagged files", bench::Median(ours.read), "files/s",
                                 "bare loop, 7 fgetxattr", bench::Median(bare.read), 0.5, Better::higher);
            all &=
                bench::Report("strip job", bench::Median(ours.strip), "files/s", "bare loop, 17 fremovexattr",
                              bench::Median(bare.strip), 0.75, Better::higher);
            double small = 0;
            std::ifstream(small_rates) >> small;
            all &= bench::Report("index job, time per file", 1e6 / bench::Median(ours.tag), "us",
                                 "at a tenth of the files", 1e6 / small, 1.25, Better::lower);
            all &= bench::Report("peak memory of all jobs", bench::StatusBytes("VmHWM") / 1e6, "MB", "limit",
                                 150, 1.0, Better::lower);
            std::printf("(memory before the first job: %.1f MB)\n", before / 1e6);
            return all;
        }) &&
        reached;
    reached = bench::Apart([&] { return MeasureMemory(folder, count); }) && reached;
    return reached ? 0 : 1;
}
