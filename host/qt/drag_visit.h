// A drag over one window: what it carries, read once.
#pragma once

#include "host/api/display.h"

class QMimeData;

namespace host {

// Main thread only.
class DragVisit {
  public:
    // The data of the drag, the same object until end(). Null when there is nothing that we understand.
    std::shared_ptr<const DataFormats> data_of(const QMimeData& mime);
    void end() { data_.reset(); }

  private:
    std::shared_ptr<const DataFormats> data_;
};

} // namespace host
