#include "text_font.h"

#include <QFontDatabase>
#include <QHash>

#include <algorithm>
#include <cmath>

namespace host {

namespace {

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

} // namespace

FontKey font_key(const FontSpec& spec) {
    FontKey key;
    key.family = desktop_family(spec.family);
    key.size = whole_size(spec.size);
    key.weight = std::clamp(spec.weight, 1, 1000);
    key.italic = spec.italic;
    key.antialiased = spec.antialiased;
    key.fixed = spec.family == default_fixed_family;
    return key;
}

std::size_t hash_of(const FontKey& key) {
    return qHashMulti(0, key.family, key.size, key.weight, key.italic, key.antialiased, key.fixed);
}

QFont make_font(const FontKey& key) {
    QFont font(key.family);
    font.setPixelSize(key.size);
    font.setWeight(static_cast<QFont::Weight>(key.weight));
    font.setItalic(key.italic);
    font.setStyleHint(key.fixed ? QFont::Monospace : QFont::SansSerif);
    // Stems on whole pixels: at 12 pixels a list is read faster sharp than true to the outline.
    font.setHintingPreference(QFont::PreferFullHinting);
    font.setStyleStrategy(key.antialiased ? QFont::NoSubpixelAntialias : QFont::NoAntialias);
    return font;
}

} // namespace host
