#include "host/sqlite/text_column.h"
#include "host/sqlite/text_search.h"
#include "tests/support/random_seed.h"
#include <gtest/gtest.h>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace host {
namespace {

std::vector<std::size_t> naive(const std::string& text, const std::string& needle) {
    std::vector<std::size_t> hits;
    for (std::size_t at = text.find(needle); at != std::string::npos; at = text.find(needle, at + 1))
        hits.push_back(at);
    return hits;
}

std::vector<std::size_t> found(SearchKernel kernel, const std::string& text, const std::string& needle) {
    // A block of exactly the text's size, so that the sanitizer sees a read past its end.
    const auto copy = std::make_unique<char[]>(text.size());
    std::copy(text.begin(), text.end(), copy.get());
    std::vector<std::size_t> hits;
    search(kernel, copy.get(), text.size(), needle, [&](std::size_t position) {
        hits.push_back(position);
        return position + 1;
    });
    return hits;
}

std::string random_text(std::mt19937_64& random, std::size_t size, int letters) {
    std::string text(size, 'a');
    for (char& letter : text)
        letter = static_cast<char>('a' + static_cast<int>(random() % static_cast<unsigned>(letters)));
    return text;
}

std::vector<SearchKernel> kernels() {
    std::vector<SearchKernel> result = {SearchKernel::portable};
    if (best_search_kernel() == SearchKernel::avx2)
        result.push_back(SearchKernel::avx2);
    return result;
}

TEST(TextSearch, KernelsFindWhatANaiveSearchFinds) {
    std::mt19937_64 random(RandomSeed());
    for (int round = 0; round < 3000; ++round) {
        const std::string text = random_text(random, random() % 400, 2 + round % 4);
        const std::string needle = random_text(random, 1 + random() % (round % 8 + 1), 2 + round % 4);
        for (const SearchKernel kernel : kernels())
            ASSERT_EQ(found(kernel, text, needle), naive(text, needle)) << text << " / " << needle;
    }
}

TEST(TextSearch, ResumesWhereTheCallerSays) {
    for (const SearchKernel kernel : kernels()) {
        const std::string text(300, 'x');
        std::vector<std::size_t> hits;
        search(kernel, text.data(), text.size(), "x", [&](std::size_t position) {
            hits.push_back(position);
            return position + 70;
        });
        EXPECT_EQ(hits, (std::vector<std::size_t>{0, 70, 140, 210, 280}));
    }
}

TEST(TextColumn, AgreesWithAMapUnderRandomChanges) {
    std::mt19937_64 random(RandomSeed());
    TextColumn column;
    std::map<RowNumber, std::string> model;
    constexpr RowNumber rows = 3000;
    for (int round = 0; round < 60000; ++round) {
        const auto row = static_cast<RowNumber>(random() % rows);
        if (random() % 4 == 0) {
            column.remove(row);
            model.erase(row);
        } else {
            const std::string text = random_text(random, random() % 30, random() % 2 == 0 ? 1 : 5);
            column.set(row, text);
            model[row] = text;
        }
        if (round % 3000 != 0)
            continue;
        for (const std::string needle : {"a", "ab", "aaa", "cab", "zz"}) {
            std::vector<RowNumber> expected;
            for (const auto& [number, text] : model) {
                if (text.find(needle) != std::string::npos)
                    expected.push_back(number);
            }
            for (const SearchKernel kernel : kernels()) {
                RowSet set(rows);
                column.find_containing(needle, kernel, set);
                ASSERT_EQ(set.rows(), expected) << needle;
            }
        }
        for (RowNumber number = 0; number < rows; ++number) {
            ASSERT_EQ(column.holds(number), model.contains(number));
            ASSERT_EQ(column.text(number), model.contains(number) ? model[number] : std::string());
        }
    }
}

TEST(TextColumn, ManyHitsAreFoundValueByValue) {
    std::mt19937_64 random(RandomSeed());
    TextColumn column;
    constexpr RowNumber rows = 30000;
    std::vector<std::string> model;
    for (RowNumber row = 0; row < rows; ++row) {
        // The middle third has few hits, so that the search changes its way back and forth.
        const int letters = row / 10000 == 1 ? 20 : 2;
        model.push_back(row % 7 == 6 ? model[row - 5] : random_text(random, random() % 150, letters));
        column.set(row, model.back());
    }
    for (const std::string needle : {"a", "ab", "aab", "babab", "abbabaab"}) {
        std::vector<RowNumber> expected;
        for (RowNumber row = 0; row < rows; ++row) {
            if (model[row].find(needle) != std::string::npos)
                expected.push_back(row);
        }
        for (const SearchKernel kernel : kernels()) {
            RowSet set(rows);
            column.find_containing(needle, kernel, set);
            ASSERT_EQ(set.rows(), expected) << needle;
        }
    }
}

TEST(TextColumn, JoinedColumnsHoldBothRows) {
    TextColumn lower;
    TextColumn upper;
    for (RowNumber row = 0; row < 1000; ++row) {
        lower.set(row, "lower " + std::to_string(row / 3));
        upper.set(row + 1000, "upper " + std::to_string(row / 3));
    }
    lower.join(std::move(upper));
    EXPECT_EQ(lower.text(999), "lower 333");
    EXPECT_EQ(lower.text(1999), "upper 333");
    RowSet set(2000);
    lower.find_containing("pper 33", best_search_kernel(), set);
    EXPECT_EQ(set.size(), 13U); // three rows each of 33, 330, 331 and 332, one of 333
    lower.set(1500, "changed");
    EXPECT_EQ(lower.text(1500), "changed");
}

TEST(TextColumn, RowsOfOneValueAreAllTakenOut) {
    TextColumn column;
    for (RowNumber row = 0; row < 100000; ++row)
        column.set(row, "same");
    for (RowNumber row = 0; row < 100000; ++row)
        column.remove(row);
    RowSet set(100000);
    column.find_containing("am", best_search_kernel(), set);
    EXPECT_EQ(set.size(), 0U);
}

} // namespace
} // namespace host
