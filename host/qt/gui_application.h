// The application object that Qt's fonts live in.
#pragma once

namespace host {

// True when the process has a graphical application object, making one without a display where there is no
// application object at all. Any thread. The one who opens windows makes the real one first, on the main
// thread: what is made here can show nothing and stays until the process ends.
[[nodiscard]] bool ensure_gui_application();

} // namespace host
