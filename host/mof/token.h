// The words that a MOF source is made of.
#pragma once

#include "host/mof/diagnostics.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::mof {

enum class TokenKind { kIdentifier, kInteger, kReal, kString, kCharacter, kPunctuation, kEnd };

// `spelling` is a view of the source.
struct Token {
    TokenKind kind = TokenKind::kEnd;
    std::string_view spelling;
    Position position;
    std::string text;             // a string's or character's content, decoded; a real as spelled
    bool negative = false;        // of an integer
    std::uint64_t magnitude = 0;  // of an integer
    bool damaged = false;  // already reported; what follows on its line is not worth reporting
};

// A token as an error message names what was found: 'name', "text", end of file.
std::string describe(const Token &token);

}  // namespace velkhost::mof
