// Hits that are looked at on their files: 100 000 real files with attributes, found by the index; and a query
// on names beside a bare one-thread reading of the same directories; and the writer beside the job that feeds
// it.

#include "host/api/file_system.h"
#include "host/api/index.h"
#include "host/api/volumes.h"
#include "host/linux/directory_stream.h"
#include "host/linux/opening.h"
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <dirent.h>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <sys/stat.h>
#include <sys/xattr.h>
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

double median(std::vector<double> values) {
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

std::shared_ptr<const Predicate> compare(const char* attribute, Predicate::Operator op, const char* text) {
    auto predicate = std::make_shared<Predicate>();
    predicate->attribute = attribute;
    predicate->op = op;
    predicate->value = std::string(text);
    return predicate;
}

std::uint64_t bare_walk(int directory) {
    std::uint64_t count = 0;
    DirectoryStream stream(directory, 65536);
    DirectoryStream::Entry entry;
    while (stream.next(entry)) {
        ++count;
        if (entry.type != DT_DIR)
            continue;
        const int child =
            openat(directory, entry.leaf.data(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
        if (child >= 0) {
            count += bare_walk(child);
            close(child);
        }
    }
    return count;
}

struct Count {
    std::uint64_t hits = 0;
    double first = 0;
    double all = 0;
};

Count run(DeviceId device, const std::shared_ptr<const Predicate>& predicate) {
    Count count;
    RunningQuery::Hit hit;
    const auto start = std::chrono::steady_clock::now();
    const auto elapsed = [&start] {
        return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    };
    const auto query = indexes().query(device, predicate, nullptr);
    while (query && (*query)->next(hit).ok()) {
        if (count.hits++ == 0)
            count.first = elapsed();
    }
    count.all = elapsed();
    return count;
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
    (void)run(device, compare("Audio:Artist", Predicate::Operator::contains, "none"));

    std::vector<EntryRef> refs;
    {
        const auto query =
            indexes().query(device, compare("name", Predicate::Operator::ends_with, ".mp3"), nullptr);
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
    std::printf("queue note                  %9.0f ns   limit 1000   ratio %.2f\n", median(notes) * 1e9,
                median(notes) * 1e6);

    std::vector<double> rates;
    std::uint64_t hits = 0;
    for (int round = 0; round < 7; ++round) {
        const Count count = run(device, compare("Audio:Artist", Predicate::Operator::contains, "Art"));
        hits = count.hits;
        rates.push_back(static_cast<double>(count.hits) / count.all);
    }
    std::printf("hits looked at              %9.0f /s (%llu hits)   limit 250000   ratio %.2f\n",
                median(rates), static_cast<unsigned long long>(hits), 250000 / median(rates));

    std::vector<double> bare;
    std::vector<double> walks;
    std::vector<double> firsts;
    std::uint64_t entries = 0;
    for (int round = 0; round < 7; ++round) {
        bare.push_back(seconds_of([&] {
            const int directory = open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
            entries = bare_walk(directory);
            close(directory);
        }));
        const Count count = run(device, compare("name", Predicate::Operator::ends_with, ".mp3"));
        walks.push_back(count.all);
        firsts.push_back(count.first);
    }
    std::printf("name query, first hit       %9.2f ms   limit 20   ratio %.3f\n", median(firsts) * 1e3,
                median(firsts) / 0.02);
    std::printf("name query, whole walk      %9.0f entries/s   bare walk %.0f   limit 1.3 times its time   "
                "ratio %.2f\n",
                static_cast<double>(entries) / median(walks), static_cast<double>(entries) / median(bare),
                median(walks) / median(bare) / 1.3);
    indexes().shut_down();
    std::filesystem::remove_all(base);
    return 0;
}
