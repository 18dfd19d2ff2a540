#include <Flattenable.h>

#include <gtest/gtest.h>

namespace {

class Plain : public BFlattenable {
  public:
    bool IsFixedSize() const override { return true; }
    type_code TypeCode() const override { return 'plan'; }
    ssize_t FlattenedSize() const override { return 0; }
    status_t Flatten(void*, ssize_t) const override { return B_OK; }
    status_t Unflatten(type_code code, const void*, ssize_t) override {
        return AllowsTypeCode(code) ? B_OK : B_BAD_TYPE;
    }
};

} // namespace

TEST(FlattenableTest, AllowsItsOwnTypeAlone) {
    Plain plain;
    EXPECT_TRUE(plain.AllowsTypeCode('plan'));
    EXPECT_FALSE(plain.AllowsTypeCode('plna'));
    EXPECT_EQ(plain.Unflatten('plna', nullptr, 0), B_BAD_TYPE);
}
