// Where an open menu lies on the screen. Plain arithmetic.
#pragma once

#include <Rect.h>

// All rectangles in screen coordinates, edges included; sizes are right - left and bottom - top. What comes
// back lies on the screen. Where the menu is higher than the screen it gets the screen's height, and has to
// be scrolled; where it is wider, its left part is on the screen.

// A menu that is wanted with its left top corner at `where`.
BRect pop_up_frame(BPoint where, float width, float height, BRect screen);

// A menu that opens below (a bar's) or beside (another menu's) item. Where there is no room it opens on the
// other side, above or to the left; where there is none either, over the item.
BRect frame_below_item(BRect item, float width, float height, BRect screen);
// `firstItemOffset` is how far below the menu's top edge its first item begins, which is put beside the item.
BRect frame_beside_item(BRect item, float width, float height, float firstItemOffset, BRect screen);

// Whether the pointer, on its way from one point to another, makes for the menu that is open there: then
// items on its way do not take the selection over.
bool makes_for_menu(BPoint from, BPoint to, BRect menu);
