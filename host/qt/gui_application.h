// The application object that Qt's fonts and windows live in.
#pragma once

namespace host {

// True when the process has a graphical application object, making one without a display where there is no
// application object at all; on the main thread of a program that expects a display (expect_display()), the
// display's. Any thread. The one who opens windows makes the real one first, on the main thread: what is made
// here for another thread can show nothing and stays until the process ends.
[[nodiscard]] bool ensure_gui_application();

// On the main thread, when there is no application object: one for the display that the environment names.
// Qt ends the process when there is none.
void make_display_application();

} // namespace host
