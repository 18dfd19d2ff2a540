#include "host/api/icons.h"

#include <QImage>
#include <QPainter>
#include <QPainterPath>

#include <algorithm>
#include <cstring>

namespace host {

namespace {

// The drawings are laid out on a grid of 16 x 16.
const QColor outline(64, 64, 72);
const QColor paper(252, 252, 250);
const QColor note(64, 64, 128);

void draw_paper(QPainter& painter) {
    QPainterPath sheet(QPointF(3, 1));
    for (const QPointF corner : {QPointF(10, 1), QPointF(13, 4), QPointF(13, 15), QPointF(3, 15)}) {
        sheet.lineTo(corner);
    }
    sheet.closeSubpath();
    painter.setPen(QPen(outline, 1));
    painter.setBrush(paper);
    painter.drawPath(sheet.translated(0, -0.5));
    painter.drawPolyline(QPolygonF({QPointF(10, 0.5), QPointF(10, 3.5), QPointF(13, 3.5)}));
}

void draw_document(QPainter& painter) {
    draw_paper(painter);
    painter.setPen(QPen(QColor(170, 170, 178), 1));
    for (const qreal y : {6.5, 8.5, 10.5, 12.5}) {
        painter.drawLine(QPointF(5, y), QPointF(11, y));
    }
}

void draw_audio(QPainter& painter) {
    draw_paper(painter);
    painter.setPen(Qt::NoPen);
    painter.setBrush(note);
    painter.drawEllipse(QRectF(4.5, 10, 3.4, 2.8));
    painter.drawEllipse(QRectF(8.5, 9, 3.4, 2.8));
    painter.setPen(QPen(note, 1));
    painter.drawLine(QPointF(7.4, 11.4), QPointF(7.4, 6));
    painter.drawLine(QPointF(11.4, 10.4), QPointF(11.4, 5));
    painter.setPen(QPen(note, 1.6));
    painter.drawLine(QPointF(7.4, 6.2), QPointF(11.4, 5.2));
}

void draw_image(QPainter& painter) {
    painter.setPen(QPen(outline, 1));
    painter.setBrush(QColor(150, 200, 240));
    painter.drawRect(QRectF(1.5, 2.5, 13, 11));
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(250, 220, 90));
    painter.drawEllipse(QRectF(4, 4, 3, 3));
    painter.setBrush(QColor(90, 150, 80));
    painter.drawPolygon(QPolygonF({QPointF(2, 13), QPointF(6, 8.5), QPointF(8.5, 11), QPointF(11, 7),
                                   QPointF(14, 11), QPointF(14, 13)}));
}

void draw_folder(QPainter& painter) {
    painter.setPen(QPen(QColor(140, 100, 30), 1));
    painter.setBrush(QColor(236, 190, 90));
    painter.drawPolygon(QPolygonF({QPointF(1.5, 13.5), QPointF(1.5, 3.5), QPointF(6.5, 3.5), QPointF(8, 5.5),
                                   QPointF(14.5, 5.5), QPointF(14.5, 13.5)}));
    painter.setPen(QPen(QColor(255, 228, 160), 1));
    painter.drawLine(QPointF(2.5, 6.5), QPointF(13.5, 6.5));
}

void draw_volume(QPainter& painter) {
    painter.setPen(QPen(outline, 1));
    painter.setBrush(QColor(190, 190, 198));
    painter.drawPolygon(
        QPolygonF({QPointF(1.5, 9.5), QPointF(3.5, 4.5), QPointF(12.5, 4.5), QPointF(14.5, 9.5)}));
    painter.setBrush(QColor(222, 222, 228));
    painter.drawRect(QRectF(1.5, 9.5, 13, 4));
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(70, 180, 80));
    painter.drawRect(QRectF(11, 11, 2, 1));
}

void draw_program(QPainter& painter) {
    painter.setPen(QPen(outline, 1));
    painter.setBrush(QColor(216, 216, 216));
    painter.drawRect(QRectF(1.5, 2.5, 13, 11));
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(90, 120, 190));
    painter.drawRect(QRectF(2, 3, 12, 2.5));
}

} // namespace

IconPixels draw_builtin_icon(IconKind kind, int size) {
    size = std::clamp(size, 8, 512);
    QImage image(size, size, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::transparent);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.scale(size / 16.0, size / 16.0);
    switch (kind) {
    case IconKind::document:
        draw_document(painter);
        break;
    case IconKind::audio:
        draw_audio(painter);
        break;
    case IconKind::image:
        draw_image(painter);
        break;
    case IconKind::folder:
        draw_folder(painter);
        break;
    case IconKind::volume:
        draw_volume(painter);
        break;
    case IconKind::program:
        draw_program(painter);
        break;
    }
    painter.end();
    const QImage plain = std::move(image).convertToFormat(QImage::Format_ARGB32);
    IconPixels icon;
    icon.size = size;
    const auto side = static_cast<std::size_t>(size);
    icon.pixels.resize(side * side);
    for (std::size_t y = 0; y < side; ++y) {
        std::memcpy(icon.pixels.data() + y * side, plain.constScanLine(static_cast<int>(y)),
                    side * sizeof(std::uint32_t));
    }
    return icon;
}

} // namespace host
