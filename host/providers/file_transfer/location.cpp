#include "host/providers/file_transfer/location.h"

#include <algorithm>
#include <cctype>
#include <charconv>

namespace velkhost::providers {
namespace {

constexpr std::size_t kLongestName = 200;

bool is_plain(std::string_view uri) {
    return std::ranges::none_of(uri, [](unsigned char c) {
        return c <= ' ' || c == 0x7F || c == '?' || c == '#' || c == '\\';
    });
}

std::string in_small_letters(std::string_view text) {
    std::string out(text);
    std::ranges::transform(out, out.begin(),
                           [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return out;
}

// Percent encoding (RFC 3986, 2.1) undone; no value where it is broken or stands for a NUL.
std::optional<std::string> decoded(std::string_view text) {
    std::string out;
    while (!text.empty()) {
        const bool encoded = text.front() == '%';
        unsigned value = static_cast<unsigned char>(text.front());
        if (encoded) {
            const std::string_view digits = text.substr(1, 2);
            const auto [rest, error] =
                std::from_chars(digits.data(), digits.data() + digits.size(), value, 16);
            if (error != std::errc() || rest != digits.data() + 2 || value == 0) {
                return std::nullopt;
            }
        }
        out += static_cast<char>(value);
        text.remove_prefix(encoded ? 3 : 1);
    }
    return out;
}

bool is_file_name(std::string_view name) {
    return !name.empty() && name != "." && name != ".." && name.size() <= kLongestName;
}

// Whether the user information could be read.
bool read_user(std::string_view info, Location &out) {
    const std::size_t colon = info.find(':');
    out.user = decoded(info.substr(0, colon));
    if (!out.user || colon == std::string_view::npos) {
        return out.user.has_value();
    }
    out.password = decoded(info.substr(colon + 1));
    return out.password.has_value();
}

}  // namespace

std::optional<Location> parse_location(std::string_view uri) {
    constexpr std::string_view kMark = "://";
    const std::size_t mark = uri.find(kMark);
    if (mark == 0 || mark == std::string_view::npos || !is_plain(uri)) {
        return std::nullopt;
    }
    Location out;
    out.scheme = in_small_letters(uri.substr(0, mark));
    std::string_view rest = uri.substr(mark + kMark.size());
    const std::size_t slash = rest.find('/');
    const std::string_view authority = rest.substr(0, slash);
    const std::size_t at = authority.rfind('@');
    if (at != std::string_view::npos && !read_user(authority.substr(0, at), out)) {
        return std::nullopt;
    }
    rest.remove_prefix(at == std::string_view::npos ? 0 : at + 1);
    out.url = out.scheme + std::string(kMark) + std::string(rest);
    out.file_name = uri.substr(uri.rfind('/') + 1);
    const bool has_host = !rest.empty() && rest.front() != '/' && rest.front() != ':';
    if (slash == std::string_view::npos || !has_host || !is_file_name(out.file_name)) {
        return std::nullopt;
    }
    return out;
}

}  // namespace velkhost::providers
