#include "host/broker/datetime.h"

#include <array>
#include <chrono>
#include <cstdio>

namespace velkhost::broker::datetime {
namespace {

constexpr std::size_t kLength = 25;
constexpr std::size_t kSign = 21;
constexpr std::uint64_t kSecond = 1'000'000;
constexpr std::uint64_t kDay = 86'400 * kSecond;

std::uint64_t number(std::string_view text, std::size_t begin, std::size_t length) {
    std::uint64_t value = 0;
    for (const char letter : text.substr(begin, length)) {
        value = value * 10 + (letter >= '0' && letter <= '9' ? letter - '0' : 0U);
    }
    return value;
}

// hhmmss.mmmmmm, which both forms have at the same place.
std::uint64_t time_of_day(std::string_view text) {
    const std::uint64_t seconds =
        number(text, 8, 2) * 3600 + number(text, 10, 2) * 60 + number(text, 12, 2);
    return seconds * kSecond + number(text, 15, 6);
}

std::int64_t days_of_date(std::string_view text) {
    using namespace std::chrono;
    const year_month_day date{year(static_cast<int>(number(text, 0, 4))),
                              month(static_cast<unsigned>(number(text, 4, 2))),
                              day(static_cast<unsigned>(number(text, 6, 2)))};
    return sys_days(date).time_since_epoch().count();
}

}  // namespace

bool is_valid(std::string_view text) {
    return text.size() == kLength &&
           std::string_view("+-:").find(text[kSign]) != std::string_view::npos;
}

bool is_interval(std::string_view text) {
    return text.size() == kLength && text[kSign] == ':';
}

std::uint64_t to_microseconds(std::string_view text) {
    if (is_interval(text)) {
        return number(text, 0, 8) * kDay + time_of_day(text);
    }
    const std::uint64_t local =
        static_cast<std::uint64_t>(days_of_date(text)) * kDay + time_of_day(text);
    const std::uint64_t offset = number(text, kSign + 1, 3) * 60 * kSecond;
    return text[kSign] == '-' ? local + offset : local - offset;
}

std::string from_microseconds(std::uint64_t microseconds, bool interval) {
    using namespace std::chrono;
    const std::uint64_t days = microseconds / kDay;
    const std::uint64_t seconds = microseconds % kDay / kSecond;
    std::uint64_t date = days % 100'000'000;
    if (!interval) {
        // 2^64 microseconds end in the year 586524; the text has four digits.
        const year_month_day day{sys_days(std::chrono::days(static_cast<int>(days)))};
        const auto year = static_cast<std::uint64_t>(static_cast<int>(day.year())) % 10'000;
        date = year * 10'000 + std::uint64_t{static_cast<unsigned>(day.month())} * 100 +
               static_cast<unsigned>(day.day());
    }
    std::array<char, kLength + 40> text{};
    std::snprintf(text.data(), text.size(), "%08llu%02u%02u%02u.%06u%s",
                  static_cast<unsigned long long>(date), static_cast<unsigned>(seconds / 3600),
                  static_cast<unsigned>(seconds / 60 % 60), static_cast<unsigned>(seconds % 60),
                  static_cast<unsigned>(microseconds % kSecond), interval ? ":000" : "+000");
    return text.data();
}

}  // namespace velkhost::broker::datetime
