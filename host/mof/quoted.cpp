#include "host/mof/quoted.h"

#include "host/mof/utf8.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <optional>
#include <utility>

namespace velkhost::mof {
namespace {

constexpr std::size_t kMaxHexDigits = 4;

constexpr std::array<std::pair<char, char>, 8> kSimpleEscapes = {{
    {'b', '\b'},
    {'t', '\t'},
    {'n', '\n'},
    {'f', '\f'},
    {'r', '\r'},
    {'"', '"'},
    {'\'', '\''},
    {'\\', '\\'},
}};

constexpr std::string_view kEscapesExpected =
    R"(expected \b \t \n \f \r \" \' \\ or \x with 1 to 4 hexadecimal digits)";

bool at_line_end(const Cursor &cursor) {
    return cursor.at_end() || cursor.peek() == '\n' || cursor.peek() == '\r';
}

int hex_digit(char byte) {
    if (byte >= '0' && byte <= '9') {
        return byte - '0';
    }
    const char folded = static_cast<char>(byte | 0x20);
    return folded >= 'a' && folded <= 'f' ? folded - 'a' + 10 : -1;
}

// \x and its digits: one UTF-16 code unit. The cursor is only moved when there is one.
std::optional<std::uint32_t> read_hex_escape(Cursor &cursor) {
    const bool marked = cursor.peek() == '\\' && (cursor.peek(1) == 'x' || cursor.peek(1) == 'X');
    std::uint32_t unit = 0;
    std::size_t digits = 0;
    while (marked && digits < kMaxHexDigits && hex_digit(cursor.peek(2 + digits)) >= 0) {
        unit = unit * 16 + static_cast<std::uint32_t>(hex_digit(cursor.peek(2 + digits)));
        ++digits;
    }
    if (digits == 0) {
        return std::nullopt;
    }
    cursor.advance(2 + digits);
    return unit;
}

// The code point of one or, for a surrogate pair, two hexadecimal escapes. NUL is no character of
// a CIM string.
std::optional<std::uint32_t> read_code_point(Cursor &cursor) {
    const auto first = read_hex_escape(cursor);
    if (!first || *first == 0 || (*first >= kLowSurrogates && *first < kSurrogatesEnd)) {
        return std::nullopt;
    }
    if (*first < kHighSurrogates || *first >= kSurrogatesEnd) {
        return first;
    }
    const auto second = read_hex_escape(cursor);
    if (!second || *second < kLowSurrogates || *second >= kSurrogatesEnd) {
        return std::nullopt;
    }
    return 0x10000 + ((*first - kHighSurrogates) << 10U) + (*second - kLowSurrogates);
}

// Reads one escape; false when it is none, the cursor then stands at or behind its start.
bool read_escape(Cursor &cursor, std::string &text) {
    const auto *const simple =
        std::find_if(kSimpleEscapes.begin(), kSimpleEscapes.end(),
                     [&cursor](const auto &each) { return each.first == cursor.peek(1); });
    if (simple != kSimpleEscapes.end()) {
        cursor.advance(2);
        text += simple->second;
        return true;
    }
    const auto code_point = read_code_point(cursor);
    if (code_point) {
        append_utf8(text, *code_point);
    }
    return code_point.has_value();
}

// Passes what a backslash made a mess of: at least the character behind it.
void report_bad_escape(Cursor &cursor, ErrorList &errors, const Position &start,
                       std::size_t begin) {
    if (cursor.offset() == begin) {
        cursor.advance();
        if (at_line_end(cursor)) {
            return;  // what is missing then is the quote, and that will be told
        }
        do {
            cursor.advance();
        } while (is_utf8_continuation(cursor.peek()));
    }
    errors.add(start, std::string{kEscapesExpected} + ", found " + shown(cursor.text_since(begin)));
}

}  // namespace

QuotedText read_quoted(Cursor &cursor, ErrorList &errors) {
    const Position start = cursor.position();
    const char quote = cursor.peek();
    QuotedText result;
    cursor.advance();
    while (!at_line_end(cursor) && cursor.peek() != quote) {
        if (cursor.peek() != '\\') {
            result.text += cursor.peek();
            cursor.advance();
            continue;
        }
        const Position escape = cursor.position();
        const std::size_t begin = cursor.offset();
        if (!read_escape(cursor, result.text)) {
            report_bad_escape(cursor, errors, escape, begin);
            result.intact = false;
        }
    }
    if (at_line_end(cursor)) {
        errors.add(start, std::string{"expected a closing "} + quote + " on the same line, found " +
                              (cursor.at_end() ? "end of file" : "end of line"));
        result.intact = false;
    }
    if (cursor.peek() == quote) {
        cursor.advance();
    }
    return result;
}

}  // namespace velkhost::mof
