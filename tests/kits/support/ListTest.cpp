#include <List.h>

#include <gtest/gtest.h>
#include <vector>

namespace {

int sItems[] = {0, 1, 2, 3, 4, 5, 6, 7};

void* item(int number) {
    return &sItems[number];
}

std::vector<int> numbers(const BList& list) {
    std::vector<int> found;
    for (int32 index = 0; index < list.CountItems(); index++)
        found.push_back(*static_cast<int*>(list.ItemAt(index)));
    return found;
}

BList list_of(const std::vector<int>& wanted) {
    BList list;
    for (const int number : wanted)
        list.AddItem(item(number));
    return list;
}

using Numbers = std::vector<int>;

} // namespace

TEST(ListTest, ANewListIsEmpty) {
    const BList list;
    EXPECT_TRUE(list.IsEmpty());
    EXPECT_EQ(list.CountItems(), 0);
    EXPECT_EQ(list.FirstItem(), nullptr);
    EXPECT_EQ(list.LastItem(), nullptr);
    EXPECT_EQ(list.ItemAt(0), nullptr);
    EXPECT_EQ(list.Items(), nullptr);
}

TEST(ListTest, ItemsAreAddedAtTheEndOrBeforeAnIndex) {
    BList list = list_of({1, 2});
    EXPECT_TRUE(list.AddItem(item(0), 0));
    EXPECT_TRUE(list.AddItem(item(3), 3));
    EXPECT_FALSE(list.AddItem(item(4), 5));
    EXPECT_FALSE(list.AddItem(item(4), -1));
    EXPECT_EQ(numbers(list), (Numbers{0, 1, 2, 3}));
}

TEST(ListTest, AListIsAddedToAnotherAndToItself) {
    BList list = list_of({1, 2});
    const BList other = list_of({5, 6});
    EXPECT_TRUE(list.AddList(&other));
    EXPECT_TRUE(list.AddList(&other, 1));
    EXPECT_EQ(numbers(list), (Numbers{1, 5, 6, 2, 5, 6}));
    BList twice = list_of({1, 2});
    EXPECT_TRUE(twice.AddList(&twice, 1));
    EXPECT_EQ(numbers(twice), (Numbers{1, 1, 2, 2}));
    EXPECT_FALSE(list.AddList(nullptr));
    EXPECT_FALSE(list.AddList(&other, 7));
}

TEST(ListTest, RemovingAnswersWhatWasThere) {
    BList list = list_of({1, 2, 3, 2, 4});
    EXPECT_TRUE(list.RemoveItem(item(2)));
    EXPECT_EQ(numbers(list), (Numbers{1, 3, 2, 4}));
    EXPECT_EQ(list.RemoveItem(int32{1}), item(3));
    EXPECT_EQ(list.RemoveItem(int32{3}), nullptr);
    EXPECT_EQ(list.RemoveItem(int32{-1}), nullptr);
    EXPECT_FALSE(list.RemoveItem(item(7)));
    EXPECT_EQ(numbers(list), (Numbers{1, 2, 4}));
}

TEST(ListTest, ARangeIsRemovedWholeOrNotAtAll) {
    BList list = list_of({0, 1, 2, 3, 4});
    EXPECT_FALSE(list.RemoveItems(3, 3));
    EXPECT_FALSE(list.RemoveItems(-1, 2));
    EXPECT_FALSE(list.RemoveItems(2, -1));
    EXPECT_FALSE(list.RemoveItems(1, INT32_MAX));
    EXPECT_EQ(numbers(list), (Numbers{0, 1, 2, 3, 4}));
    EXPECT_TRUE(list.RemoveItems(1, 3));
    EXPECT_EQ(numbers(list), (Numbers{0, 4}));
}

TEST(ListTest, MovingShiftsTheItemsBetween) {
    BList list = list_of({0, 1, 2, 3, 4});
    EXPECT_TRUE(list.MoveItem(1, 3));
    EXPECT_EQ(numbers(list), (Numbers{0, 2, 3, 1, 4}));
    EXPECT_TRUE(list.MoveItem(4, 0));
    EXPECT_EQ(numbers(list), (Numbers{4, 0, 2, 3, 1}));
    EXPECT_FALSE(list.MoveItem(5, 0));
    EXPECT_FALSE(list.MoveItem(0, -1));
}

TEST(ListTest, SwappingAndReplacing) {
    BList list = list_of({0, 1, 2});
    EXPECT_TRUE(list.SwapItems(0, 2));
    EXPECT_TRUE(list.ReplaceItem(1, item(7)));
    EXPECT_FALSE(list.SwapItems(0, 3));
    EXPECT_FALSE(list.ReplaceItem(3, item(7)));
    EXPECT_EQ(numbers(list), (Numbers{2, 7, 0}));
}

TEST(ListTest, SortingHandsOutPointersToTheItemPointers) {
    BList list = list_of({3, 1, 2, 0});
    list.SortItems([](const void* first, const void* second) {
        return **static_cast<int* const*>(first) - **static_cast<int* const*>(second);
    });
    EXPECT_EQ(numbers(list), (Numbers{0, 1, 2, 3}));
}

TEST(ListTest, FindingItems) {
    const BList list = list_of({5, 6, 5});
    EXPECT_EQ(list.IndexOf(item(5)), 0);
    EXPECT_EQ(list.IndexOf(item(6)), 1);
    EXPECT_EQ(list.IndexOf(item(7)), -1);
    EXPECT_TRUE(list.HasItem(item(6)));
    EXPECT_FALSE(list.HasItem(item(0)));
    EXPECT_EQ(list.FirstItem(), item(5));
    EXPECT_EQ(list.LastItem(), item(5));
}

TEST(ListTest, DoForEachStopsWhenTheFunctionAnswersTrue) {
    BList list = list_of({1, 2, 3, 4});
    Numbers seen;
    list.DoForEach(
        [](void* visited, void* argument) {
            static_cast<Numbers*>(argument)->push_back(*static_cast<int*>(visited));
            return *static_cast<int*>(visited) == 3;
        },
        &seen);
    EXPECT_EQ(seen, (Numbers{1, 2, 3}));
}

TEST(ListTest, CopiesAreIndependent) {
    BList list = list_of({1, 2});
    BList copy(list);
    EXPECT_TRUE(copy == list);
    list.MakeEmpty();
    EXPECT_EQ(numbers(copy), (Numbers{1, 2}));
    EXPECT_TRUE(copy != list);
}
