// Text as a terminal shows it: columns instead of bytes, nothing that a terminal would obey.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::cli {

// `text` with control characters and what is no UTF-8 replaced by '?'; with `ascii`, so is
// everything beyond ASCII, one '?' per character.
std::string printable(std::string_view text, bool ascii);

// Columns that printable text takes: 2 for wide characters, 0 for combining ones.
std::size_t columns(std::string_view text);

// Printable text in at most `width` columns; where something was cut off, `mark` stands at the end
// ("…" or "..."), itself cut when even it does not fit.
std::string cut(std::string_view text, std::size_t width, std::string_view mark);

// With blanks behind it up to `width` columns.
std::string padded(std::string_view text, std::size_t width);

// Time since the request began: "00:00:31"; hours grow as needed. Negative times count as none.
std::string elapsed(std::int64_t us);

// Seconds since 1970 UTC as ISO 8601: "2026-03-02T08:00:00Z".
std::string iso_time(std::int64_t us);

}  // namespace velkhost::cli
