// The cells of a header and the lines around them. Draws nothing and needs no window.
#pragma once

#include <GraphicsDefs.h>
#include <Rect.h>

#include <vector>

class BList;
class CLVColumn;

constexpr rgb_color kHeaderLight = {255, 255, 255, 255};
constexpr rgb_color kHeaderShadow = {152, 152, 152, 255};
// What the mouse holds.
constexpr rgb_color kHeaderBlue = {0, 0, 229, 255};

struct HeaderLine {
    BPoint from;
    BPoint to;
    rgb_color color;
};

// A shown column's cell, both edges inside it.
struct HeaderCell {
    CLVColumn* column = nullptr;
    BRect frame;
    // Drawn as one with the next, or the previous, shown cell.
    bool merged = false;
    bool merged_with_left = false;
};

// From left to right, as high as `bounds`.
std::vector<HeaderCell> HeaderCellsOf(const BList& displayOrder, BRect bounds);
// In the order in which they are drawn. `resizing`: the mouse holds the cell's right border.
std::vector<HeaderLine> LinesOf(const HeaderCell& cell, bool resizing);
// Of what is left of the header behind its last cell, which is null when no column is shown; none where no
// space is left.
std::vector<HeaderLine> LinesBehind(const HeaderCell* last, BRect bounds);
