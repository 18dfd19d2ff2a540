#include "host/linux/attribute_scanner.h"

#include "support/attribute_file.h"
#include <gtest/gtest.h>
#include <map>

namespace host {
namespace {

using test::noise;
using test::OpenFile;

struct Seen {
    std::uint32_t type = 0;
    std::string bytes;
    bool complete = false;
    bool operator==(const Seen&) const = default;
};

std::map<std::string, Seen> scan(AttributeScanner& scanner, const OpenFile& file) {
    std::map<std::string, Seen> seen;
    const Status status = scanner.scan(file.file(), [&](const ScannedAttribute& attribute) {
        seen[std::string(attribute.name)] = {
            attribute.type,
            std::string(reinterpret_cast<const char*>(attribute.bytes.data()), attribute.bytes.size()),
            attribute.complete};
    });
    EXPECT_TRUE(status.ok());
    return seen;
}

class AttributeScannerTest : public testing::Test {
  protected:
    test::TemporaryEnvironment environment_;
    OpenFile file_{environment_.volume() + "/file"};
    AttributeScanner scanner_{255};
};

TEST_F(AttributeScannerTest, HandsOutEveryAttributeOfOurs) {
    ASSERT_TRUE(file_.write("Artist", "Ella").ok());
    ASSERT_TRUE(file_.write("Empty", "").ok());
    ::setxattr(file_.path().c_str(), "user.foreign", "x", 1, 0);

    const std::map<std::string, Seen> expected = {{"Artist", {0x43535452, "Ella", true}},
                                                  {"Empty", {0x43535452, "", true}}};
    EXPECT_EQ(scan(scanner_, file_), expected);
}

TEST_F(AttributeScannerTest, LeavesOutTheBytesOfLargeValues) {
    ASSERT_TRUE(file_.write("fits", std::string(255, 'f')).ok());
    ASSERT_TRUE(file_.write("large", std::string(256, 'l')).ok());
    ASSERT_TRUE(file_.write("spilled", noise(70'000, 1), test::kNumber).ok());

    const auto seen = scan(scanner_, file_);
    EXPECT_TRUE(seen.at("fits").complete);
    EXPECT_FALSE(seen.at("large").complete);
    EXPECT_FALSE(seen.at("spilled").complete);
    EXPECT_EQ(seen.at("spilled").type, test::kNumber);
    EXPECT_EQ(seen.at("spilled").bytes, "");
}

TEST_F(AttributeScannerTest, ReadsSpilledValuesThatItTakes) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("spilled", value).ok());
    AttributeScanner scanner(100'000);

    EXPECT_EQ(scan(scanner, file_).at("spilled"), (Seen{test::kText, value, true}));
}

TEST_F(AttributeScannerTest, TakesMoreNamesThanItsFirstBufferHolds) {
    for (int i = 0; i < 20; ++i)
        ASSERT_TRUE(file_.write(std::string(100, 'n') + std::to_string(i), "v").ok());

    EXPECT_EQ(scan(scanner_, file_).size(), 20u);
}

TEST_F(AttributeScannerTest, PassesOverMalformedValues) {
    ::setxattr(file_.path().c_str(), "user.be.short", "abc", 3, 0);
    ::setxattr(file_.path().c_str(), "user.be.broken", "\0blbxxxx", 8, 0);
    ASSERT_TRUE(file_.write("good", "v").ok());

    EXPECT_EQ(scan(scanner_, file_).size(), 1u);
}

} // namespace
} // namespace host
