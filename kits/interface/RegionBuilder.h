// RegionBuilder: makes a region out of many horizontal runs of pixels.
#pragma once

#include <Region.h>

// Collects runs in any order, overlapping or not; Build() costs one sort however many there are.
class RegionBuilder {
  public:
    // Pixels left .. right of row y; nothing when left > right.
    void AddRun(int32 y, int32 left, int32 right);
    // The collected pixels as a region; the builder is empty afterwards.
    BRegion Build();

    // The two sets combined.
    static std::vector<clipping_rect> Union(const std::vector<clipping_rect>& a,
                                            const std::vector<clipping_rect>& b);
    static std::vector<clipping_rect> Intersection(const std::vector<clipping_rect>& a,
                                                   const std::vector<clipping_rect>& b);
    static std::vector<clipping_rect> Difference(const std::vector<clipping_rect>& a,
                                                 const std::vector<clipping_rect>& b);

  private:
    struct Run {
        int32 y;
        int32 left;
        int32 right;
    };
    std::vector<Run> mRuns;
};
