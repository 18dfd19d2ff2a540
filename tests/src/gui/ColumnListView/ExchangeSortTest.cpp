#include "gui/ColumnListView/ExchangeSort.h"

#include "support/random_seed.h"

#include <array>
#include <gtest/gtest.h>
#include <random>
#include <string>
#include <vector>

namespace {

typedef std::vector<std::string> Texts;

int CompareFirstLetters(const std::string& a, const std::string& b) {
    return a[0] - b[0];
}

TEST(ExchangeSort, SortsAndDoesNotKeepTheOrderOfEqualItems) {
    const struct {
        Texts given;
        Texts sorted;
    } cases[] = {
        {{}, {}},
        {{"1"}, {"1"}},
        {{"2", "1"}, {"1", "2"}},
        {{"1a", "1b", "1c"}, {"1a", "1b", "1c"}},
        {{"2a", "2b", "1"}, {"1", "2b", "2a"}},
        {{"2a", "1", "2b"}, {"1", "2a", "2b"}},
        {{"3a", "3b", "3c", "2", "1"}, {"1", "2", "3c", "3a", "3b"}},
        {{"4", "3", "2", "1"}, {"1", "2", "3", "4"}},
    };
    for (const auto& [given, sorted] : cases) {
        Texts items = given;
        ExchangeSort(items, CompareFirstLetters);
        EXPECT_EQ(items, sorted);
        items = given;
        SortLikeExchange(items, CompareFirstLetters);
        EXPECT_EQ(items, sorted);
    }
}

TEST(ExchangeSort, PutsFortyEqualItemsWhereTheSmallerOnesBehindThemStood) {
    // Two smaller ones come by: the first two of forty go to the end.
    std::vector<std::string> items;
    for (int i = 0; i < 40; ++i) {
        items.push_back("b" + std::to_string(i));
    }
    items.emplace_back("a");
    items.emplace_back("a'");
    SortLikeExchange(items, CompareFirstLetters);
    EXPECT_EQ(items[0], "a");
    EXPECT_EQ(items[1], "a'");
    EXPECT_EQ(items[2], "b2");
    EXPECT_EQ(items[39], "b39");
    EXPECT_EQ(items[40], "b0");
    EXPECT_EQ(items[41], "b1");
}

struct Row {
    std::array<int, 3> keys{};
    int number = 0;
    bool operator==(const Row& other) const = default;
};

// One to three keys, each ascending or descending, with few different values, so that there are many ties.
TEST(SortLikeExchange, AgreesWithTheExchangeSortInTenThousandRandomCases) {
    std::mt19937 random(RandomSeed());
    const auto below = [&](int limit) { return std::uniform_int_distribution<int>(0, limit - 1)(random); };
    for (int test = 0; test < 10000; ++test) {
        const int count = test % 1000 == 0 ? 1500 : below(120);
        const int values = 1 + below(test % 3 == 0 ? 4 : 40);
        const int keys = 1 + below(3);
        std::array<int, 3> directions{};
        for (int& direction : directions) {
            direction = below(2) == 0 ? 1 : -1;
        }
        std::vector<Row> rows(static_cast<size_t>(count));
        for (Row& row : rows) {
            for (int& key : row.keys) {
                key = below(values);
            }
            row.number = static_cast<int>(&row - rows.data());
        }
        const auto compare = [&](const Row& a, const Row& b) {
            int result = 0;
            for (size_t key = 0; key < static_cast<size_t>(keys) && result == 0; ++key) {
                result = directions[key] * (a.keys[key] - b.keys[key]);
            }
            return result;
        };
        std::vector<Row> expected = rows;
        ExchangeSort(expected, compare);
        SortLikeExchange(rows, compare);
        ASSERT_EQ(rows, expected) << "case " << test;
        // Once more: what is sorted stays as it is.
        SortLikeExchange(rows, compare);
        ASSERT_EQ(rows, expected) << "case " << test;
    }
}

std::vector<Row> RandomRows(int count, int values) {
    std::mt19937 random(RandomSeed());
    std::vector<Row> rows(static_cast<size_t>(count));
    for (Row& row : rows) {
        row.keys[0] = std::uniform_int_distribution<int>(0, values - 1)(random);
        row.number = static_cast<int>(&row - rows.data());
    }
    return rows;
}

TEST(SortLikeExchange, ComparisonsThatContradictThemselvesGetTheExchangeSort) {
    typedef int (*Compare)(const Row& a, const Row& b);
    const struct {
        const char* name;
        Compare compare;
    } cases[] = {
        {"a difference that wraps around",
         [](const Row& a, const Row& b) {
             const unsigned difference = (static_cast<unsigned>(a.keys[0]) - static_cast<unsigned>(b.keys[0]))
                                         << 22;
             return static_cast<int>(difference);
         }},
        {"rows of two kinds, of which those of different kinds compare equal",
         [](const Row& a, const Row& b) { return a.number % 2 == b.number % 2 ? a.keys[0] - b.keys[0] : 0; }},
        {"always greater", [](const Row& /*a*/, const Row& /*b*/) { return 1; }},
        {"paper, scissors, stone",
         [](const Row& a, const Row& b) { return (a.keys[0] - b.keys[0] + 3) % 3 == 1 ? 1 : 0; }},
    };
    for (const auto& [name, compare] : cases) {
        std::vector<Row> rows = RandomRows(800, 1000);
        std::vector<Row> expected = rows;
        ExchangeSort(expected, compare);
        SortLikeExchange(rows, compare);
        EXPECT_EQ(rows, expected) << name;
    }
}

TEST(SortLikeExchange, ComparesTensOfThousandsOfRowsOnlySomeTwentyTimesEach) {
    struct {
        int values;
        const char* name;
    } const cases[] = {{2, "nearly all equal"}, {300, "many ties"}, {1000000000, "hardly any tie"}};
    for (const auto& [values, name] : cases) {
        std::vector<Row> rows = RandomRows(50000, values);
        long comparisons = 0;
        SortLikeExchange(rows, [&](const Row& a, const Row& b) {
            ++comparisons;
            return a.keys[0] < b.keys[0] ? -1 : a.keys[0] > b.keys[0] ? 1 : 0;
        });
        // A merge sort takes 16 at most.
        EXPECT_LT(comparisons, 20 * 50000) << name;
    }
}

} // namespace
