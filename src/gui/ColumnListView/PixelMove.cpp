#include "gui/ColumnListView/PixelMove.h"

#include <algorithm>
#include <cmath>

namespace {

BRect Strip(BRect bounds, float left, float right) {
    return BRect(std::max(left, bounds.left), bounds.top, std::min(right, bounds.right), bounds.bottom);
}

bool IsWhole(float value) {
    return value == std::floor(value);
}

} // namespace

PixelMove PixelMoveFor(BRect bounds, float oldEnd, float growth) {
    const float newEnd = oldEnd + growth;
    const float changedFrom = std::min(oldEnd, newEnd) + 1;
    PixelMove move;
    const float last = bounds.right - 1;
    const float left = std::max({bounds.left, bounds.left + growth, newEnd + 1});
    const float right = std::min(last, last + growth);
    if (left > right || !IsWhole(oldEnd) || !IsWhole(growth)) {
        move.exposed = Strip(bounds, std::floor(changedFrom), bounds.right);
        return move;
    }
    move.target = Strip(bounds, left, right);
    move.source = move.target.OffsetByCopy(-growth, 0);
    if (growth > 0) {
        move.exposed = Strip(bounds, changedFrom, left - 1);
        move.rightEdge = Strip(bounds, bounds.right, bounds.right);
    } else {
        move.exposed = Strip(bounds, right + 1, bounds.right);
    }
    return move;
}
