#include "host/mof/lexer.h"

#include "host/mof/numbers.h"
#include "host/mof/quoted.h"
#include "host/mof/utf8.h"

#include <utility>

namespace velkhost::mof {
namespace {

constexpr std::string_view kPunctuation = "{}[]():;,=#$";

constexpr bool is_digit(char byte) {
    return byte >= '0' && byte <= '9';
}

// Beyond ASCII every character may stand in an identifier.
constexpr bool is_name_start(char byte) {
    const char folded = static_cast<char>(byte | 0x20);
    return (folded >= 'a' && folded <= 'z') || byte == '_' ||
           static_cast<unsigned char>(byte) >= 0x80;
}

constexpr bool is_name_part(char byte) {
    return is_name_start(byte) || is_digit(byte);
}

constexpr bool is_sign(char byte) {
    return byte == '+' || byte == '-';
}

bool starts_number(const Cursor &cursor) {
    const std::size_t sign = is_sign(cursor.peek()) ? 1 : 0;
    const std::size_t point = cursor.peek(sign) == '.' ? 1 : 0;
    return is_digit(cursor.peek(sign + point));
}

// Passes everything that belongs to a number or, had it a correct form, could.
void skip_number(Cursor &cursor) {
    bool seen_point = false;
    char last = '\0';
    const auto belongs = [&](char byte) {
        const bool exponent_sign = is_sign(byte) && seen_point && (last == 'e' || last == 'E');
        return is_name_part(byte) || byte == '.' || exponent_sign;
    };
    do {
        last = cursor.peek();
        seen_point = seen_point || last == '.';
        cursor.advance();
    } while (belongs(cursor.peek()));
}

}  // namespace

std::string describe(const Token &token) {
    switch (token.kind) {
        case TokenKind::kEnd:
            return "end of file";
        case TokenKind::kString:
            return "string " + shown(token.text);
        default:
            return shown(token.spelling);
    }
}

Token Lexer::next() {
    for (skip_unseen(); !cursor_.at_end() && !errors_.closed(); skip_unseen()) {
        const char first = cursor_.peek();
        if (is_name_start(first)) {
            return identifier();
        }
        if (starts_number(cursor_)) {
            return number();
        }
        if (first == '"') {
            return string();
        }
        if (first == '\'') {
            return character();
        }
        if (kPunctuation.find(first) != std::string_view::npos) {
            return punctuation();
        }
        report_stray_character();
    }
    return begin(TokenKind::kEnd);
}

void Lexer::skip_unseen() {
    constexpr std::string_view kBlanks = " \t\r\n\f\v";
    while (!cursor_.at_end()) {
        if (kBlanks.find(cursor_.peek()) != std::string_view::npos) {
            cursor_.advance();
        } else if (cursor_.starts_with("//")) {
            while (!cursor_.at_end() && cursor_.peek() != '\n') {
                cursor_.advance();
            }
        } else if (cursor_.starts_with("/*")) {
            skip_block_comment();
        } else {
            return;
        }
    }
}

void Lexer::skip_block_comment() {
    const Position start = cursor_.position();
    cursor_.advance(2);
    while (!cursor_.at_end() && !cursor_.starts_with("*/")) {
        cursor_.advance();
    }
    if (cursor_.at_end()) {
        errors_.add(start, "expected */ to end this comment, found end of file");
        errors_.close();
    }
    cursor_.advance(2);
}

// A run of one and the same stray character is one mistake.
void Lexer::report_stray_character() {
    const char stray = cursor_.peek();
    errors_.add(cursor_.position(),
                "expected a declaration, a name or a value, found " + shown({&stray, 1}));
    while (!cursor_.at_end() && cursor_.peek() == stray) {
        cursor_.advance();
    }
}

Token Lexer::begin(TokenKind kind) const {
    Token token;
    token.kind = kind;
    token.position = cursor_.position();
    return token;
}

Token Lexer::identifier() {
    Token token = begin(TokenKind::kIdentifier);
    const std::size_t start = cursor_.offset();
    while (is_name_part(cursor_.peek())) {
        cursor_.advance();
    }
    token.spelling = cursor_.text_since(start);
    return token;
}

Token Lexer::number() {
    Token token = begin(TokenKind::kInteger);
    const std::size_t start = cursor_.offset();
    skip_number(cursor_);
    token.spelling = cursor_.text_since(start);
    const auto number = parse_number(token.spelling);
    if (!number) {
        token.damaged = true;
        errors_.add(token.position,
                    "expected a number that 64 bits can hold, found " + shown(token.spelling));
        return token;
    }
    token.kind = number->real ? TokenKind::kReal : TokenKind::kInteger;
    token.negative = number->negative;
    token.magnitude = number->magnitude;
    token.text = token.spelling;
    return token;
}

Token Lexer::string() {
    Token token = begin(TokenKind::kString);
    const std::size_t start = cursor_.offset();
    QuotedText quoted = read_quoted(cursor_, errors_);
    token.spelling = cursor_.text_since(start);
    token.text = std::move(quoted.text);
    token.damaged = !quoted.intact;
    return token;
}

Token Lexer::character() {
    Token token = string();
    token.kind = TokenKind::kCharacter;
    // A char16 is one UTF-16 code unit; four bytes of UTF-8 need two of them.
    const bool fits = count_characters(token.text) == 1 && token.text.size() < 4;
    if (!fits && !token.damaged) {
        token.damaged = true;
        errors_.add(token.position,
                    "expected one 16-bit character in quotes, found " + shown(token.spelling));
    }
    return token;
}

Token Lexer::punctuation() {
    Token token = begin(TokenKind::kPunctuation);
    const std::size_t start = cursor_.offset();
    cursor_.advance();
    token.spelling = cursor_.text_since(start);
    return token;
}

}  // namespace velkhost::mof
