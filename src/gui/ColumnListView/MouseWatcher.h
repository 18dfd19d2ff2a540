// Threads that follow the mouse while a button is held and report to a view.
#pragma once

#include <OS.h>

class BView;

// What the watchers send to the view. All carry "where" (BPoint, in the view's coordinates), "buttons" and
// "modifiers" (int32, as GetMouse() and modifiers() have them).
enum : uint32 {
    // From StartMouseWatcher(): other buttons than at the start; the same, away from where it started, every
    // 50 ms as long as it stays away; no button, which is the last message.
    MW_MOUSE_DOWN = 'Mw-D',
    MW_MOUSE_MOVED = 'Mw-M',
    MW_MOUSE_UP = 'Mw-U',
    // From StartMouseDragOrPopupWatcher(), exactly one of them: released, or other buttons; more than a pixel
    // away in x or y; held still for twice the time of a double click.
    MW_CLICK = 'Mw-C',
    MW_DRAG = 'Mw-d',
    MW_POPUP = 'Mw-P'
};

// To be called from MouseDown(), once a press. Both answer the thread, or B_NO_MORE_THREADS or B_NO_MEMORY.
// It ends with its last message, or when the view or its window is gone; it reads the mouse under the
// window's lock and sends without it.
thread_id StartMouseWatcher(BView* view);
thread_id StartMouseDragOrPopupWatcher(BView* view);
