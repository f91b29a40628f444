// What `velkhost install` is asked to do.
#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cli {

// An argument that cannot be used; what() says which and why.
class UsageError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

struct InstallOptions {
    std::vector<std::string> uris;
    std::optional<std::filesystem::path> scenario;
    std::optional<std::vector<std::uint16_t>> options;
    std::optional<std::string> update_args;
    bool virtual_clock = true;
    std::optional<std::filesystem::path> root;
    std::chrono::seconds limit = std::chrono::hours(24);
    int pace_ms = 0;
    bool discard = false;
    bool json = false;
    bool log = false;
};

// "32769,1" -> {32769, 1}. Throws UsageError.
std::vector<std::uint16_t> parse_option_numbers(std::string_view text);

// "24h", "90s", "1h30m", "2d"; at least one second and at most 10000 days. Throws UsageError.
std::chrono::seconds parse_duration(std::string_view text);

// A location as it is, a path as the file:// location of an existing file. Throws UsageError for a
// path that is no file, or has a "|", which separates locations.
std::string location_of(const std::string &argument);

// The single locations of a request: arguments may hold several with "|" between them.
std::vector<std::string> split_locations(const std::vector<std::string> &uris);

// What the library would do to these locations without a word: cut those of more than 199 bytes,
// leave out those beyond the 20th. One line for each.
std::vector<std::string> location_warnings(const std::vector<std::string> &locations);

// Packages that one request takes.
inline constexpr std::size_t kMostPackages = 20;

}  // namespace velkhost::cli
