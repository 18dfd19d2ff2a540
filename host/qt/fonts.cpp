#include "host/api/fonts.h"

#include "display_text.h"
#include "gui_application.h"
#include "text_cache.h"
#include "text_font.h"
#include "text_line.h"

#include <QFontDatabase>
#include <QFontInfo>
#include <QFontMetricsF>
#include <QGuiApplication>

#include <algorithm>
#include <cstdint>

namespace host {

namespace {

// Stands in for real widths in a process that cannot have fonts.
constexpr float guessed_advance = 0.6F;
// Enough for the texts of a few large windows at twice the usual scale.
constexpr std::size_t cache_bytes = std::size_t{4} << 20;
// Of a text that covers more pixels only the wanted part is drawn, and that is not kept.
constexpr std::int64_t most_pixels = std::int64_t{1} << 19;

TextCache& texts() {
    // Never deleted: windows draw until the last thread ends.
    static auto* const cache = [] {
        auto* const made = new TextCache(cache_bytes);
        QObject::connect(qGuiApp, &QGuiApplication::fontDatabaseChanged, [made] { made->clear(); });
        return made;
    }();
    return *cache;
}

float guessed_width(const FontSpec& font) {
    return static_cast<float>(font_key(font).size) * guessed_advance;
}

} // namespace

bool fonts_available() {
    return ensure_gui_application();
}

FontHeight font_height(const FontSpec& font) {
    if (!fonts_available()) {
        const float size = static_cast<float>(font_key(font).size);
        return {size * 0.9F, size * 0.25F, 0};
    }
    // Not before there are fonts: the desktop's families are not known until then.
    const FontKey key = font_key(font);
    if (const std::optional<FontHeight> known = texts().find_height(key)) {
        return *known;
    }
    const QFontMetricsF metrics(make_font(key));
    const FontHeight height{static_cast<float>(metrics.ascent()), static_cast<float>(metrics.descent()),
                            static_cast<float>(std::max(0.0, metrics.leading()))};
    texts().keep_height(key, height);
    return height;
}

float text_width(const FontSpec& font, std::string_view text) {
    if (text.empty()) {
        return 0;
    }
    if (!fonts_available()) {
        return static_cast<float>(display_text(text).starts.size()) * guessed_width(font);
    }
    const FontKey key = font_key(font);
    KnownText known = texts().find(key, text);
    if (!known.width) {
        known.width = text_line(key, text).width();
        texts().keep(key, text, {.width = known.width});
    }
    return *known.width;
}

std::vector<float> text_advances(const FontSpec& font, std::string_view text) {
    if (text.empty()) {
        return {};
    }
    if (!fonts_available()) {
        return std::vector<float>(display_text(text).starts.size(), guessed_width(font));
    }
    const FontKey key = font_key(font);
    KnownText known = texts().find(key, text);
    if (known.advances == nullptr) {
        known.advances = std::make_shared<std::vector<float>>(text_line(key, text).advances());
        texts().keep(key, text, {.advances = known.advances});
    }
    return *known.advances;
}

std::shared_ptr<const TextMask> render_text(const FontSpec& font, std::string_view text, double scale,
                                            TextWindow window) {
    if (text.empty() || !fonts_available()) {
        return nullptr;
    }
    scale = scale >= 0.25 ? std::min(scale, 16.0) : 0.25;
    const FontKey key = font_key(font);
    if (const KnownText known = texts().find(key, text); known.mask_scale == scale) {
        return known.mask;
    }
    const TextLine& line = text_line(key, text);
    const TextWindow reach = line.reach(scale);
    const std::int64_t pixels =
        (std::int64_t{reach.right} - reach.left) * (std::int64_t{reach.bottom} - reach.top);
    if (text.size() > TextCache::longest_text || pixels > most_pixels) {
        return line.draw(scale, window);
    }
    KnownText drawn{.mask = line.draw(scale, reach), .mask_scale = scale};
    texts().keep(key, text, drawn);
    return drawn.mask;
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
    const QFontMetricsF metrics(make_font(font_key(spec)));
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
    return QFontInfo(make_font(font_key(spec))).family().toStdString();
}

} // namespace host
