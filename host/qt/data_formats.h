// Between Qt's form of dragged and copied data and ours.
#pragma once

#include "host/api/display.h"

class QMimeData;

namespace host {

// A new object, the caller's.
QMimeData* to_mime_data(const DataFormats& data);
// Those of the wanted types that are there, in the order wanted.
DataFormats from_mime_data(const QMimeData& mime, const std::vector<std::string>& wanted);

} // namespace host
