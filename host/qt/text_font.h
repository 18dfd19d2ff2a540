// Which of the desktop's fonts a FontSpec means.
//
// Thread rule: pure functions, any thread.
#pragma once

#include "host/api/fonts.h"

#include <QFont>
#include <QString>

#include <cstddef>

namespace host {

// A FontSpec with the family that the desktop's settings choose at this moment, and its size as it is used.
struct FontKey {
    QString family;
    int size = 12; // whole logical pixels
    int weight = 400;
    bool italic = false;
    bool antialiased = true;
    bool fixed = false;

    bool operator==(const FontKey&) const = default;
};

[[nodiscard]] FontKey font_key(const FontSpec& spec);
[[nodiscard]] std::size_t hash_of(const FontKey& key);
// Not to be shared between threads: what Qt hangs onto a font belongs to the thread that uses it.
[[nodiscard]] QFont make_font(const FontKey& key);

} // namespace host
