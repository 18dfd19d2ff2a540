// Searching 1 000 000 mirrored tracks: loading the columns from the database, "contains" on four attributes
// down to row numbers, and memory. Each search stands beside one pass over the same bytes in the same run.

#include "host/sqlite/attribute_record.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/search_columns.h"
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <random>
#include <string>
#include <vector>
#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace {

using namespace host;

double seconds_of(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

double median(std::vector<double> values) {
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

const char* const kAttributes[] = {"Audio:Songname", "Audio:Artist", "Audio:Album", "Audio:TrackNo"};

std::string words(std::mt19937& random, int count) {
    static const char* const syllables[] = {"ba", "lo",  "mi", "tren", "sal",  "vor", "ne", "ki",  "dus",
                                            "ar", "phe", "go", "wi",   "chan", "os",  "ul", "ret", "by"};
    std::string text;
    for (int i = 0; i < count; ++i) {
        if (i > 0)
            text += ' ';
        const std::size_t start = text.size();
        const auto parts = static_cast<unsigned>(1 + random() % 3);
        for (unsigned k = 0; k < parts; ++k)
            text += syllables[random() % std::size(syllables)];
        text[start] = static_cast<char>(text[start] - 32);
    }
    return text;
}

/// Titles are all different; ten tracks share an album and fifty an artist. Marked titles give searches with
/// a known number of hits.
void fill(IndexStore& store, int rows) {
    std::mt19937 random(7);
    std::uint32_t ids[4] = {};
    (void)store.begin();
    for (int i = 0; i < 4; ++i)
        (void)store.attribute_id(kAttributes[i], 0x43535452, ids[i]);
    std::string artist;
    std::string album;
    for (int i = 0; i < rows; ++i) {
        if (i % 50 == 0)
            artist = words(random, 2);
        if (i % 10 == 0)
            album = words(random, 3);
        std::string title = words(random, 6) + " " + std::to_string(i);
        if (i % 100000 == 0)
            title += " Qxj";
        if (i % 16 == 0)
            title += " Zq";
        if (i % 2 == 0)
            title += " Kx";
        const std::string texts[4] = {title, artist, album, std::to_string(i % 10 + 1)};
        IndexRow row;
        row.directory = 1000 + static_cast<std::uint64_t>(i) / 10;
        row.name = std::to_string(i) + " - " + title + ".mp3";
        row.inode = 5'000'000 + static_cast<std::uint64_t>(i);
        row.change_time = 1;
        row.settled = true;
        for (int k = 0; k < 4; ++k)
            append_recorded_attribute(row.attributes, {ids[k], false, std::as_bytes(std::span(texts[k]))});
        (void)store.insert(row);
    }
    (void)store.commit();
    (void)store.connection().execute("PRAGMA wal_checkpoint(TRUNCATE)");
}

std::shared_ptr<const Condition> four_contain(const std::string& text) {
    std::shared_ptr<const Predicate> all;
    for (const char* attribute : kAttributes) {
        auto one = std::make_shared<Predicate>();
        one->op = Predicate::Operator::contains;
        one->attribute = attribute;
        one->value = text;
        if (!all) {
            all = one;
            continue;
        }
        auto either = std::make_shared<Predicate>();
        either->op = Predicate::Operator::either;
        either->operands = {all, one};
        all = either;
    }
    return Condition::compile(*all);
}

#if defined(__x86_64__)
__attribute__((target("avx2")))
#endif
std::uint64_t
pass_over(const std::vector<char>& bytes) {
    std::uint64_t sum = 0;
#if defined(__x86_64__)
    __m256i sums = _mm256_setzero_si256();
    std::size_t i = 0;
    for (; i + 64 <= bytes.size(); i += 64) {
        const auto* at = reinterpret_cast<const __m256i*>(bytes.data() + i);
        sums = _mm256_add_epi64(sums, _mm256_loadu_si256(at));
        sums = _mm256_add_epi64(sums, _mm256_loadu_si256(at + 1));
    }
    alignas(32) std::uint64_t parts[4];
    _mm256_store_si256(reinterpret_cast<__m256i*>(parts), sums);
    sum = parts[0] + parts[1] + parts[2] + parts[3];
#else
    for (const char byte : bytes)
        sum += static_cast<unsigned char>(byte);
#endif
    return sum;
}

} // namespace

int main(int argc, char** argv) {
    const int rows = argc > 1 ? std::atoi(argv[1]) : 1'000'000;
    const std::string folder = std::filesystem::temp_directory_path() / "bekits-bench-columns";
    std::filesystem::remove_all(folder);
    std::filesystem::create_directories(folder);
    const std::string path = folder + "/index.db";
    {
        IndexStore store;
        if (!succeeded(store.open(path, Connection::Mode::create)))
            return 1;
        const double time = seconds_of([&] { fill(store, rows); });
        std::printf("rows written                %9.0f /s\n", rows / time);
    }
    std::vector<double> loads;
    std::vector<RowNumber> found;
    for (int i = 0; i < 5; ++i)
        loads.push_back(seconds_of([&] {
            IndexStore store;
            SearchColumns columns(path);
            (void)store.open(path, Connection::Mode::existing);
            (void)columns.find(store, *four_contain("Qxj"), found);
        }));
    std::printf("first query, from opening   %9.3f s   limit 0.600   ratio %.2f\n", median(loads),
                median(loads) / 0.6);

    IndexStore store;
    (void)store.open(path, Connection::Mode::existing);
    SearchColumns columns(path);
    (void)columns.find(store, *four_contain("Qxj"), found);
    const double per_row = static_cast<double>(columns.memory_bytes()) / rows;
    std::printf("memory                      %9.1f bytes a track   limit 100   ratio %.2f\n", per_row,
                per_row / 100);
    const std::vector<char> bytes(columns.arena_bytes(), 'a');
    std::printf("searched                    %9.1f MB\n", static_cast<double>(bytes.size()) / 1e6);
    const struct {
        const char* text;
        double limit; ///< seconds; 0: 1.5 passes over the bytes
    } searches[] = {{"Qxj", 0},    {"Zq", 0},    {"Tren", 0.020}, {"ababab", 0},
                    {"Kx", 0.020}, {"e", 0.015}, {"7", 0.015},    {"Z", 0.015}};
    std::uint64_t sink = 0;
    for (const auto& search : searches) {
        const auto condition = four_contain(search.text);
        std::vector<double> passes;
        std::vector<double> times;
        for (int i = 0; i < 11; ++i) {
            passes.push_back(seconds_of([&] { sink += pass_over(bytes); }));
            times.push_back(seconds_of([&] { (void)columns.find(store, *condition, found); }));
        }
        const double limit = search.limit > 0 ? search.limit : 1.5 * median(passes);
        std::printf("contains %-8s %8zu hits %7.2f ms   one pass %.2f ms   limit %.2f ms   ratio %.2f\n",
                    search.text, found.size(), median(times) * 1e3, median(passes) * 1e3, limit * 1e3,
                    median(times) / limit);
    }
    std::filesystem::remove_all(folder);
    return sink == 1 ? 1 : 0;
}
