// FocusOrder: the way of the keyboard focus through a window's views.
#pragma once

class BView;

// Views with B_NAVIGABLE that are shown, in the order of the tree: a view before its children, children in
// their order. The way is a ring.
enum class FocusDirection { forward, backward };

// The next view after `from` (null: from the beginning or end); `from` itself where there is no other; null
// where there is none at all.
BView* NextFocus(const BView& root, BView* from, FocusDirection direction);
// The first navigable view of the next group: one that follows a view with B_NAVIGABLE_JUMP, or such a view
// itself.
BView* NextFocusGroup(const BView& root, BView* from, FocusDirection direction);
