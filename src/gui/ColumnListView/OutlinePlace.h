// OutlinePlace: what a row remembers of its place in the list that it is in.
#pragma once

#include <SupportDefs.h>

#include <memory>

struct OutlineBlock;

// Written and read by the lists; means nothing to anybody else.
struct OutlinePlace {
    OutlinePlace() = default;
    // A copy of a row is in no list.
    OutlinePlace(const OutlinePlace& /*other*/) {}
    OutlinePlace& operator=(const OutlinePlace& /*other*/) { return *this; }

    // Gone with the list, or with what was in it.
    std::weak_ptr<OutlineBlock> block;
    // Where sorting has put the row, while it reorders.
    int32 rank = 0;
};
