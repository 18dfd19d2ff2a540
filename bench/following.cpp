// What it costs a tagging job that other programs' changes are followed meanwhile: every change of its own
// comes back from the system as an event.
//
// Usage: following [FILES [ROUNDS [FOLDER]]]     100000 files, 5 rounds, a temporary folder (which must hold
// attributes)

#include "app/QuirnelApp.h"
#include "host/api/index.h"
#include "host/sqlite/volume_indexes.h"
#include "support/Figures.h"
#include "support/Jobs.h"
#include "support/Surroundings.h"
#include "support/ThreadTimes.h"
#include <IndexMaintenance.h>
#include <cstdlib>
#include <unistd.h>

namespace {

host::WriterStatistics Statistics(const BVolume& volume) {
    auto& indexes = dynamic_cast<host::VolumeIndexes&>(host::indexes());
    return indexes.of(static_cast<host::DeviceId>(volume.Device()))->statistics();
}

/// Processor time for a file, in microseconds, of a job's thread, which has ended with it, and of the two
/// that take its changes in. Medians of several jobs.
class Costs {
  public:
    explicit Costs(std::size_t files) : mFiles(static_cast<double>(files)) {}

    void Add(const bench::ThreadTimes& before, const bench::ThreadTimes& after) {
        const auto used = [&](const char* name) { return (after.Of(name) - before.Of(name)) * 1e6 / mFiles; };
        mJob.push_back(used(bench::ThreadTimes::kEnded));
        mWriter.push_back(used("index writer"));
        mWatcher.push_back(used("change watcher"));
    }
    void Print(const char* which) const {
        std::printf("processor time a file, %s: job %.1f us, index writer %.1f us, change watcher %.1f us\n",
                    which, bench::Median(mJob), bench::Median(mWriter), bench::Median(mWatcher));
    }

  private:
    const double mFiles;
    std::vector<double> mJob;
    std::vector<double> mWriter;
    std::vector<double> mWatcher;
};

/// Until no event has come for a second and nothing is walked: all directories are watched, what was there
/// before has been looked at, all events are taken in.
void WaitUntilQuiet(const BVolume& volume) {
    std::uint64_t before = 0;
    std::uint64_t now = Statistics(volume).observed;
    do {
        before = now;
        sleep(1);
        now = Statistics(volume).observed;
    } while (now != before || bench::ThreadTimes::Now().Has("index walker"));
}

} // namespace

int main(int argc, char** argv) {
    const std::size_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 100'000;
    const int rounds = argc > 2 ? std::atoi(argv[2]) : 5;
    const bench::Surroundings surroundings(argc > 3 ? argv[3] : nullptr);
    const std::filesystem::path root = surroundings.Folder() / "volume";
    bench::MakeLibrary(root, count);
    setenv("BEKITS_VOLUMES", root.c_str(), 1);
    const BVolume volume = bench::OnlyVolume();
    QuirnelApp app;
    app.CheckCreateIndices();

    std::vector<double> alone;
    std::vector<double> followed;
    std::vector<double> echoes;
    std::vector<double> read_again;
    Costs cost_alone(count);
    Costs cost_followed(count);
    const auto run_alone = [&] {
        close_indices();
        // As long after the job before as with following: what that left to write is then written.
        WaitUntilQuiet(volume);
        const bench::ThreadTimes times = bench::ThreadTimes::Now();
        alone.push_back(bench::RunJob(volume, bench::Job::index, count));
        cost_alone.Add(times, bench::ThreadTimes::Now());
        bench::RunJob(volume, bench::Job::strip, count);
    };
    const auto run_followed = [&] {
        close_indices();
        host::indexes().follow_changes();
        WaitUntilQuiet(volume);
        const host::WriterStatistics before = Statistics(volume);
        const bench::ThreadTimes times = bench::ThreadTimes::Now();
        followed.push_back(bench::RunJob(volume, bench::Job::index, count));
        WaitUntilQuiet(volume);
        cost_followed.Add(times, bench::ThreadTimes::Now());
        const host::WriterStatistics after = Statistics(volume);
        echoes.push_back(static_cast<double>(after.observed - before.observed));
        read_again.push_back(static_cast<double>(after.observed_read - before.observed_read));
        close_indices();
        bench::RunJob(volume, bench::Job::strip, count);
    };
    // The first job of all finds files that were never tagged.
    bench::RunJob(volume, bench::Job::index, count);
    bench::RunJob(volume, bench::Job::strip, count);
    for (int round = 0; round < rounds; ++round) {
        if (round % 2 == 0) {
            run_alone();
            run_followed();
        } else {
            run_followed();
            run_alone();
        }
    }
    using bench::Better;
    // No limit was set for the first: the line tells what it costs.
    bench::Report("index job, changes followed", bench::Median(followed), "files/s", "not followed",
                  bench::Median(alone), 0.0, Better::higher);
    const bool reached =
        bench::Report("files read again for their own changes", bench::Median(read_again), "files",
                      "files that were tagged", static_cast<double>(count), 0.25, Better::lower);
    cost_alone.Print("not followed");
    cost_followed.Print("followed");
    std::printf("(%.0f events came back)\n", bench::Median(echoes));
    close_indices();
    return reached ? 0 : 1;
}
