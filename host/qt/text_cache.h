// TextCache: what was found out about the texts and fonts that were asked for lately.
//
// A list is drawn again and again with the same few hundred texts; looking one up is a hundred times cheaper
// than shaping and drawing it.
//
// Thread rule: any thread. One lock guards all of it; nothing is waited for under it.
#pragma once

#include "host/api/fonts.h"
#include "host/api/thread_safety.h"
#include "text_font.h"

#include <cstddef>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace host {

// Empty members are not known yet.
struct KnownText {
    std::optional<float> width = std::nullopt;
    std::shared_ptr<const std::vector<float>> advances = nullptr;
    // The whole text at that scale. Known and null: nothing of it is inked.
    std::shared_ptr<const TextMask> mask = nullptr;
    double mask_scale = 0; // 0: the mask is not known
};

class TextCache {
  public:
    // Keeps up to twice that many bytes, for a moment three times as many.
    explicit TextCache(std::size_t bytes) : most_bytes_(bytes) {}

    // Texts longer than this many bytes are not kept.
    static constexpr std::size_t longest_text = 1024;

    KnownText find(const FontKey& font, std::string_view text);
    // Adds what `known` knows to what is kept for the text.
    void keep(const FontKey& font, std::string_view text, const KnownText& known);

    std::optional<FontHeight> find_height(const FontKey& font);
    void keep_height(const FontKey& font, FontHeight height);

    // Forgets everything, because the installed fonts have changed.
    void clear();

  private:
    struct TextKey {
        FontKey font;
        std::string text;
    };
    struct TextView {
        const FontKey& font;
        std::string_view text;
    };
    struct Hash {
        using is_transparent = void;
        std::size_t operator()(const TextView& key) const;
        std::size_t operator()(const TextKey& key) const { return (*this)(TextView{key.font, key.text}); }
    };
    struct Equal {
        using is_transparent = void;
        template <typename Left, typename Right>
        bool operator()(const Left& left, const Right& right) const {
            return left.text == right.text && left.font == right.font;
        }
    };
    using Texts = std::unordered_map<TextKey, KnownText, Hash, Equal>;

    KnownText* look_up(const FontKey& font, std::string_view text) REQUIRES(mutex_);
    void make_room(std::size_t bytes) REQUIRES(mutex_);

    const std::size_t most_bytes_;
    Mutex mutex_;
    // Two generations: what is used moves into the young one; when that is full it becomes the old one, and
    // what nobody has used meanwhile goes, a few at a time so that no frame waits for thousands.
    Texts young_ GUARDED_BY(mutex_);
    Texts old_ GUARDED_BY(mutex_);
    Texts going_ GUARDED_BY(mutex_);
    std::size_t young_bytes_ GUARDED_BY(mutex_) = 0;
    std::vector<std::pair<FontKey, FontHeight>> heights_ GUARDED_BY(mutex_);
};

} // namespace host
