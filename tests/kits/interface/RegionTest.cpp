#include <Region.h>

#include <cstdlib>
#include <gtest/gtest.h>
#include <limits>
#include <random>

namespace {

std::string Print(const BRegion& region) {
    std::string text;
    for (const clipping_rect& rect : region.Rects()) {
        text += "(" + std::to_string(rect.left) + "," + std::to_string(rect.top) + "," +
                std::to_string(rect.right) + "," + std::to_string(rect.bottom) + ")";
    }
    return text;
}

TEST(Region, TheDefaultOneIsEmpty) {
    const BRegion region;
    EXPECT_EQ(region.CountRects(), 0);
    EXPECT_FALSE(region.Frame().IsValid());
    EXPECT_FALSE(region.RectAt(0).IsValid());
    EXPECT_FALSE(region.Contains(0, 0));
}

TEST(Region, EdgesBelongToARectangle) {
    const BRegion region(BRect(2, 3, 4, 5));
    EXPECT_TRUE(region.Contains(2, 3));
    EXPECT_TRUE(region.Contains(4, 5));
    EXPECT_FALSE(region.Contains(5, 5));
    EXPECT_TRUE(region.Contains(BPoint(4.5F, 5.0F))) << "still on pixel 4";
    EXPECT_TRUE(region.Intersects(BRect(4, 5, 9, 9)));
    EXPECT_FALSE(region.Intersects(BRect(5, 5, 9, 9)));
}

TEST(Region, OverlappingRectanglesSplitIntoBands) {
    BRegion region(BRect(0, 0, 9, 9));
    region.Include(BRect(5, 5, 14, 14));
    EXPECT_EQ(Print(region), "(0,0,9,4)(0,5,14,9)(5,10,14,14)");
    EXPECT_EQ(region.Frame(), BRect(0, 0, 14, 14));
}

TEST(Region, NeighboursJoinWhateverTheOrder) {
    BRegion region(BRect(0, 0, 4, 4));
    region.Include(BRect(5, 0, 9, 4));
    region.Include(BRect(0, 5, 9, 9));
    EXPECT_EQ(Print(region), "(0,0,9,9)");
    BRegion other(BRect(0, 5, 9, 9));
    other.Include(BRect(5, 0, 9, 4));
    other.Include(BRect(0, 0, 4, 4));
    EXPECT_EQ(region, other);
}

TEST(Region, ExcludingTheMiddleLeavesAFrame) {
    BRegion region(BRect(0, 0, 9, 9));
    region.Exclude(BRect(3, 3, 6, 6));
    EXPECT_EQ(Print(region), "(0,0,9,2)(0,3,2,6)(7,3,9,6)(0,7,9,9)");
    BRegion hole(BRect(3, 3, 6, 6));
    region.Include(&hole);
    EXPECT_EQ(Print(region), "(0,0,9,9)");
}

TEST(Region, IntersectionOfRegionsKeepsWhatBothHave) {
    BRegion a(BRect(0, 0, 9, 0));
    a.Include(BRect(0, 4, 9, 4));
    BRegion b(BRect(2, 0, 3, 9));
    b.Include(BRect(6, 0, 7, 9));
    a.IntersectWith(&b);
    EXPECT_EQ(Print(a), "(2,0,3,0)(6,0,7,0)(2,4,3,4)(6,4,7,4)");
}

TEST(Region, OneRectangleCutsOffWhatLiesBeyondIt) {
    struct Case {
        clipping_rect limit;
        const char* left;
    };
    const Case cases[] = {
        {{0, 0, 9, 4}, "(0,0,9,0)(3,4,5,4)"},
        {{-5, -5, 50, 50}, "(0,0,9,0)(3,4,5,4)"},
        {{1, 0, 9, 4}, "(1,0,9,0)(3,4,5,4)"},
        {{0, 1, 9, 4}, "(3,4,5,4)"},
        {{0, 0, 8, 4}, "(0,0,8,0)(3,4,5,4)"},
        {{0, 0, 9, 3}, "(0,0,9,0)"},
        {{20, 20, 29, 29}, ""},
    };
    for (const Case& each : cases) {
        BRegion region(BRect(0, 0, 9, 0));
        region.Include(BRect(3, 4, 5, 4));
        const BRegion limit(each.limit);
        region.IntersectWith(&limit);
        EXPECT_EQ(Print(region), each.left) << Print(limit);
    }
    BRegion nothing;
    const BRegion limit(BRect(0, 0, 9, 9));
    nothing.IntersectWith(&limit);
    EXPECT_TRUE(nothing.IsEmpty());
}

TEST(Region, OffsetMovesEverything) {
    BRegion region(BRect(0, 0, 9, 9));
    region.Exclude(BRect(3, 3, 6, 6));
    region.OffsetBy(10, -5);
    EXPECT_EQ(region.Frame(), BRect(10, -5, 19, 4));
    EXPECT_FALSE(region.Contains(13, -2));
    EXPECT_TRUE(region.Contains(10, -5));
}

TEST(Region, FractionsAreRoundedOutwards) {
    EXPECT_EQ(Print(BRegion(BRect(0.5F, -0.5F, 2.5F, 3.0F))), "(0,-1,3,3)");
}

TEST(Region, RectanglesThatAreNotValidCountAsEmpty) {
    const float nan = std::numeric_limits<float>::quiet_NaN();
    const float infinite = std::numeric_limits<float>::infinity();
    EXPECT_TRUE(BRegion(BRect(5, 0, 4, 9)).IsEmpty());
    EXPECT_TRUE(BRegion(BRect(nan, 0, 4, 9)).IsEmpty());
    EXPECT_TRUE(BRegion(BRect(0, 0, 4, nan)).IsEmpty());
    EXPECT_EQ(Print(BRegion(BRect(-infinite, 0, infinite, 1))), "(-1073741824,0,1073741824,1)");
    BRegion moved(BRect(0, 0, 1e20F, 0));
    moved.OffsetBy(std::numeric_limits<int32>::max(), std::numeric_limits<int32>::min());
    EXPECT_EQ(moved.CountRects(), 1);
    BRegion region(BRect(0, 0, 9, 9));
    region.Include(BRect());
    region.Exclude(BRect());
    EXPECT_EQ(Print(region), "(0,0,9,9)");
}

// The same sets as plain bitmaps, pixel by pixel.
class PixelSet {
  public:
    static constexpr int32 kSide = 24;
    bool pixels[kSide][kSide] = {};

    void Apply(const clipping_rect& rect, bool value) {
        for (int32 y = rect.top; y <= rect.bottom; ++y) {
            for (int32 x = rect.left; x <= rect.right; ++x) {
                pixels[y][x] = value;
            }
        }
    }
};

void ExpectCanonical(const BRegion& region) {
    const auto& rects = region.Rects();
    for (size_t i = 0; i < rects.size(); ++i) {
        ASSERT_TRUE(rects[i].IsValid());
        if (i > 0 && rects[i].top == rects[i - 1].top) {
            ASSERT_EQ(rects[i].bottom, rects[i - 1].bottom);
            ASSERT_GT(rects[i].left, rects[i - 1].right + 1);
        } else if (i > 0) {
            ASSERT_GT(rects[i].top, rects[i - 1].bottom);
        }
    }
}

TEST(Region, RandomOperationsAgreeWithPixelSets) {
    const char* const given = std::getenv("QUIRNEL_TEST_SEED");
    const unsigned seed = given != nullptr ? static_cast<unsigned>(std::atoi(given)) : std::random_device{}();
    std::cout << "seed " << seed << "\n";
    std::mt19937 random(seed);
    const auto number = [&](int32 below) {
        return static_cast<int32>(random() % static_cast<unsigned>(below));
    };
    for (int round = 0; round < 200; ++round) {
        BRegion region;
        PixelSet expected;
        for (int step = 0; step < 12; ++step) {
            const int32 left = number(PixelSet::kSide);
            const int32 top = number(PixelSet::kSide);
            const clipping_rect rect = {left, top, left + number(PixelSet::kSide - left),
                                        top + number(PixelSet::kSide - top)};
            const int32 kind = number(5);
            if (kind < 3) {
                region.Include(rect);
                expected.Apply(rect, true);
            } else if (kind == 3) {
                region.Exclude(rect);
                expected.Apply(rect, false);
            } else {
                BRegion other(BRect(0, 0, PixelSet::kSide, PixelSet::kSide));
                other.Exclude(rect);
                region.IntersectWith(&other);
                expected.Apply(rect, false);
            }
            ExpectCanonical(region);
        }
        BRegion rebuilt;
        for (int32 y = 0; y < PixelSet::kSide; ++y) {
            for (int32 x = 0; x < PixelSet::kSide; ++x) {
                ASSERT_EQ(region.Contains(x, y), expected.pixels[y][x]) << "round " << round;
                if (expected.pixels[y][x]) {
                    rebuilt.Include(clipping_rect{x, y, x, y});
                }
            }
        }
        ASSERT_EQ(region, rebuilt) << "equal sets have equal lists";
    }
}

} // namespace
