// UTF-8 of unknown quality as the text that is measured and drawn.
#pragma once

#include <QString>

#include <string_view>
#include <vector>

namespace host {

struct DisplayText {
    QString text;
    std::vector<int> starts; // position in `text` of each code point of the source
};

// Each byte that is not part of valid UTF-8 becomes one replacement character, each control character a
// blank, so that measuring and drawing agree.
[[nodiscard]] DisplayText display_text(std::string_view utf8);

} // namespace host
