// The lines collected between BView::BeginLineArray() and EndLineArray().
#pragma once

#include <View.h>

struct BView::LineArray {
    struct Line {
        BPoint from;
        BPoint to;
        rgb_color color;
    };
    std::vector<Line> lines;
};
