#include "text_cache.h"

#include <algorithm>
#include <functional>

namespace host {

namespace {

// A program uses a handful of fonts; one that goes through all sizes must not make a long list.
constexpr std::size_t most_heights = 64;
// What an entry costs beside its texts and masks.
constexpr std::size_t entry_bytes = 256;
// For each one that is kept.
constexpr int freed_at_once = 8;

std::size_t bytes_of(const KnownText& known) {
    return (known.advances ? known.advances->size() * sizeof(float) : 0) +
           (known.mask ? known.mask->coverage.size() : 0);
}

} // namespace

std::size_t TextCache::Hash::operator()(const TextView& key) const {
    return std::hash<std::string_view>{}(key.text) ^ hash_of(key.font);
}

KnownText* TextCache::look_up(const FontKey& font, std::string_view text) {
    const TextView key{font, text};
    if (const auto found = young_.find(key); found != young_.end()) {
        return &found->second;
    }
    const auto found = old_.find(key);
    if (found == old_.end()) {
        return nullptr;
    }
    auto moved = old_.extract(found);
    make_room(entry_bytes + text.size() + bytes_of(moved.mapped()));
    return &young_.insert(std::move(moved)).position->second;
}

void TextCache::make_room(std::size_t bytes) {
    for (int i = 0; i < freed_at_once && !going_.empty(); ++i) {
        going_.erase(going_.begin());
    }
    if (young_bytes_ + bytes > most_bytes_) {
        going_ = std::move(old_);
        old_ = std::move(young_);
        young_.clear();
        young_bytes_ = 0;
    }
    young_bytes_ += bytes;
}

KnownText TextCache::find(const FontKey& font, std::string_view text) {
    const MutexLock lock(mutex_);
    const KnownText* const known = look_up(font, text);
    return known != nullptr ? *known : KnownText{};
}

void TextCache::keep(const FontKey& font, std::string_view text, const KnownText& known) {
    const std::size_t added = bytes_of(known);
    if (text.size() > longest_text || added > most_bytes_ / 8) {
        return;
    }
    const MutexLock lock(mutex_);
    if (look_up(font, text) == nullptr) {
        make_room(entry_bytes + text.size() + added);
        young_.emplace(TextKey{font, std::string(text)}, known);
        return;
    }
    // Making room may move the entry from one generation to the other.
    make_room(added);
    KnownText& kept = *look_up(font, text);
    if (known.width) {
        kept.width = known.width;
    }
    if (known.advances) {
        kept.advances = known.advances;
    }
    if (known.mask_scale > 0) {
        kept.mask = known.mask;
        kept.mask_scale = known.mask_scale;
    }
}

std::optional<FontHeight> TextCache::find_height(const FontKey& font) {
    const MutexLock lock(mutex_);
    for (const auto& [known, height] : heights_) {
        if (known == font) {
            return height;
        }
    }
    return std::nullopt;
}

void TextCache::keep_height(const FontKey& font, FontHeight height) {
    const MutexLock lock(mutex_);
    if (heights_.size() == most_heights) {
        heights_.clear();
    }
    heights_.emplace_back(font, height);
}

void TextCache::clear() {
    const MutexLock lock(mutex_);
    young_.clear();
    old_.clear();
    going_.clear();
    young_bytes_ = 0;
    heights_.clear();
}

} // namespace host
