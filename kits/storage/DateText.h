// Times in words, as queries take them. Internal to the storage kit.
#pragma once

#include <optional>
#include <string_view>
#include <time.h>

// Seconds since 1970 for one of the forms listed in docs/queries.md ("yesterday", "3 days ago", "2001-02-03
// 04:05"), in the local time zone; nothing for any other text. A day without a time of day begins at
// midnight. English words, any case. Any thread.
[[nodiscard]] std::optional<time_t> TimeFromText(std::string_view text, time_t now);
