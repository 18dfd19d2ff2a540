#include "TextTruncation.h"

#include "Utf8Text.h"

#include <Font.h>
#include <SupportDefs.h>

#include <numeric>

namespace {

// How many characters, from one end, are at most `room` wide together.
template <typename Iterator>
size_t CountFitting(Iterator begin, Iterator end, float room) {
    size_t count = 0;
    float used = 0;
    for (; begin != end; ++begin) {
        used += *begin;
        if (used > room) {
            break;
        }
        ++count;
    }
    return count;
}

} // namespace

std::string truncated_text(std::string_view text, const std::vector<float>& advances, float ellipsisWidth,
                           unsigned mode, float width) {
    const float total = std::accumulate(advances.begin(), advances.end(), 0.0F);
    if (total <= width) {
        return std::string(text);
    }
    if (!(ellipsisWidth <= width)) {
        return {};
    }
    const float room = width - ellipsisWidth;
    size_t atStart = 0;
    size_t atEnd = 0;
    if (mode == B_TRUNCATE_END) {
        atStart = CountFitting(advances.begin(), advances.end(), room);
    } else if (mode == B_TRUNCATE_BEGINNING) {
        atEnd = CountFitting(advances.rbegin(), advances.rend(), room);
    } else {
        atStart = CountFitting(advances.begin(), advances.end(), room / 2);
        const float used =
            std::accumulate(advances.begin(), advances.begin() + static_cast<ptrdiff_t>(atStart), 0.0F);
        atEnd =
            CountFitting(advances.rbegin(), advances.rend() - static_cast<ptrdiff_t>(atStart), room - used);
    }
    std::vector<size_t> starts;
    for (size_t at = 0; at < text.size(); at += utf8_char_length(text.substr(at))) {
        starts.push_back(at);
    }
    starts.push_back(text.size());
    std::string result(text.substr(0, starts[atStart]));
    result += B_UTF8_ELLIPSIS;
    result += text.substr(starts[starts.size() - 1 - atEnd]);
    return result;
}
