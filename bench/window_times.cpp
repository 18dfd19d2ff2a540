// How soon the indexer window is there, and what it costs a job to be watched.
//
// Usage: window_times [TRACKS [STARTS [JOBS]]]     100000 tracks, 9 starts, 5 jobs of each kind; 0 for no
// jobs. Needs Xvfb.

#include "app/QuirnelApp.h"
#include "indexing/FileIndexListItem.h"
#include "samples/SampleLibrary.h"
#include "support/Figures.h"
#include "support/Surroundings.h"
#include "support/ThreadTimes.h"
#include "support/WindowWatch.h"
#include <IndexMaintenance.h>
#include <ListView.h>
#include <OS.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <Window.h>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <memory>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

[[noreturn]] void Fail(const std::string& problem) {
    std::fprintf(stderr, "%s\n", problem.c_str());
    std::exit(1);
}

/// Runs `work` in a process of its own and answers the figure that it found.
double Apart(const std::filesystem::path& folder, const std::function<double()>& work) {
    const std::filesystem::path answer = folder / "answer";
    std::fflush(stdout);
    const pid_t child = fork();
    if (child == 0) {
        std::ofstream(answer) << work() << '\n';
        std::fflush(nullptr);
        _exit(0);
    }
    int status = 0;
    waitpid(child, &status, 0);
    double figure = 0;
    if (status != 0 || !(std::ifstream(answer) >> figure))
        Fail("a part of the measurement failed");
    return figure;
}

BVolume OnlyVolume() {
    BVolumeRoster roster;
    BVolume volume;
    if (roster.GetNextVolume(&volume) != B_OK || !volume.KnowsQuery())
        Fail("this folder's file system holds no attributes");
    return volume;
}

std::unique_ptr<FileIndexListItem> RowWithoutWindow() {
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(OnlyVolume());
    entry->knowsQuery = true;
    return std::make_unique<FileIndexListItem>(entry.release());
}

double WaitForJob(const FileIndexListItem& row, const bench::Stopwatch& watch, std::size_t expected) {
    while (row.IsRunning())
        snooze(1000);
    sync_index(row.Entry().volume->Device());
    const double seconds = watch.Seconds();
    if (static_cast<std::size_t>(row.FileCount()) != expected)
        Fail("the job came to " + std::to_string(row.FileCount()) + " files");
    return static_cast<double>(expected) / seconds;
}

/// Nothing is left of the start: the window is drawn, and the volume walked for what happened before it.
void WaitUntilStarted() {
    do
        snooze(1000000);
    while (bench::ThreadTimes::Now().Has("index walker"));
}

double RunJobWithoutWindow(void (FileIndexListItem::*start)(), std::size_t expected) {
    QuirnelApp app;
    app.CheckCreateIndices();
    const auto row = RowWithoutWindow();
    WaitUntilStarted();
    const bench::Stopwatch watch;
    (row.get()->*start)();
    const double rate = WaitForJob(*row, watch, expected);
    close_indices();
    return rate;
}

constexpr uint32 kMeasure = 'meas';

/// The whole program, which presses its own "Index" button once its window is there.
class WatchedApp : public QuirnelApp {
  public:
    explicit WatchedApp(std::size_t tracks) : mTracks(tracks) {}

    void ReadyToRun() override {
        QuirnelApp::ReadyToRun();
        PostMessage(kMeasure);
    }
    void MessageReceived(BMessage* message) override {
        if (message->what != kMeasure) {
            QuirnelApp::MessageReceived(message);
            return;
        }
        WaitUntilStarted();
        FileIndexListItem* row = nullptr;
        const bench::Stopwatch watch;
        IndexWindowSlot().UseLocked([&](BWindow* window) {
            auto* const list = dynamic_cast<BListView*>(window->FindView("volumelist"));
            row = dynamic_cast<FileIndexListItem*>(list->ItemAt(0));
            window->PostMessage(MSG_INDEX_START);
        });
        if (row == nullptr)
            Fail("there is no window");
        while (row->Thread() == 0)
            snooze(100);
        mRate = WaitForJob(*row, watch, mTracks);
        PostMessage(B_QUIT_REQUESTED);
    }
    double Rate() const { return mRate; }

  private:
    const std::size_t mTracks;
    double mRate = 0;
};

double RunJobInWindow(std::size_t tracks) {
    brindle_app = new WatchedApp(tracks);
    brindle_app->Run();
    const double rate = static_cast<WatchedApp*>(brindle_app)->Rate();
    close_indices();
    return rate;
}

/// From the start of the program to the lists of both windows on the screen.
double SecondsToWindow(bench::WindowWatch& display) {
    const bench::Stopwatch watch;
    const pid_t program = fork();
    if (program == 0) {
        execl(QUIRNEL_PROGRAM, QUIRNEL_PROGRAM, nullptr);
        _exit(1);
    }
    const bool shown = display.WaitForWindow("Indexer", 20.0) && display.WaitForWindow("Find song", 20.0);
    const double seconds = watch.Seconds();
    kill(program, SIGTERM);
    waitpid(program, nullptr, 0);
    if (!shown)
        Fail("the windows do not come");
    return seconds;
}

} // namespace

int main(int argc, char** argv) {
    const std::size_t tracks = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 100'000;
    const int starts = argc > 2 ? std::atoi(argv[2]) : 9;
    const int jobs = argc > 3 ? std::atoi(argv[3]) : 5;
    const bench::Surroundings surroundings;
    const std::filesystem::path root = surroundings.Folder() / "Music";
    setenv("BEKITS_VOLUMES", root.c_str(), 1);
    if (const std::string problem = samples::WriteLargeLibrary(root.string(), tracks); !problem.empty())
        Fail(problem);
    bench::WindowWatch display;
    unsetenv("QT_QPA_PLATFORM");
    unsetenv("WAYLAND_DISPLAY");
    sync();

    const auto apart = [&](const std::function<double()>& work) {
        return Apart(surroundings.Folder(), work);
    };
    const auto strip = [&] {
        apart([&] { return RunJobWithoutWindow(&FileIndexListItem::EraseAttributes, tracks); });
        sync();
    };
    std::vector<double> watched;
    std::vector<double> alone;
    for (int job = 0; job < jobs; ++job) {
        // They take turns at going first.
        for (const bool in_window : {job % 2 == 0, job % 2 != 0}) {
            if (in_window)
                watched.push_back(apart([&] { return RunJobInWindow(tracks); }));
            else
                alone.push_back(
                    apart([&] { return RunJobWithoutWindow(&FileIndexListItem::IndexAttributes, tracks); }));
            strip();
        }
    }
    apart([&] { return RunJobWithoutWindow(&FileIndexListItem::IndexAttributes, tracks); });
    std::vector<double> times;
    for (int start = 0; start < starts; ++start)
        times.push_back(SecondsToWindow(display) * 1e3);

    using bench::Better;
    bool reached =
        bench::Report("start to both windows on the screen", bench::Median(times), "ms",
                      "limit, " + std::to_string(tracks) + " tracks indexed", 400, 1.0, Better::lower);
    reached &= bench::Report("slowest start", *std::max_element(times.begin(), times.end()), "ms", "limit",
                             400, 1.0, Better::lower);
    if (jobs > 0)
        reached &= bench::Report("index job, its window open", bench::Median(watched), "files/s",
                                 "the job without a window", bench::Median(alone), 0.95, Better::higher);
    return reached ? 0 : 1;
}
