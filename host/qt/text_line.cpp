#include "text_line.h"

#include <QImage>
#include <QPainter>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <optional>

namespace host {

namespace {

constexpr int max_window_side = 16384;

bool is_clear(const QRgb* pixels, int count) {
    // Equal to itself one further: the library compares faster than a loop looks for what is not 0.
    return pixels[0] == 0 &&
           std::memcmp(pixels, pixels + 1, static_cast<std::size_t>(count - 1) * sizeof(QRgb)) == 0;
}

// The rows and columns of a picture without what is wholly transparent around them; empty when
// right <= left.
TextWindow inked_part(const std::vector<QRgb>& pixels, int width, int height) {
    TextWindow part{width, height, 0, 0};
    for (int y = 0; y < height; ++y) {
        const QRgb* const row = pixels.data() + static_cast<std::ptrdiff_t>(y) * width;
        if (is_clear(row, width)) {
            continue;
        }
        part.top = std::min(part.top, y);
        part.bottom = y + 1;
        // Only what lies outside of the columns that are known to be inked can widen them.
        part.left =
            static_cast<int>(std::find_if(row, row + part.left, [](QRgb pixel) { return pixel != 0; }) - row);
        int right = width;
        while (right > part.right && row[right - 1] == 0) {
            --right;
        }
        part.right = right;
    }
    return part;
}

} // namespace

TextLine::TextLine(const FontKey& font, std::string_view text)
    : font_(font), text_(text), shown_(display_text(text)), layout_(shown_.text, make_font(font)) {
    QTextOption option;
    option.setWrapMode(QTextOption::NoWrap);
    layout_.setTextOption(option);
    layout_.setCacheEnabled(true);
    layout_.beginLayout();
    line_ = layout_.createLine();
    if (line_.isValid()) {
        line_.setNumColumns(static_cast<int>(shown_.text.size()));
    }
    layout_.endLayout();
}

float TextLine::width() const {
    // naturalTextWidth() leaves trailing blanks out.
    return line_.isValid() ? static_cast<float>(line_.horizontalAdvance()) : 0.0F;
}

std::vector<float> TextLine::advances() const {
    std::vector<float> advances(shown_.starts.size(), 0);
    if (!line_.isValid()) {
        return advances;
    }
    // Each border of two code points is asked for once: finding one walks the line.
    qreal here = advances.empty() ? 0 : line_.cursorToX(shown_.starts.front());
    for (std::size_t i = 0; i < advances.size(); ++i) {
        const int end = i + 1 < advances.size() ? shown_.starts[i + 1] : static_cast<int>(shown_.text.size());
        const qreal there = line_.cursorToX(end);
        // In right-to-left runs the cursor walks backwards; an advance has no direction.
        advances[i] = static_cast<float>(std::abs(there - here));
        here = there;
    }
    return advances;
}

TextWindow TextLine::reach(double scale) const {
    if (!line_.isValid()) {
        return {};
    }
    // Room for overhanging italics and for marks above and below.
    const double margin = font_.size;
    TextWindow reach;
    reach.left = static_cast<int>(std::floor(-margin * scale));
    reach.right = static_cast<int>(std::ceil(std::min((line_.horizontalAdvance() + margin) * scale, 1.0e8)));
    reach.top = static_cast<int>(std::floor(-(line_.ascent() + margin) * scale));
    reach.bottom = static_cast<int>(std::ceil((line_.height() - line_.ascent() + margin) * scale));
    return reach;
}

std::shared_ptr<const TextMask> TextLine::draw(double scale, TextWindow window) const {
    const TextWindow all = reach(scale);
    const int left = std::max(all.left, window.left);
    const int top = std::max(all.top, window.top);
    const int width = std::min(all.right, window.right) - left;
    const int height = std::min(all.bottom, window.bottom) - top;
    if (width <= 0 || height <= 0 || width > max_window_side || height > max_window_side) {
        return nullptr;
    }
    std::vector<QRgb> pixels(static_cast<std::size_t>(width) * static_cast<std::size_t>(height));
    QImage image(reinterpret_cast<uchar*>(pixels.data()), width, height, QImage::Format_ARGB32_Premultiplied);
    image.setDevicePixelRatio(scale);
    QPainter painter(&image);
    painter.setPen(Qt::black);
    layout_.draw(&painter, QPointF(-left / scale, -top / scale - line_.ascent()));
    painter.end();
    const TextWindow inked = inked_part(pixels, width, height);
    if (inked.right <= inked.left) {
        return nullptr;
    }
    auto mask = std::make_shared<TextMask>();
    mask->left = left + inked.left;
    mask->top = top + inked.top;
    mask->width = inked.right - inked.left;
    mask->height = inked.bottom - inked.top;
    mask->coverage.resize(static_cast<std::size_t>(mask->width) * static_cast<std::size_t>(mask->height));
    std::uint8_t* out = mask->coverage.data();
    for (int y = inked.top; y < inked.bottom; ++y) {
        const QRgb* const row = pixels.data() + static_cast<std::ptrdiff_t>(y) * width;
        out = std::transform(row + inked.left, row + inked.right, out,
                             [](QRgb pixel) { return static_cast<std::uint8_t>(qAlpha(pixel)); });
    }
    return mask;
}

const TextLine& text_line(const FontKey& font, std::string_view text) {
    thread_local std::optional<TextLine> last;
    if (!last || !last->is_of(font, text)) {
        last.emplace(font, text);
    }
    return *last;
}

} // namespace host
