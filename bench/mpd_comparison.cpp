// First indexing, a rare search, and that search in the find window, beside a Music Player Daemon of Debian's
// packages, on the same library.
//
// Usage: mpd_comparison [FILES [FRAMES [FOLDER]]]     100000 files of 80 frames (2 s), a temporary folder

#include "app/QuirnelApp.h"
#include "indexing/FileIndexListItem.h"
#include "samples/SampleLibrary.h"
#include "search/FindWindow.h"
#include "search/SongQuery.h"
#include "support/Figures.h"
#include "support/MpdClient.h"
#include "support/Surroundings.h"
#include <Autolock.h>
#include <IndexMaintenance.h>
#include <OS.h>
#include <Query.h>
#include <VolumeRoster.h>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

constexpr int kRounds = 21;

/// Hits of one search of ours, each looked at on its file.
std::size_t CountSongs(BVolume& volume, const char* text) {
    BQuery query;
    query.SetVolume(&volume);
    PushSongsContaining(query, text);
    if (query.Fetch() != B_OK)
        return 0;
    std::size_t count = 0;
    entry_ref ref;
    while (query.GetNextRef(&ref) == B_OK)
        ++count;
    return count;
}

double IndexSeconds(BVolume& volume) {
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(volume);
    entry->knowsQuery = true;
    FileIndexListItem row(entry.release());
    const bench::Stopwatch watch;
    row.IndexAttributes();
    status_t ignored = 0;
    wait_for_thread(row.Thread(), &ignored);
    sync_index(volume.Device());
    return watch.Seconds();
}

int Compare(const fs::path& folder, const fs::path& script, std::size_t count, int frames) {
    const fs::path library = folder / "library";
    if (const std::string problem =
            samples::WriteLargeLibrary(library.string(), count, {frames, samples::Sample::Tags::before});
        !problem.empty()) {
        std::fprintf(stderr, "%s\n", problem.c_str());
        return 1;
    }
    setenv("BEKITS_VOLUMES", library.c_str(), 1);

    bench::MpdClient mpd(script.string(), (folder / "mpd").string());
    if (const std::string problem = mpd.Start(library.string()); !problem.empty()) {
        std::printf("skipped: %s\n", problem.c_str());
        return 0;
    }
    BVolumeRoster roster;
    BVolume volume;
    if (roster.GetNextVolume(&volume) != B_OK || !volume.KnowsQuery()) {
        std::fprintf(stderr, "this folder's file system holds no attributes\n");
        return 1;
    }
    QuirnelApp app;
    app.CheckCreateIndices();
    const double seconds = IndexSeconds(volume);

    const auto files = static_cast<double>(count);
    bool reached = bench::Report("first indexing", files / seconds, "files/s", "mpd, first database update",
                                 files / mpd.FirstUpdateSeconds(), 7.0, bench::Better::higher);

    const std::string rare = std::to_string(count / 7 * 3);
    std::vector<double> ours;
    std::vector<double> theirs;
    std::vector<double> searched;
    std::size_t our_hits = 0;
    std::size_t their_hits = 0;
    std::size_t their_songs = 0;
    for (int round = 0; round < kRounds; ++round) {
        const bench::Stopwatch watch;
        our_hits = CountSongs(volume, rare.c_str());
        ours.push_back(watch.Seconds() * 1e3);
        const bench::Stopwatch other;
        their_hits = mpd.CountSongs(rare);
        theirs.push_back(other.Seconds() * 1e3);
        const bench::Stopwatch whole;
        their_songs = mpd.SearchSongs(rare);
        searched.push_back(whole.Seconds() * 1e3);
    }
    std::printf("(searched for \"%s\": %zu hits here, %zu hits there)\n", rare.c_str(), our_hits, their_hits);
    if (their_songs != their_hits) {
        std::fprintf(stderr, "search answers %zu songs\n", their_songs);
        return 1;
    }
    reached &=
        bench::Report("search for a rare text", bench::Median(ours), "ms", "mpd, count \"(any contains ..)\"",
                      bench::Median(theirs), 1.0 / 20, bench::Better::lower);

    bench::Report("the same", bench::Median(ours), "ms", "mpd, search \"(any contains ..)\"",
                  bench::Median(searched), 1, bench::Better::lower);

    brindle_app = &app;
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    auto* const window = new FindWindow(nullptr);
    std::vector<double> painted;
    std::vector<double> counted;
    for (int round = 0; round < kRounds; ++round) {
        const BAutolock lock(window);
        const bench::Stopwatch watch;
        window->SearchFor(rare.c_str());
        window->UpdateIfNeeded();
        painted.push_back(watch.Seconds() * 1e3);
        const bench::Stopwatch other;
        mpd.CountSongs(rare);
        counted.push_back(other.Seconds() * 1e3);
    }
    reached &=
        bench::Report("find window, Enter to painted list", bench::Median(painted), "ms",
                      "mpd, count \"(any contains ..)\"", bench::Median(counted), 1, bench::Better::lower);
    app.FindWindowSlot().Close();
    brindle_app = nullptr;
    close_indices();
    return reached ? 0 : 1;
}

} // namespace

int main(int argc, char** argv) {
    const std::size_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 100'000;
    const int frames = argc > 2 ? std::atoi(argv[2]) : 80;
    const bench::Surroundings surroundings(argc > 3 ? argv[3] : nullptr);
    return Compare(surroundings.Folder(), QUIRNEL_PEERS_FOLDER "/mpd", count, frames);
}
