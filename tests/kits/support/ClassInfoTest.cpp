#include <ClassInfo.h>

#include <gtest/gtest.h>

namespace {

struct Base {
    virtual ~Base() = default;
};

struct Derived : Base {};

struct Unrelated : Base {};

} // namespace

TEST(ClassInfoTest, TellsAnObjectsClass) {
    Derived derived;
    Base* const object = &derived;
    EXPECT_EQ(cast_as(object, Derived), &derived);
    EXPECT_EQ(cast_as(object, Unrelated), nullptr);
    EXPECT_TRUE(is_kind_of(object, Base));
    EXPECT_TRUE(is_kind_of(object, Derived));
    EXPECT_FALSE(is_kind_of(object, Unrelated));
    EXPECT_TRUE(is_instance_of(object, Derived));
    EXPECT_FALSE(is_instance_of(object, Base));
    Base* const nothing = nullptr;
    EXPECT_FALSE(is_kind_of(nothing, Base));
    EXPECT_FALSE(is_instance_of(nothing, Base));
}
