#include <EntryRef.h>

#include <gtest/gtest.h>
#include <string>
#include <utility>

TEST(EntryRefTest, ADefaultRefNamesNothing) {
    const entry_ref ref;
    EXPECT_EQ(ref.device, static_cast<dev_t>(-1));
    EXPECT_EQ(ref.directory, static_cast<ino_t>(-1));
    EXPECT_EQ(ref.name, nullptr);
    EXPECT_TRUE(ref == entry_ref());
}

TEST(EntryRefTest, OwnsACopyOfItsName) {
    std::string name = "song.mp3";
    const entry_ref ref(3, 4, name.c_str());
    name[0] = 'X';
    EXPECT_STREQ(ref.name, "song.mp3");
    EXPECT_EQ(ref.device, 3U);
    EXPECT_EQ(ref.directory, 4U);
}

TEST(EntryRefTest, CopiesAreIndependent) {
    entry_ref ref(1, 2, "a");
    const entry_ref copy(ref);
    entry_ref assigned(9, 9, "old");
    assigned = ref;
    ref.set_name("changed");
    EXPECT_STREQ(copy.name, "a");
    EXPECT_STREQ(assigned.name, "a");
    EXPECT_EQ(assigned.device, 1U);
    const entry_ref& itself = assigned;
    assigned = itself;
    EXPECT_STREQ(assigned.name, "a");
}

TEST(EntryRefTest, MovingTakesTheNameAlong) {
    entry_ref ref(1, 2, "moved");
    entry_ref target(std::move(ref));
    EXPECT_STREQ(target.name, "moved");
    EXPECT_EQ(target.directory, 2U);
    entry_ref assigned(9, 9, "old");
    assigned = std::move(target);
    EXPECT_STREQ(assigned.name, "moved");
    EXPECT_EQ(assigned.device, 1U);
}

TEST(EntryRefTest, SettingItsOwnNameOrNone) {
    entry_ref ref(1, 2, "abc");
    EXPECT_EQ(ref.set_name(ref.name + 1), B_OK);
    EXPECT_STREQ(ref.name, "bc");
    EXPECT_EQ(ref.set_name(nullptr), B_OK);
    EXPECT_EQ(ref.name, nullptr);
}

TEST(EntryRefTest, EveryPartCountsWhenComparing) {
    const entry_ref ref(1, 2, "a");
    EXPECT_TRUE(ref == entry_ref(1, 2, "a"));
    EXPECT_TRUE(ref != entry_ref(2, 2, "a"));
    EXPECT_TRUE(ref != entry_ref(1, 3, "a"));
    EXPECT_TRUE(ref != entry_ref(1, 2, "A"));
    EXPECT_TRUE(ref != entry_ref(1, 2, nullptr));
    EXPECT_TRUE(entry_ref(1, 2, nullptr) != ref);
    EXPECT_TRUE(entry_ref(1, 2, nullptr) == entry_ref(1, 2, nullptr));
}

TEST(EntryRefTest, TheWholeWidthOfThisHostsNumbersIsKept) {
    const entry_ref ref(0x123456789ABCDEF0U, 0xFEDCBA9876543210U, "x");
    EXPECT_EQ(ref.device, 0x123456789ABCDEF0U);
    EXPECT_EQ(ref.directory, 0xFEDCBA9876543210U);
}

TEST(NodeRefTest, ComparesDeviceThenNode) {
    EXPECT_TRUE(node_ref(1, 2) == node_ref(1, 2));
    EXPECT_TRUE(node_ref(1, 2) != node_ref(1, 3));
    EXPECT_TRUE(node_ref(1, 9) < node_ref(2, 0));
    EXPECT_FALSE(node_ref(2, 0) < node_ref(1, 9));
    EXPECT_TRUE(node_ref(1, 1) < node_ref(1, 2));
    EXPECT_EQ(node_ref().node, static_cast<ino_t>(-1));
}
