// Where columns, and the cells of rows in them, lie. Draws nothing and needs no window.
#pragma once

#include <SupportDefs.h>

class BList;
class CLVColumn;

// Pixels that a row's expander cell grows, and the cells that it pushes move, for each outline level.
constexpr float kOutlineIndent = 20.0F;
// Where lists have no expander: further right than any cell.
constexpr float kNoPushLimit = 100000.0F;

// The left and right edges of a cell, both inside it; empty when right < left.
struct CellSpan {
    float left = 0;
    float right = -1;

    bool IsEmpty() const { return right < left; }
    float Width() const { return right - left; }
    bool operator==(const CellSpan& other) const = default;
};

// Puts the shown columns of a display order (CLVColumn pointers) beside each other, from 0 on, one pixel
// between them counting to neither width, and finds out which of them the expander pushes: the first shown
// one behind it, and further ones as long as each passes the push on. Answers the right edge of the last, 0
// when none is shown.
float LayOutColumns(const BList& displayOrder);

// No cell that is pushed reaches further right than the last column in the display order that is the expander
// or pushed. `otherwise` when there is none.
float PushLimit(const BList& displayOrder, float otherwise);

// How far the cells of a row of this level are moved in the column: 0 in those that have nothing to do with
// the expander.
float ExpanderShiftOf(const CLVColumn& column, uint32 outlineLevel);

// A row's cell in a shown column: the expander's right edge grows by `shift`, a pushed column moves by it,
// and neither passes the limit where there is a shift.
CellSpan SpanOfCell(const CLVColumn& column, float shift, float pushLimit);

// How wide a cell is in a column of this width, hidden or not; never below 0.
float WidthOfCell(const CLVColumn& column, float columnWidth, float shift, float pushLimit);
