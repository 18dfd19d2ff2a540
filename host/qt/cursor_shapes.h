// Pointer shapes, as Qt has them.
#pragma once

#include "host/api/display.h"

#include <QCursor>
#include <QImage>

namespace host {

// On the main thread.
QCursor to_qt_cursor(const Cursor& cursor);
// Empty for an empty picture or one whose pixels are missing.
QImage to_image(const Picture& picture);

} // namespace host
