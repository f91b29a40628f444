#include "host/cli/install_options.h"

#include <fmt/format.h>

#include <charconv>
#include <limits>

namespace velkhost::cli {
namespace {

namespace fs = std::filesystem;

constexpr std::size_t kLongestLocation = 199;

std::vector<std::string_view> split(std::string_view text, char separator) {
    std::vector<std::string_view> pieces;
    while (true) {
        const std::size_t end = text.find(separator);
        pieces.push_back(text.substr(0, end));
        if (end == std::string_view::npos) {
            return pieces;
        }
        text.remove_prefix(end + 1);
    }
}

// Cuts a decimal number off the front; no value when there is none or it does not fit.
std::optional<std::uint32_t> take_number(std::string_view &text) {
    std::uint32_t number = 0;
    const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc()) {
        return std::nullopt;
    }
    text.remove_prefix(static_cast<std::size_t>(rest - text.data()));
    return number;
}

std::optional<std::chrono::seconds> take_unit(std::string_view &text) {
    const char unit = text.empty() ? '\0' : text.front();
    text.remove_prefix(text.empty() ? 0 : 1);
    switch (unit) {
        case 's':
            return std::chrono::seconds(1);
        case 'm':
            return std::chrono::minutes(1);
        case 'h':
            return std::chrono::hours(1);
        case 'd':
            return std::chrono::hours(24);
        default:
            return std::nullopt;
    }
}

}  // namespace

std::vector<std::uint16_t> parse_option_numbers(std::string_view text) {
    std::vector<std::uint16_t> numbers;
    for (std::string_view piece : split(text, ',')) {
        const auto number = take_number(piece);
        if (!number || !piece.empty() || *number > std::numeric_limits<std::uint16_t>::max()) {
            throw UsageError(fmt::format(
                "--options takes numbers from 0 to 65535 with commas between them, not \"{}\"",
                text));
        }
        numbers.push_back(static_cast<std::uint16_t>(*number));
    }
    return numbers;
}

std::chrono::seconds parse_duration(std::string_view text) {
    constexpr std::chrono::hours kLongest(24 * 10'000);
    std::string_view rest = text;
    std::chrono::seconds total(0);
    bool good = !text.empty();
    while (good && !rest.empty()) {
        const auto number = take_number(rest);
        const auto unit = take_unit(rest);
        good = number && unit && *number <= kLongest / *unit;
        total += good ? *number * *unit : std::chrono::seconds(0);
    }
    if (!good || total < std::chrono::seconds(1) || total > kLongest) {
        throw UsageError(
            fmt::format("\"{}\" is no duration such as 90s, 15m, 1h30m or 2d, up to 10000d", text));
    }
    return total;
}

std::string location_of(const std::string &argument) {
    if (argument.find("://") != std::string::npos) {
        return argument;
    }
    std::error_code error;
    const fs::path path = fs::absolute(argument, error).lexically_normal();
    if (argument.empty() || error || !fs::is_regular_file(path, error)) {
        throw UsageError(fmt::format("no such file: \"{}\"", argument));
    }
    if (path.string().find('|') != std::string::npos) {
        throw UsageError(
            fmt::format("\"{}\" has a \"|\", which separates locations", path.string()));
    }
    return "file://" + path.string();
}

std::vector<std::string> split_locations(const std::vector<std::string> &uris) {
    std::vector<std::string> locations;
    for (const std::string &uri : uris) {
        for (const std::string_view piece : split(uri, '|')) {
            locations.emplace_back(piece);
        }
    }
    return locations;
}

std::vector<std::string> location_warnings(const std::vector<std::string> &locations) {
    std::vector<std::string> lines;
    for (const std::string &location : locations) {
        if (location.size() > kLongestLocation) {
            lines.push_back(fmt::format("the library cuts this location at {} bytes: {}",
                                        kLongestLocation, location));
        }
    }
    if (locations.size() > kMostPackages) {
        lines.push_back(
            fmt::format("the library takes {} packages at a time and leaves the last {} out",
                        kMostPackages, locations.size() - kMostPackages));
    }
    return lines;
}

}  // namespace velkhost::cli
