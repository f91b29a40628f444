#include "host/cli/text.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <ctime>

namespace velkhost::cli {
namespace {

struct Character {
    char32_t code;
    std::size_t bytes;
    bool valid;
};

struct LeadByte {
    unsigned char mask;
    unsigned char mark;
    std::size_t bytes;
    char32_t lowest;  // shorter forms of a code are no UTF-8
};

constexpr std::array<LeadByte, 4> kLeadBytes = {{
    {0x80, 0x00, 1, 0x0},
    {0xE0, 0xC0, 2, 0x80},
    {0xF0, 0xE0, 3, 0x800},
    {0xF8, 0xF0, 4, 0x10000},
}};

bool is_scalar(char32_t code) {
    return code <= 0x10FFFF && (code < 0xD800 || code > 0xDFFF);
}

// The first character of a text that is not empty.
Character first_character(std::string_view text) {
    constexpr Character kInvalid = {U'?', 1, false};
    const auto byte = [text](std::size_t i) { return static_cast<unsigned char>(text[i]); };
    const auto *const lead =
        std::find_if(kLeadBytes.begin(), kLeadBytes.end(),
                     [&](const LeadByte &entry) { return (byte(0) & entry.mask) == entry.mark; });
    if (lead == kLeadBytes.end() || text.size() < lead->bytes) {
        return kInvalid;
    }
    char32_t code = byte(0) & static_cast<unsigned char>(~lead->mask);
    for (std::size_t i = 1; i < lead->bytes; ++i) {
        if ((byte(i) & 0xC0U) != 0x80U) {
            return kInvalid;
        }
        code = (code << 6U) | (byte(i) & 0x3FU);
    }
    return code >= lead->lowest && is_scalar(code) ? Character{code, lead->bytes, true} : kInvalid;
}

bool is_control(char32_t code) {
    const bool c0_or_c1 = code < 0x20 || (code >= 0x7F && code < 0xA0);
    // Marks that reorder what follows, and line separators.
    const bool layout = (code >= 0x200E && code <= 0x200F) || (code >= 0x2028 && code <= 0x202E) ||
                        (code >= 0x2066 && code <= 0x2069);
    return c0_or_c1 || layout;
}

struct Range {
    char32_t first;
    char32_t last;
};

template <std::size_t Size>
bool is_in(const std::array<Range, Size> &ranges, char32_t code) {
    return std::ranges::any_of(
        ranges, [code](const Range &range) { return code >= range.first && code <= range.last; });
}

constexpr std::array<Range, 7> kCombining = {{{0x300, 0x36F},
                                              {0x483, 0x489},
                                              {0x1AB0, 0x1AFF},
                                              {0x1DC0, 0x1DFF},
                                              {0x200B, 0x200D},
                                              {0x20D0, 0x20FF},
                                              {0xFE00, 0xFE0F}}};

constexpr std::array<Range, 9> kWide = {{{0x1100, 0x115F},
                                         {0x2E80, 0x303E},
                                         {0x3041, 0xA4CF},
                                         {0xAC00, 0xD7A3},
                                         {0xF900, 0xFAFF},
                                         {0xFE30, 0xFE6F},
                                         {0xFF00, 0xFF60},
                                         {0x1F300, 0x1FAFF},
                                         {0x20000, 0x3FFFD}}};

std::size_t columns_of(char32_t code) {
    if (is_in(kCombining, code)) {
        return 0;
    }
    return is_in(kWide, code) ? 2 : 1;
}

// As many characters as fit.
std::string_view fitting(std::string_view text, std::size_t width) {
    std::size_t length = 0;
    std::size_t used = 0;
    while (length < text.size()) {
        const Character next = first_character(text.substr(length));
        used += columns_of(next.code);
        if (used > width) {
            break;
        }
        length += next.bytes;
    }
    return text.substr(0, length);
}

}  // namespace

std::string printable(std::string_view text, bool ascii) {
    std::string result;
    while (!text.empty()) {
        const Character next = first_character(text);
        if (next.valid && !is_control(next.code) && !(ascii && next.code >= 0x80)) {
            result.append(text.substr(0, next.bytes));
        } else {
            result += '?';
        }
        text.remove_prefix(next.bytes);
    }
    return result;
}

std::size_t columns(std::string_view text) {
    std::size_t count = 0;
    while (!text.empty()) {
        const Character next = first_character(text);
        count += columns_of(next.code);
        text.remove_prefix(next.bytes);
    }
    return count;
}

std::string cut(std::string_view text, std::size_t width, std::string_view mark) {
    if (columns(text) <= width) {
        return std::string(text);
    }
    const std::string_view fitting_mark = fitting(mark, width);
    std::string result(fitting(text, width - columns(fitting_mark)));
    return result.append(fitting_mark);
}

std::string padded(std::string_view text, std::size_t width) {
    const std::size_t used = columns(text);
    return std::string(text) + std::string(width > used ? width - used : 0, ' ');
}

std::string elapsed(std::int64_t us) {
    const std::int64_t seconds = std::max<std::int64_t>(us, 0) / 1'000'000;
    return fmt::format("{:02}:{:02}:{:02}", seconds / 3600, seconds / 60 % 60, seconds % 60);
}

std::string iso_time(std::int64_t us) {
    const auto seconds = static_cast<std::time_t>(us / 1'000'000);
    std::tm utc{};
    gmtime_r(&seconds, &utc);
    return fmt::format("{:04}-{:02}-{:02}T{:02}:{:02}:{:02}Z", utc.tm_year + 1900, utc.tm_mon + 1,
                       utc.tm_mday, utc.tm_hour, utc.tm_min, utc.tm_sec);
}

}  // namespace velkhost::cli
