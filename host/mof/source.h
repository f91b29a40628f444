// Getting a source's text, and getting rid of texts that are no MOF at all.
#pragma once

#include "host/mof/diagnostics.h"

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>

namespace velkhost::mof {

inline constexpr std::uintmax_t kMaxSourceBytes = 16U << 20U;

// The text of a regular file of at most kMaxSourceBytes. On failure no value; `problem` then says
// what was found instead, for "expected a readable file, found ...".
std::optional<std::string> load_source(const std::filesystem::path &path, std::string &problem);

// The text without a byte order mark; no value, and a report with the place, if it is not UTF-8.
std::optional<std::string_view> checked_text(std::string_view text, std::string_view file,
                                             ErrorList &errors);

}  // namespace velkhost::mof
