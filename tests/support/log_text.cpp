#include "tests/support/log_text.h"

#include <array>
#include <cstdio>

namespace velktest {

std::string entry(std::string_view message, int elapsed) {
    const int now = kStartSecond + elapsed;
    std::array<char, 32> prefix{};
    std::snprintf(prefix.data(), prefix.size(), "[%2d:%2d:%2d] ", now / 3600 % 24, now / 60 % 60,
                  now % 60);
    return prefix.data() + std::string(message);
}

std::string entries(const std::vector<std::string_view> &messages, int elapsed) {
    std::string text;
    for (const std::string_view message : messages) {
        text += entry(message, elapsed);
    }
    return text;
}

std::string dated(std::string_view message, int elapsed) {
    const int now = kStartSecond + elapsed;
    std::array<char, 64> date{};
    std::snprintf(date.data(), date.size(), "Fri Oct  4 %02d:%02d:%02d 2024 ", now / 3600 % 24,
                  now / 60 % 60, now % 60);
    return date.data() + std::string(message) + "\n";
}

std::string dated(const std::vector<std::string_view> &messages, int elapsed) {
    std::string text;
    for (const std::string_view message : messages) {
        text += dated(message, elapsed);
    }
    return text;
}

int occurrences(std::string_view text, std::string_view part) {
    int count = 0;
    for (std::size_t at = text.find(part); at != std::string_view::npos;
         at = text.find(part, at + 1)) {
        ++count;
    }
    return count;
}

}  // namespace velktest
