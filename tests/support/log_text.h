// The debug log as a test expects it: texts are put together from the same two forms in which the
// library writes them.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace velktest {

// Every test begins at 08:05:03.
inline constexpr int kStartSecond = 8 * 3600 + 5 * 60 + 3;

// A time-stamped entry written `elapsed` seconds after the test began. What is untimed is added
// with "+".
std::string entry(std::string_view message, int elapsed = 0);

// The same for several entries that follow each other.
std::string entries(const std::vector<std::string_view> &messages, int elapsed = 0);

// Entries of the session's log, which are dated, each on a line of its own.
std::string dated(std::string_view message, int elapsed = 0);
std::string dated(const std::vector<std::string_view> &messages, int elapsed = 0);

// How often `part` occurs in `text`.
int occurrences(std::string_view text, std::string_view part);

}  // namespace velktest
