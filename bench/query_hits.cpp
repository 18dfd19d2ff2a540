// Hits that are looked at on their files: 100 000 real files with attributes, found by the index; and the
// writer beside the job that feeds it. Queries on names: name_walk.

#include "host/api/file_system.h"
#include "host/api/index.h"
#include "host/api/volumes.h"
#include "support/Figures.h"
#include "support/HostQueries.h"
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

using namespace host;

constexpr std::uint32_t kText = 0x43535452;

double seconds_of(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

} // namespace

int main(int argc, char** argv) {
    const int files = argc > 1 ? std::atoi(argv[1]) : 100'000;
    std::string base = (std::filesystem::current_path() / "bench-hits-XXXXXX").string();
    if (mkdtemp(base.data()) == nullptr)
        return 1;
    const std::string root = base + "/volume";
    std::filesystem::create_directories(root);
    setenv("BEKITS_VOLUMES", root.c_str(), 1);
    setenv("XDG_DATA_HOME", (base + "/data").c_str(), 1);
    const DeviceId device = volumes().list().front();
    for (int i = 0; i < files; ++i) {
        const std::string directory =
            root + "/artist " + std::to_string(i / 100) + "/album " + std::to_string(i / 10 % 10);
        if (i % 10 == 0)
            std::filesystem::create_directories(directory);
        close(open((directory + "/" + std::to_string(i) + ".mp3").c_str(), O_CREAT | O_WRONLY, 0644));
    }
    (void)indexes().create(device, "Audio:Artist", kText);
    (void)bench::Ask(device, bench::Comparison("Audio:Artist", Predicate::Operator::contains, "none"));

    std::vector<EntryRef> refs;
    {
        const auto query = indexes().query(
            device, bench::Comparison("name", Predicate::Operator::ends_with, ".mp3"), nullptr);
        RunningQuery::Hit hit;
        while ((*query)->next(hit).ok())
            refs.push_back(hit.ref);
    }
    const char* const names[] = {"Audio:Songname", "Audio:Artist",  "Audio:Album", "Audio:TrackNo",
                                 "Audio:Disc",     "Audio:Version", "Audio:Length"};
    double job = 0;
    const double both = seconds_of([&] {
        job = seconds_of([&] {
            for (const EntryRef& ref : refs) {
                const auto node = file_system().open(ref, {});
                for (const char* name : names)
                    (void)(*node)->write_attribute(name, kText, 0, "Some Artist", 12);
            }
        });
        (void)indexes().flush(device);
    });
    std::printf("job that tags               %9.0f files/s\n", files / job);
    std::printf("job and committed index     %9.0f files/s   behind at the end by %.2f s   ratio %.2f\n",
                files / both, both - job, both / job);

    std::vector<double> notes;
    for (int round = 0; round < 5; ++round) {
        notes.push_back(seconds_of([&] {
                            for (int i = 0; i < 10000; ++i)
                                (void)indexes().attributes_changed(
                                    refs[static_cast<std::size_t>(i) % refs.size()]);
                        }) /
                        10000);
        (void)indexes().flush(device);
    }
    std::printf("queue note                  %9.0f ns   limit 1000   ratio %.2f\n",
                bench::Median(notes) * 1e9, bench::Median(notes) * 1e6);

    std::vector<double> rates;
    std::uint64_t hits = 0;
    for (int round = 0; round < 7; ++round) {
        const bench::Answer count =
            bench::Ask(device, bench::Comparison("Audio:Artist", Predicate::Operator::contains, "Art"));
        hits = count.hits;
        rates.push_back(static_cast<double>(count.hits) / count.all);
    }
    std::printf("hits looked at              %9.0f /s (%llu hits)   limit 250000   ratio %.2f\n",
                bench::Median(rates), static_cast<unsigned long long>(hits), 250000 / bench::Median(rates));

    indexes().shut_down();
    std::filesystem::remove_all(base);
    return 0;
}
