// OutlinePlace: what a row remembers of its place in the list that it is in.
#pragma once

#include <SupportDefs.h>

struct OutlineBlock;

// Written and read by OutlineRows; means nothing to anybody else.
struct OutlinePlace {
    OutlineBlock* block = nullptr;
    // Which content of which list `block` belongs to; 0 for none.
    uint64 content = 0;
    // Where sorting has put the row, while it reorders.
    int32 rank = 0;
    bool visible = false;
};
