#include <AppDefs.h>
#include <PropertyInfo.h>

#include <gtest/gtest.h>

namespace {

property_info sProperties[] = {
    {"Volume",
     {B_GET_PROPERTY, B_SET_PROPERTY, 0},
     {B_DIRECT_SPECIFIER, 0},
     "the volume",
     11,
     {B_FLOAT_TYPE}},
    {"Track", {B_GET_PROPERTY, 0}, {B_INDEX_SPECIFIER, B_NAME_SPECIFIER, 0}, "a track", 22, {}},
    {"Track", {B_COUNT_PROPERTIES, 0}, {B_DIRECT_SPECIFIER, 0}, "the number of tracks", 33, {}},
    {"Anything", {0}, {0}, nullptr, 44, {}},
    {},
};

} // namespace

TEST(PropertyInfoTest, APropertyMatchesByNameFormAndCommand) {
    const BPropertyInfo info(sProperties);
    EXPECT_EQ(info.CountProperties(), 4);
    EXPECT_EQ(info.Properties(), sProperties);
    BMessage get(B_GET_PROPERTY);
    BMessage count(B_COUNT_PROPERTIES);
    uint32 extra = 0;
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_DIRECT_SPECIFIER, "Volume", &extra), 0);
    EXPECT_EQ(extra, 11U);
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_NAME_SPECIFIER, "Track"), 1);
    EXPECT_EQ(info.FindMatch(&count, 0, nullptr, B_DIRECT_SPECIFIER, "Track", &extra), 2);
    EXPECT_EQ(extra, 33U);
    EXPECT_EQ(info.FindMatch(&count, 0, nullptr, B_DIRECT_SPECIFIER, "Volume"), B_ERROR);
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_INDEX_SPECIFIER, "Volume"), B_ERROR);
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_DIRECT_SPECIFIER, "Missing"), B_ERROR);
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_RANGE_SPECIFIER, "Anything"), 3);
}

TEST(PropertyInfoTest, CommandsCountAtTheLastSpecifierOnly) {
    const BPropertyInfo info(sProperties);
    BMessage count(B_COUNT_PROPERTIES);
    EXPECT_EQ(info.FindMatch(&count, 0, nullptr, B_INDEX_SPECIFIER, "Track"), B_ERROR);
    EXPECT_EQ(info.FindMatch(&count, 1, nullptr, B_INDEX_SPECIFIER, "Track"), 1);
}

TEST(PropertyInfoTest, NoTableMatchesNothing) {
    const BPropertyInfo none;
    BMessage get(B_GET_PROPERTY);
    EXPECT_EQ(none.CountProperties(), 0);
    EXPECT_EQ(none.FindMatch(&get, 0, nullptr, B_DIRECT_SPECIFIER, "Volume"), B_ERROR);
    const BPropertyInfo info(sProperties);
    EXPECT_EQ(info.FindMatch(nullptr, 0, nullptr, B_DIRECT_SPECIFIER, "Volume"), B_ERROR);
    EXPECT_EQ(info.FindMatch(&get, 0, nullptr, B_DIRECT_SPECIFIER, nullptr), B_ERROR);
}

TEST(PropertyInfoTest, ATableTravelsInAMessageAsItsFlattenedForm) {
    const BPropertyInfo info(sProperties);
    BMessage message;
    ASSERT_EQ(message.AddFlat("messages", &info), B_OK);
    type_code type = 0;
    ASSERT_EQ(message.GetInfo("messages", &type), B_OK);
    EXPECT_EQ(type, type_code{B_PROPERTY_INFO_TYPE});
    char small[4];
    EXPECT_NE(info.Flatten(small, sizeof(small)), B_OK);
    BPropertyInfo back;
    EXPECT_EQ(message.FindFlat("messages", &back), B_NOT_ALLOWED);
}
