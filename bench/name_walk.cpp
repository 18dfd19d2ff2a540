// A query on names, which is a walk: its first hit, the whole of it beside a bare one-thread reading of the
// same directories, and the memory that it takes.
//
// Usage: name_walk FOLDER [ENTRIES [ROUNDS]]     1000000 empty files, 7 rounds
//
// The tree is made once and kept in FOLDER for the next run.

#include "host/api/index.h"
#include "host/api/volumes.h"
#include "support/Figures.h"
#include "support/HostQueries.h"
#include "support/ProcessMemory.h"
#include "support/Surroundings.h"
#include <atomic>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <string>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr std::size_t kPerFolder = 1000;

/// Every second folder, from `first` on. False when a file cannot be made.
bool MakeFolders(const fs::path& root, std::size_t first, std::size_t entries) {
    for (std::size_t folder = first; folder * kPerFolder < entries; folder += 2) {
        const fs::path place = root / ("folder " + std::to_string(folder));
        if (mkdir(place.c_str(), 0755) != 0 && errno != EEXIST)
            return false;
        const int directory = open(place.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
        bool made = directory >= 0;
        const std::size_t last = std::min(entries, (folder + 1) * kPerFolder);
        for (std::size_t number = folder * kPerFolder; made && number < last; ++number) {
            const std::string leaf = "Artist - Song " + std::to_string(number) + ".mp3";
            made = mknodat(directory, leaf.c_str(), S_IFREG | 0644, 0) == 0 || errno == EEXIST;
        }
        if (directory >= 0)
            close(directory);
        if (!made)
            return false;
    }
    return true;
}

/// The tree's root, made where it is not there whole; empty when it cannot be.
fs::path MakeTree(const fs::path& folder, std::size_t entries) {
    const fs::path root = folder / ("tree-" + std::to_string(entries));
    const fs::path whole = folder / ("tree-" + std::to_string(entries) + ".whole");
    if (fs::exists(whole))
        return root;
    fs::create_directories(root);
    const bench::Stopwatch watch;
    std::atomic<bool> made{true};
    std::thread other([&] {
        if (!MakeFolders(root, 1, entries))
            made = false;
    });
    if (!MakeFolders(root, 0, entries))
        made = false;
    other.join();
    if (!made)
        return {};
    std::ofstream(whole) << entries << '\n';
    std::printf("(tree made in %.1f s)\n", watch.Seconds());
    return root;
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        std::fprintf(stderr, "name_walk FOLDER [ENTRIES [ROUNDS]]\n");
        return 1;
    }
    const std::size_t entries = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1'000'000;
    const int rounds = argc > 3 ? std::atoi(argv[3]) : 7;
    const fs::path folder = fs::absolute(argv[1]);
    const fs::path root = MakeTree(folder, entries);
    if (root.empty()) {
        std::perror(folder.c_str());
        return 1;
    }
    const bench::Surroundings surroundings(folder.c_str());
    setenv("BEKITS_VOLUMES", root.c_str(), 1);
    const host::DeviceId volume = host::volumes().list().front();
    const auto songs = bench::Comparison("name", host::Predicate::Operator::ends_with, ".mp3");

    // Directories are in the cache from here on.
    const std::uint64_t all = bench::BareWalk(root);
    const double before = bench::ResidentBytes();
    std::vector<double> bare;
    std::vector<double> walks;
    std::vector<double> firsts;
    for (int round = 0; round < rounds; ++round) {
        const auto read = [&] {
            const bench::Stopwatch watch;
            (void)bench::BareWalk(root);
            bare.push_back(watch.Seconds());
        };
        const auto ask = [&] {
            const bench::Answer answer = bench::Ask(volume, songs);
            if (answer.hits != entries) {
                std::fprintf(stderr, "the query found %llu files instead of %zu\n",
                             static_cast<unsigned long long>(answer.hits), entries);
                std::exit(1);
            }
            walks.push_back(answer.all);
            firsts.push_back(answer.first);
        };
        if (round % 2 == 0) {
            read();
            ask();
        } else {
            ask();
            read();
        }
    }
    using bench::Better;
    bool reached = bench::Report("name query, first hit", bench::Median(firsts) * 1e3, "ms", "limit", 20, 1.0,
                                 Better::lower);
    reached &=
        bench::Report("name query, all of " + std::to_string(all) + " entries", bench::Median(walks) * 1e3,
                      "ms", "bare walk", bench::Median(bare) * 1e3, 1.3, Better::lower);
    reached &= bench::Report("memory that the walks added", (bench::ResidentBytes() - before) / 1e6, "MB",
                             "limit", 10, 1.0, Better::lower);
    host::indexes().shut_down();
    return reached ? 0 : 1;
}
