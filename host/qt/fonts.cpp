#include "host/api/fonts.h"

#include "display_text.h"
#include "gui_application.h"

#include <QFont>
#include <QFontDatabase>
#include <QFontInfo>
#include <QFontMetricsF>
#include <QImage>
#include <QPainter>
#include <QTextLayout>

#include <algorithm>
#include <cmath>

namespace host {

namespace {

constexpr int max_window_side = 16384;
// Stands in for real widths in a process that cannot have fonts.
constexpr float guessed_advance = 0.6F;

int whole_size(float size) {
    if (!(size >= 1.0F)) {
        return 1;
    }
    return static_cast<int>(std::lround(std::min(size, 1000.0F)));
}

QString desktop_family(std::string_view family) {
    if (family == default_sans_family) {
        return QFontDatabase::systemFont(QFontDatabase::GeneralFont).family();
    }
    if (family == default_fixed_family) {
        return QFontDatabase::systemFont(QFontDatabase::FixedFont).family();
    }
    return QString::fromUtf8(family.data(), static_cast<qsizetype>(family.size()));
}

QFont to_font(const FontSpec& spec) {
    QFont font(desktop_family(spec.family));
    font.setPixelSize(whole_size(spec.size));
    font.setWeight(static_cast<QFont::Weight>(std::clamp(spec.weight, 1, 1000)));
    font.setItalic(spec.italic);
    font.setStyleHint(spec.family == default_fixed_family ? QFont::Monospace : QFont::SansSerif);
    // Stems on whole pixels: at 12 pixels a list is read faster sharp than true to the outline.
    font.setHintingPreference(QFont::PreferFullHinting);
    font.setStyleStrategy(spec.antialiased ? QFont::NoSubpixelAntialias : QFont::NoAntialias);
    return font;
}

// One line of shaped text, whatever its length.
class Line {
  public:
    Line(const QString& text, const QFont& font) : layout_(text, font) {
        QTextOption option;
        option.setWrapMode(QTextOption::NoWrap);
        layout_.setTextOption(option);
        layout_.setCacheEnabled(true);
        layout_.beginLayout();
        line_ = layout_.createLine();
        if (line_.isValid()) {
            line_.setNumColumns(static_cast<int>(text.size()));
        }
        layout_.endLayout();
    }

    bool valid() const { return line_.isValid(); }
    // With trailing blanks, which naturalTextWidth() leaves out.
    qreal width() const { return line_.horizontalAdvance(); }
    qreal ascent() const { return line_.ascent(); }
    qreal height() const { return line_.height(); }
    qreal cursor_x(int position) const { return line_.cursorToX(position); }

    void draw(QPainter& painter, QPointF baseline) const {
        layout_.draw(&painter, QPointF(baseline.x(), baseline.y() - line_.ascent()));
    }

  private:
    QTextLayout layout_;
    QTextLine line_;
};

// Where the glyphs can reach, with room for overhanging italics and for marks above and below.
TextWindow reach_of(const Line& line, const FontSpec& spec, double scale) {
    const double margin = whole_size(spec.size);
    TextWindow reach;
    reach.left = static_cast<int>(std::floor(-margin * scale));
    reach.right = static_cast<int>(std::ceil(std::min((line.width() + margin) * scale, 1.0e8)));
    reach.top = static_cast<int>(std::floor(-(line.ascent() + margin) * scale));
    reach.bottom = static_cast<int>(std::ceil((line.height() - line.ascent() + margin) * scale));
    return reach;
}

TextMask mask_of(const QImage& image, int left, int top) {
    TextMask mask;
    mask.left = left;
    mask.top = top;
    mask.width = image.width();
    mask.height = image.height();
    mask.coverage.resize(static_cast<std::size_t>(mask.width) * static_cast<std::size_t>(mask.height));
    std::uint8_t* out = mask.coverage.data();
    for (int y = 0; y < mask.height; ++y) {
        const auto* row = reinterpret_cast<const QRgb*>(image.constScanLine(y));
        for (int x = 0; x < mask.width; ++x) {
            *out++ = static_cast<std::uint8_t>(qAlpha(row[x]));
        }
    }
    return mask;
}

} // namespace

bool fonts_available() {
    return ensure_gui_application();
}

FontHeight font_height(const FontSpec& font) {
    if (!fonts_available()) {
        const float size = static_cast<float>(whole_size(font.size));
        return {size * 0.9F, size * 0.25F, 0};
    }
    const QFontMetricsF metrics(to_font(font));
    return {static_cast<float>(metrics.ascent()), static_cast<float>(metrics.descent()),
            static_cast<float>(std::max(0.0, metrics.leading()))};
}

float text_width(const FontSpec& font, std::string_view text) {
    const DisplayText shown = display_text(text);
    if (shown.text.isEmpty()) {
        return 0;
    }
    if (!fonts_available()) {
        return static_cast<float>(shown.starts.size()) * static_cast<float>(whole_size(font.size)) *
               guessed_advance;
    }
    const Line line(shown.text, to_font(font));
    return line.valid() ? static_cast<float>(line.width()) : 0;
}

std::vector<float> text_advances(const FontSpec& font, std::string_view text) {
    const DisplayText shown = display_text(text);
    std::vector<float> advances(shown.starts.size(), 0);
    if (shown.text.isEmpty()) {
        return advances;
    }
    if (!fonts_available()) {
        std::fill(advances.begin(), advances.end(),
                  static_cast<float>(whole_size(font.size)) * guessed_advance);
        return advances;
    }
    const Line line(shown.text, to_font(font));
    if (!line.valid()) {
        return advances;
    }
    for (std::size_t i = 0; i < advances.size(); ++i) {
        const int end = i + 1 < advances.size() ? shown.starts[i + 1] : static_cast<int>(shown.text.size());
        // In right-to-left runs the cursor walks backwards; an advance has no direction.
        advances[i] = static_cast<float>(std::abs(line.cursor_x(end) - line.cursor_x(shown.starts[i])));
    }
    return advances;
}

TextMask render_text(const FontSpec& font, std::string_view text, double scale, TextWindow window) {
    const DisplayText shown = display_text(text);
    if (shown.text.isEmpty() || !fonts_available()) {
        return {};
    }
    scale = scale >= 0.25 ? std::min(scale, 16.0) : 0.25;
    const Line line(shown.text, to_font(font));
    if (!line.valid()) {
        return {};
    }
    const TextWindow reach = reach_of(line, font, scale);
    const int left = std::max(reach.left, window.left);
    const int top = std::max(reach.top, window.top);
    const int right = std::min(reach.right, window.right);
    const int bottom = std::min(reach.bottom, window.bottom);
    if (left >= right || top >= bottom || right - left > max_window_side || bottom - top > max_window_side) {
        return {};
    }
    QImage image(right - left, bottom - top, QImage::Format_ARGB32_Premultiplied);
    if (image.isNull()) {
        return {};
    }
    image.fill(Qt::transparent);
    image.setDevicePixelRatio(scale);
    QPainter painter(&image);
    painter.setPen(Qt::black);
    line.draw(painter, QPointF(-left / scale, -top / scale));
    painter.end();
    return mask_of(image, left, top);
}

std::vector<std::string> font_families() {
    std::vector<std::string> names;
    if (!fonts_available()) {
        return names;
    }
    for (const QString& family : QFontDatabase::families()) {
        if (!QFontDatabase::isPrivateFamily(family)) {
            names.push_back(family.toStdString());
        }
    }
    std::sort(names.begin(), names.end());
    names.erase(std::unique(names.begin(), names.end()), names.end());
    return names;
}

std::vector<FontStyle> font_styles(std::string_view family) {
    std::vector<FontStyle> styles;
    if (!fonts_available()) {
        return styles;
    }
    const QString name = QString::fromStdString(resolve_family(family));
    for (const QString& style : QFontDatabase::styles(name)) {
        styles.push_back(
            {style.toStdString(), QFontDatabase::weight(name, style), QFontDatabase::italic(name, style)});
    }
    return styles;
}

bool family_is_fixed_width(std::string_view family) {
    if (!fonts_available()) {
        return family == default_fixed_family;
    }
    // Measured, because fonts with letters of double width do not call themselves fixed.
    FontSpec spec;
    spec.family = family;
    const QFontMetricsF metrics(to_font(spec));
    return metrics.horizontalAdvance(u'i') == metrics.horizontalAdvance(u'W');
}

std::string resolve_family(std::string_view family) {
    if (family != default_sans_family && family != default_fixed_family) {
        return std::string(family);
    }
    if (!fonts_available()) {
        return family == default_fixed_family ? "Monospace" : "Sans Serif";
    }
    FontSpec spec;
    spec.family = family;
    return QFontInfo(to_font(spec)).family().toStdString();
}

} // namespace host
