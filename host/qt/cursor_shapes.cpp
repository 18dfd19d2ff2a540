#include "cursor_shapes.h"

#include <QPixmap>

#include <cstring>

namespace host {

namespace {

Qt::CursorShape to_qt_shape(CursorShape shape) {
    switch (shape) {
    case CursorShape::text:
        return Qt::IBeamCursor;
    case CursorShape::hand:
        return Qt::PointingHandCursor;
    case CursorShape::grabbing:
        return Qt::ClosedHandCursor;
    case CursorShape::grab:
        return Qt::OpenHandCursor;
    case CursorShape::cross:
        return Qt::CrossCursor;
    case CursorShape::wait:
        return Qt::WaitCursor;
    case CursorShape::progress:
        return Qt::BusyCursor;
    case CursorShape::forbidden:
        return Qt::ForbiddenCursor;
    case CursorShape::size_horizontal:
        return Qt::SizeHorCursor;
    case CursorShape::size_vertical:
        return Qt::SizeVerCursor;
    case CursorShape::size_down:
        return Qt::SizeFDiagCursor;
    case CursorShape::size_up:
        return Qt::SizeBDiagCursor;
    case CursorShape::move:
        return Qt::SizeAllCursor;
    case CursorShape::copy:
        return Qt::DragCopyCursor;
    case CursorShape::link:
        return Qt::DragLinkCursor;
    case CursorShape::help:
        return Qt::WhatsThisCursor;
    case CursorShape::blank:
        return Qt::BlankCursor;
    case CursorShape::arrow:
    case CursorShape::menu:
    case CursorShape::custom:
        break;
    }
    return Qt::ArrowCursor;
}

} // namespace

QImage to_image(const Picture& picture) {
    const auto count = static_cast<std::size_t>(picture.width) * static_cast<std::size_t>(picture.height);
    if (picture.width <= 0 || picture.height <= 0 || picture.pixels.size() < count) {
        return {};
    }
    QImage image(picture.width, picture.height, QImage::Format_ARGB32);
    for (int y = 0; y < picture.height && !image.isNull(); ++y) {
        std::memcpy(image.scanLine(y), picture.pixels.data() + static_cast<std::ptrdiff_t>(y) * picture.width,
                    static_cast<std::size_t>(picture.width) * sizeof(std::uint32_t));
    }
    return image;
}

QCursor to_qt_cursor(const Cursor& cursor) {
    if (cursor.shape == CursorShape::custom) {
        const QImage image = to_image(cursor.picture);
        if (!image.isNull()) {
            return QCursor(QPixmap::fromImage(image), cursor.hot_spot.x, cursor.hot_spot.y);
        }
    }
    return QCursor(to_qt_shape(cursor.shape));
}

} // namespace host
