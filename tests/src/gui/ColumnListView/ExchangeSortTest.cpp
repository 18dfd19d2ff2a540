#include "gui/ColumnListView/ExchangeSort.h"

#include <gtest/gtest.h>
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
    }
}

} // namespace
