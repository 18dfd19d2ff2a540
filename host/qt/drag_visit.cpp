#include "drag_visit.h"

#include "data_formats.h"

#include <QMimeData>

namespace host {

std::shared_ptr<const DataFormats> DragVisit::data_of(const QMimeData& mime) {
    if (data_ == nullptr) {
        DataFormats data = from_mime_data(mime, {std::string(message_type)});
        if (data.formats.empty()) {
            data = from_mime_data(mime, {std::string(uri_list_type), std::string(text_type)});
        }
        if (!data.formats.empty()) {
            data_ = std::make_shared<const DataFormats>(std::move(data));
        }
    }
    return data_;
}

} // namespace host
