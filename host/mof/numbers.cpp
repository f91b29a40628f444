#include "host/mof/numbers.h"

#include <algorithm>
#include <charconv>

namespace velkhost::mof {
namespace {

constexpr bool is_digit(char byte) {
    return byte >= '0' && byte <= '9';
}

constexpr bool is_one_of(char byte, char small, char large) {
    return byte == small || byte == large;
}

bool all_digits(std::string_view text) {
    return std::all_of(text.begin(), text.end(), is_digit);
}

std::string_view without_sign(std::string_view text) {
    const bool has_sign = !text.empty() && (text.front() == '+' || text.front() == '-');
    return has_sign ? text.substr(1) : text;
}

std::optional<std::uint64_t> parse_digits(std::string_view digits, int base) {
    std::uint64_t value = 0;
    const char *end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, value, base);
    if (error != std::errc{} || stop != end) {
        return std::nullopt;
    }
    return value;
}

std::optional<std::uint64_t> parse_magnitude(std::string_view digits) {
    if (digits.size() > 2 && digits[0] == '0' && is_one_of(digits[1], 'x', 'X')) {
        return parse_digits(digits.substr(2), 16);
    }
    if (digits.size() > 1 && is_one_of(digits.back(), 'b', 'B')) {
        return parse_digits(digits.substr(0, digits.size() - 1), 2);
    }
    const bool octal = digits.size() > 1 && digits[0] == '0';
    return parse_digits(digits, octal ? 8 : 10);
}

// *digit "." 1*digit [ ("e" / "E") [sign] 1*digit ]
bool has_form_of_real(std::string_view text) {
    const std::size_t point = text.find('.');
    const std::size_t exponent = std::min(text.find_first_of("eE"), text.size());
    if (point >= exponent || point + 1 == exponent) {
        return false;
    }
    const bool mantissa = all_digits(text.substr(0, point)) &&
                          all_digits(text.substr(point + 1, exponent - point - 1));
    if (!mantissa || exponent == text.size()) {
        return mantissa;
    }
    const std::string_view power = without_sign(text.substr(exponent + 1));
    return !power.empty() && all_digits(power);
}

bool fits_double(std::string_view text) {
    double value = 0;
    return std::from_chars(text.data(), text.data() + text.size(), value).ec == std::errc{};
}

}  // namespace

std::optional<Number> parse_number(std::string_view spelling) {
    Number number;
    number.negative = !spelling.empty() && spelling.front() == '-';
    const std::string_view unsigned_part = without_sign(spelling);
    if (has_form_of_real(unsigned_part)) {
        number.real = true;
        return fits_double(unsigned_part) ? std::optional{number} : std::nullopt;
    }
    const auto magnitude = parse_magnitude(unsigned_part);
    if (!magnitude) {
        return std::nullopt;
    }
    number.magnitude = *magnitude;
    return number;
}

}  // namespace velkhost::mof
