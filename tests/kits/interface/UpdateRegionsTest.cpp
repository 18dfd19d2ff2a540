// What of a window has to be drawn again, and what has been drawn.
#include "UpdateRegions.h"

#include <gtest/gtest.h>

TEST(UpdateRegions, DamageIsHandedOverOnce) {
    UpdateRegions regions;
    EXPECT_FALSE(regions.IsDamaged());
    regions.Damage(BRegion(clipping_rect{0, 0, 9, 9}));
    regions.Damage(BRegion(clipping_rect{5, 0, 19, 9}));
    EXPECT_EQ(regions.TakeDamage(), BRegion(clipping_rect{0, 0, 19, 9}));
    EXPECT_FALSE(regions.IsDamaged());
}

TEST(UpdateRegions, ScrollingDamagesWhatCameIntoView) {
    UpdateRegions regions;
    const BRegion moved = regions.Scrolled(BRegion(clipping_rect{10, 10, 109, 109}), 0, -20);
    EXPECT_EQ(moved, BRegion(clipping_rect{10, 10, 109, 89}));
    EXPECT_EQ(regions.Damaged(), BRegion(clipping_rect{10, 90, 109, 109}));
}

TEST(UpdateRegions, DamageMovesWithTheContents) {
    UpdateRegions regions;
    regions.Damage(BRegion(clipping_rect{10, 40, 109, 49}));
    regions.Scrolled(BRegion(clipping_rect{10, 10, 109, 109}), 0, -20);
    BRegion expected(clipping_rect{10, 20, 109, 29});
    expected.Include(clipping_rect{10, 90, 109, 109});
    EXPECT_EQ(regions.Damaged(), expected);
}

TEST(UpdateRegions, DamageBesideTheScrolledAreaStays) {
    UpdateRegions regions;
    regions.Damage(BRegion(clipping_rect{200, 0, 209, 9}));
    regions.Scrolled(BRegion(clipping_rect{0, 0, 99, 99}), 5, 0);
    EXPECT_TRUE(regions.Damaged().Contains(200, 0));
    EXPECT_TRUE(regions.Damaged().Contains(4, 50));
    EXPECT_FALSE(regions.Damaged().Contains(5, 50));
}

TEST(UpdateRegions, ScrollingFurtherThanTheAreaDamagesAllOfIt) {
    UpdateRegions regions;
    const BRegion moved = regions.Scrolled(BRegion(clipping_rect{0, 0, 99, 99}), 0, 300);
    EXPECT_TRUE(moved.IsEmpty());
    EXPECT_EQ(regions.Damaged(), BRegion(clipping_rect{0, 0, 99, 99}));
}

TEST(UpdateRegions, ManyDrawnPiecesBecomeFewThatCoverThemAll) {
    UpdateRegions regions;
    for (int32 i = 0; i < 1000; ++i) {
        regions.Drawn({i * 3, i, i * 3 + 1, i});
    }
    const std::vector<clipping_rect> drawn = regions.TakeDrawn();
    EXPECT_LE(drawn.size(), 24U);
    BRegion all;
    for (const clipping_rect& rect : drawn) {
        all.Include(rect);
    }
    EXPECT_TRUE(all.Contains(0, 0));
    EXPECT_TRUE(all.Contains(2998, 999));
    EXPECT_FALSE(regions.HasDrawn());
}
