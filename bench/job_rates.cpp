// Rates of the index and strip jobs beside bare loops that make the same system calls on the same kind of
// tree.
//
// Usage: job_rates [FILES [ROUNDS [FOLDER]]]     100000 files, 5 rounds, a temporary folder (which must hold
// attributes)

#include "app/QuirnelApp.h"
#include "indexing/FileIndexListItem.h"
#include "samples/SampleLibrary.h"
#include "support/BareLoops.h"
#include "support/Figures.h"
#include "support/Surroundings.h"
#include <IndexMaintenance.h>
#include <OS.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

struct Rates {
    std::vector<double> tag, read, strip;
};

/// A field of /proc/self/status, in bytes.
double StatusBytes(const std::string& field) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(field + ":", 0) == 0)
            return std::strtod(line.c_str() + field.size() + 1, nullptr) * 1024;
    }
    return 0;
}

enum class Job { index, strip };

/// Files per second of one whole job on the volume, index writes included.
double RunJob(const BVolume& volume, Job job, std::size_t expected) {
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(volume);
    entry->knowsQuery = true;
    FileIndexListItem row(entry.release());
    const bench::Stopwatch watch;
    if (job == Job::index)
        row.IndexAttributes();
    else
        row.EraseAttributes();
    status_t ignored = 0;
    wait_for_thread(row.Thread(), &ignored);
    sync_index(volume.Device());
    const double seconds = watch.Seconds();
    if (static_cast<std::size_t>(row.FileCount()) != expected) {
        std::fprintf(stderr, "the job came to %d files instead of %zu\n", static_cast<int>(row.FileCount()),
                     expected);
        std::exit(1);
    }
    return static_cast<double>(expected) / seconds;
}

double Rate(const std::function<bench::Visited()>& loop, std::size_t expected) {
    const bench::Stopwatch watch;
    const bench::Visited visited = loop();
    if (visited.files != expected) {
        std::fprintf(stderr, "the bare loop came to %zu files instead of %zu\n", visited.files, expected);
        std::exit(1);
    }
    return static_cast<double>(expected) / watch.Seconds();
}

void MakeLibrary(const fs::path& root, std::size_t count) {
    if (const std::string problem = samples::WriteLargeLibrary(root.string(), count); !problem.empty()) {
        std::fprintf(stderr, "%s\n", problem.c_str());
        std::exit(1);
    }
}

BVolume OnlyVolume() {
    BVolumeRoster roster;
    BVolume volume;
    if (roster.GetNextVolume(&volume) != B_OK || !volume.KnowsQuery()) {
        std::fprintf(stderr, "this folder's file system holds no attributes\n");
        std::exit(1);
    }
    return volume;
}

/// The same rounds at one size: our jobs on one tree, bare loops on its twin, in turn.
void Measure(const fs::path& folder, std::size_t count, int rounds, Rates& ours, Rates& bare) {
    const fs::path volume_root = folder / ("volume-" + std::to_string(count));
    const fs::path twin = folder / ("twin-" + std::to_string(count));
    MakeLibrary(volume_root, count);
    MakeLibrary(twin, count);
    setenv("BEKITS_VOLUMES", volume_root.c_str(), 1);
    sync();
    const BVolume volume = OnlyVolume();
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
            [&] { ours.tag.push_back(RunJob(volume, Job::index, count)); });
        in_turn(
            round, [&] { bare.read.push_back(Rate([&] { return bench::BareRead(twin); }, count)); },
            [&] { ours.read.push_back(RunJob(volume, Job::index, count)); });
        in_turn(
            round, [&] { bare.strip.push_back(Rate([&] { return bench::BareStrip(twin); }, count)); },
            [&] { ours.strip.push_back(RunJob(volume, Job::strip, count)); });
    }
    close_indices();
    fs::remove_all(volume_root);
    fs::remove_all(twin);
}

/// Each size in a process of its own, so that neither warms the other's memory.
bool Apart(const std::function<bool()>& work) {
    std::fflush(stdout);
    const pid_t child = fork();
    if (child == 0)
        _exit(work() ? 0 : 1);
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

} // namespace

int main(int argc, char** argv) {
    const std::size_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 100'000;
    const int rounds = argc > 2 ? std::atoi(argv[2]) : 5;
    const bench::Surroundings surroundings(argc > 3 ? argv[3] : nullptr);
    const fs::path& folder = surroundings.Folder();

    const fs::path small_rates = folder / "small-rates";
    bool reached = Apart([&] {
        Rates ours;
        Rates bare;
        Measure(folder, count / 10, rounds, ours, bare);
        std::ofstream(small_rates) << bench::Median(ours.tag) << '\n';
        return true;
    });
    reached =
        Apart([&] {
            const double before = StatusBytes("VmRSS");
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
            all &= bench::Report("peak memory of all jobs", StatusBytes("VmHWM") / 1e6, "MB", "limit", 150,
                                 1.0, Better::lower);
            std::printf("(memory before the first job: %.1f MB)\n", before / 1e6);
            return all;
        }) &&
        reached;
    return reached ? 0 : 1;
}
