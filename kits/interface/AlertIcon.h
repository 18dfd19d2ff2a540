// The pictures on alerts.
#pragma once

#include <Alert.h>

#include <memory>

class BBitmap;

// 128 x 128 pixels, to be shown at a quarter of that or more; around the sign it is transparent. Null for
// B_EMPTY_ALERT. Any thread.
std::unique_ptr<BBitmap> alert_icon(alert_type type);
