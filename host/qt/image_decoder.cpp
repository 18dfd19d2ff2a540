#include "host/api/image_decoder.h"

#include <QBuffer>
#include <QByteArray>
#include <QImage>
#include <QImageReader>
#include <QImageWriter>
#include <QMimeDatabase>

#include <algorithm>
#include <cstring>
#include <limits>
#include <mutex>
#include <set>

namespace host {

namespace {

// The reader's own limit, in megabytes, must admit the largest picture that the size check admits.
constexpr int reader_memory_limit = 512;

QByteArray borrow(std::span<const std::byte> data) {
    return QByteArray::fromRawData(reinterpret_cast<const char*>(data.data()),
                                   static_cast<qsizetype>(data.size()));
}

void prepare_reader() {
    static std::once_flag once;
    std::call_once(once, [] { QImageReader::setAllocationLimit(reader_memory_limit); });
}

bool too_many_pixels(QSize size) {
    return static_cast<std::int64_t>(size.width()) * size.height() > max_image_pixels;
}

std::string mime_type_of_format(const QByteArray& format) {
    static const struct {
        const char* format;
        const char* type;
    } known[] = {
        {"bmp", "image/bmp"},
        {"gif", "image/gif"},
        {"ico", "image/vnd.microsoft.icon"},
        {"jpg", "image/jpeg"},
        {"jpeg", "image/jpeg"},
        {"png", "image/png"},
        {"webp", "image/webp"},
        {"svg", "image/svg+xml"},
        {"tif", "image/tiff"},
        {"tiff", "image/tiff"},
        {"xbm", "image/x-xbitmap"},
        {"xpm", "image/x-xpixmap"},
        {"pbm", "image/x-portable-bitmap"},
        {"pgm", "image/x-portable-graymap"},
        {"ppm", "image/x-portable-pixmap"},
    };
    for (const auto& entry : known) {
        if (format == entry.format) {
            return entry.type;
        }
    }
    return "image/x-" + format.toStdString();
}

} // namespace

std::string identify_image(std::span<const std::byte> data) {
    if (data.empty() || data.size() > max_image_file_size) {
        return {};
    }
    QByteArray bytes = borrow(data);
    QBuffer buffer(&bytes);
    if (!buffer.open(QIODevice::ReadOnly)) {
        return {};
    }
    return QImageReader::imageFormat(&buffer).toStdString();
}

DecodedImage decode_image(std::span<const std::byte> data) {
    DecodedImage result;
    if (data.size() > max_image_file_size) {
        result.status = ImageStatus::too_large;
        return result;
    }
    if (data.empty()) {
        return result;
    }
    prepare_reader();
    QByteArray bytes = borrow(data);
    QBuffer buffer(&bytes);
    if (!buffer.open(QIODevice::ReadOnly)) {
        return result;
    }
    QImageReader reader(&buffer);
    if (!reader.canRead()) {
        return result;
    }
    result.format = reader.format().toStdString();
    if (const QSize size = reader.size(); size.isValid() && too_many_pixels(size)) {
        result.status = ImageStatus::too_large;
        return result;
    }
    reader.setAutoTransform(true);
    QImage image = reader.read();
    if (image.isNull()) {
        result.status = ImageStatus::damaged;
        return result;
    }
    if (too_many_pixels(image.size())) {
        result.status = ImageStatus::too_large;
        return result;
    }
    result.has_alpha = image.hasAlphaChannel();
    image = std::move(image).convertToFormat(result.has_alpha ? QImage::Format_ARGB32 : QImage::Format_RGB32);
    if (image.isNull()) {
        result.status = ImageStatus::no_memory;
        return result;
    }
    const auto width = static_cast<std::size_t>(image.width());
    const auto height = static_cast<std::size_t>(image.height());
    try {
        result.pixels.resize(width * height);
    } catch (const std::bad_alloc&) {
        result.status = ImageStatus::no_memory;
        return result;
    }
    for (std::size_t y = 0; y < height; ++y) {
        std::memcpy(result.pixels.data() + y * width, image.constScanLine(static_cast<int>(y)),
                    width * sizeof(std::uint32_t));
    }
    result.width = image.width();
    result.height = image.height();
    result.status = ImageStatus::ok;
    return result;
}

EncodedImage encode_image(const std::string& format, int width, int height, bool has_alpha,
                          std::span<const std::uint32_t> pixels) {
    EncodedImage result;
    if (width <= 0 || height <= 0 || static_cast<std::int64_t>(width) * height > max_image_pixels ||
        static_cast<std::int64_t>(width) * height != static_cast<std::int64_t>(pixels.size())) {
        result.status = ImageStatus::damaged;
        return result;
    }
    const QImage image(reinterpret_cast<const uchar*>(pixels.data()), width, height,
                       static_cast<qsizetype>(width) * static_cast<qsizetype>(sizeof(std::uint32_t)),
                       has_alpha ? QImage::Format_ARGB32 : QImage::Format_RGB32);
    QByteArray bytes;
    QBuffer buffer(&bytes);
    if (!buffer.open(QIODevice::WriteOnly)) {
        result.status = ImageStatus::no_memory;
        return result;
    }
    QImageWriter writer(&buffer, QByteArray::fromStdString(format));
    if (!writer.canWrite()) {
        return result;
    }
    if (!writer.write(image)) {
        result.status = ImageStatus::damaged;
        return result;
    }
    const auto* begin = reinterpret_cast<const std::byte*>(bytes.constData());
    result.data.assign(begin, begin + bytes.size());
    result.status = ImageStatus::ok;
    return result;
}

std::vector<ImageFormat> image_formats() {
    const QList<QByteArray> readable = QImageReader::supportedImageFormats();
    const QList<QByteArray> writable = QImageWriter::supportedImageFormats();
    std::set<QByteArray> names(readable.begin(), readable.end());
    names.insert(writable.begin(), writable.end());
    std::vector<ImageFormat> formats;
    for (const QByteArray& name : names) {
        formats.push_back({name.toStdString(), mime_type_of_format(name), readable.contains(name),
                           writable.contains(name)});
    }
    return formats;
}

} // namespace host
