#include "FocusOrder.h"

#include <View.h>

#include <algorithm>
#include <vector>

namespace {

struct Stop {
    BView* view;
    bool beginsGroup;
};

void Collect(const BView& view, std::vector<Stop>& stops, bool& groupBegins) {
    for (int32 i = 0; i < view.CountChildren(); ++i) {
        BView* const child = view.ChildAt(i);
        if (child->IsHidden(&view)) {
            continue;
        }
        groupBegins = groupBegins || (child->Flags() & B_NAVIGABLE_JUMP) != 0;
        if ((child->Flags() & B_NAVIGABLE) != 0) {
            stops.push_back({child, groupBegins || stops.empty()});
            groupBegins = false;
        }
        Collect(*child, stops, groupBegins);
    }
}

std::vector<Stop> StopsOf(const BView& root) {
    std::vector<Stop> stops;
    bool groupBegins = false;
    Collect(root, stops, groupBegins);
    return stops;
}

BView* Next(const std::vector<Stop>& stops, const BView* from, FocusDirection direction, bool groups) {
    const auto count = static_cast<int>(stops.size());
    if (count == 0) {
        return nullptr;
    }
    const auto found =
        std::find_if(stops.begin(), stops.end(), [from](const Stop& stop) { return stop.view == from; });
    const int step = direction == FocusDirection::forward ? 1 : -1;
    int at = static_cast<int>(found - stops.begin());
    if (found == stops.end()) {
        at = direction == FocusDirection::forward ? -1 : count;
    }
    for (int i = 0; i < count; ++i) {
        at = (at + step + count) % count;
        if (!groups || stops[static_cast<size_t>(at)].beginsGroup) {
            return stops[static_cast<size_t>(at)].view;
        }
    }
    return stops.front().view;
}

} // namespace

BView* NextFocus(const BView& root, BView* from, FocusDirection direction) {
    return Next(StopsOf(root), from, direction, false);
}

BView* NextFocusGroup(const BView& root, BView* from, FocusDirection direction) {
    return Next(StopsOf(root), from, direction, true);
}
