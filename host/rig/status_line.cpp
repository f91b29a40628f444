#include "host/rig/status_line.h"

#include <charconv>

namespace velkhost::rig {
namespace {

constexpr std::string_view kMark = ": ";

// The whole of `text` as a number.
std::optional<int> parse_int(std::string_view text) {
    int number = 0;
    const char *const end = text.data() + text.size();
    const auto [rest, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc() || rest != end) {
        return std::nullopt;
    }
    return number;
}

// Cuts the text up to `separator` off the front of `rest`; no value when there is no separator.
std::optional<std::string_view> take_until(std::string_view &rest, char separator) {
    const std::size_t end = rest.find(separator);
    if (end == std::string_view::npos) {
        return std::nullopt;
    }
    const std::string_view piece = rest.substr(0, end);
    rest.remove_prefix(end + 1);
    return piece;
}

void add_piece(StatusLine &line, std::string_view piece) {
    if (auto package = parse_package_status(piece)) {
        line.packages.push_back(*std::move(package));
    } else if (!line.packages.empty()) {
        line.packages.back().message.append("|").append(piece);
    } else {
        line.packages.push_back({std::string(piece), std::nullopt, {}});
    }
}

}  // namespace

std::optional<PackageStatus> parse_package_status(std::string_view text) {
    std::size_t mark = text.find(kMark);
    while (mark != std::string_view::npos) {
        const std::size_t begin = mark + kMark.size();
        const std::size_t end = text.find(kMark, begin);
        if (end == std::string_view::npos) {
            return std::nullopt;
        }
        if (const auto code = parse_int(text.substr(begin, end - begin))) {
            return PackageStatus{std::string(text.substr(0, mark)), code,
                                 std::string(text.substr(end + kMark.size()))};
        }
        mark = end;
    }
    return std::nullopt;
}

std::optional<StatusLine> parse_status_line(std::string_view text) {
    const auto overall = take_until(text, '|');
    if (!overall || !parse_int(*overall)) {
        return std::nullopt;
    }
    StatusLine line{*parse_int(*overall), {}, false};
    while (const auto piece = take_until(text, '|')) {
        add_piece(line, *piece);
    }
    line.cut = !text.empty();
    if (line.cut) {
        const auto package = parse_package_status(text);
        line.packages.push_back(
            package.value_or(PackageStatus{std::string(text), std::nullopt, {}}));
    }
    return line;
}

std::string package_id(std::string_view location) {
    const std::size_t slash = location.rfind('/');
    std::string_view name = slash == std::string_view::npos ? location : location.substr(slash + 1);
    return std::string(name.substr(0, name.rfind('.')));
}

}  // namespace velkhost::rig
