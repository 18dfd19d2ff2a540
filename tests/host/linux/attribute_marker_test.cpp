#include "host/linux/attribute_marker.h"

#include <gtest/gtest.h>

namespace host {
namespace {

AttributeMarker example() {
    AttributeMarker marker;
    marker.type = 0x50494e47; // 'PING'
    marker.size = 0x0102030;
    for (std::size_t i = 0; i < marker.hash.size(); ++i)
        marker.hash[i] = static_cast<std::byte>(i);
    return marker;
}

TEST(AttributeMarker, HasTheDocumentedLayout) {
    const AttributeMarker::Bytes bytes = example().encode();

    const unsigned char head[20] = {0,   'b', 'l', 'b', 0, 0, 0, 1,    'P',  'I',
                                    'N', 'G', 0,   0,   0, 0, 0, 0x10, 0x20, 0x30};
    for (std::size_t i = 0; i < sizeof(head); ++i)
        EXPECT_EQ(std::to_integer<int>(bytes[i]), head[i]) << "byte " << i;
    for (std::size_t i = 20; i < 52; ++i)
        EXPECT_EQ(std::to_integer<std::size_t>(bytes[i]), i - 20) << "byte " << i;
}

TEST(AttributeMarker, ComesBackFromItsBytes) {
    EXPECT_EQ(AttributeMarker::decode(example().encode()), example());
}

TEST(AttributeMarker, RefusesEveryOtherLength) {
    const AttributeMarker::Bytes bytes = example().encode();
    for (std::size_t size = 0; size < bytes.size(); ++size)
        EXPECT_FALSE(AttributeMarker::decode({bytes.data(), size})) << size;
    std::vector<std::byte> longer(bytes.begin(), bytes.end());
    longer.push_back(std::byte{0});
    EXPECT_FALSE(AttributeMarker::decode(longer));
}

TEST(AttributeMarker, RefusesAnotherVersionAndAnotherType) {
    AttributeMarker::Bytes other_version = example().encode();
    other_version[7] = std::byte{2};
    EXPECT_FALSE(AttributeMarker::decode(other_version));

    AttributeMarker::Bytes plain = example().encode();
    plain[0] = std::byte{'C'};
    EXPECT_FALSE(AttributeMarker::decode(plain));
}

TEST(AttributeMarker, RefusesASizeThatNoValueHas) {
    AttributeMarker::Bytes bytes = example().encode();
    bytes[12] = std::byte{0x7f};
    EXPECT_FALSE(AttributeMarker::decode(bytes));
    bytes[12] = std::byte{0};
    bytes[16] = std::byte{0x10};
    bytes[19] = std::byte{1};
    EXPECT_FALSE(AttributeMarker::decode(bytes)); // 268 435 456 and something
}

} // namespace
} // namespace host
