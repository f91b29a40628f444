// Small helpers for what the guest prints and measures.
#pragma once

#include <charconv>
#include <chrono>
#include <cstdio>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace velkguest {

inline std::string hex(unsigned char byte) {
    constexpr std::string_view kDigits = "0123456789ABCDEF";
    return {kDigits[byte >> 4], kDigits[byte & 0x0F]};
}

inline std::string hex(std::span<const unsigned char> bytes) {
    std::string out;
    for (const unsigned char byte : bytes) {
        out += (out.empty() ? "" : " ") + hex(byte);
    }
    return out;
}

inline std::vector<std::string> split(std::string_view text, char separator) {
    std::vector<std::string> out;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find(separator), text.size());
        out.emplace_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return out;
}

inline int number(std::string_view text, int base = 10) {
    int value = 0;
    std::from_chars(text.data(), text.data() + text.size(), value, base);
    return value;
}

// One line for the test on the host; whole lines do not mix.
inline void say(std::string_view line) {
    std::printf("velk: %.*s\n", static_cast<int>(line.size()), line.data());
    std::fflush(stdout);
}

class Stopwatch {
  public:
    [[nodiscard]] long ms() const {
        using namespace std::chrono;
        return static_cast<long>(duration_cast<milliseconds>(steady_clock::now() - start_).count());
    }

  private:
    std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
};

}  // namespace velkguest
