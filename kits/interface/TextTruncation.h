// Cutting a text so that it fits a width.
#pragma once

#include <string>
#include <string_view>
#include <vector>

// Works on widths alone and measures nothing itself. `advances` holds the width of each character of `text`,
// `mode` is one of B_TRUNCATE_*; B_TRUNCATE_SMART is B_TRUNCATE_MIDDLE here. A text that fits comes back as
// it is; else whole characters are left out and an ellipsis stands in their place; where not even that fits,
// the result is empty.
std::string truncated_text(std::string_view text, const std::vector<float>& advances, float ellipsisWidth,
                           unsigned mode, float width);
