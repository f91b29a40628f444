// The little of UTF-8 that a compiler of MOF needs (MOF is UTF-8: DSP0004, 7.1).
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::mof {

inline constexpr std::uint32_t kHighSurrogates = 0xD800;
inline constexpr std::uint32_t kLowSurrogates = 0xDC00;
inline constexpr std::uint32_t kSurrogatesEnd = 0xE000;

constexpr bool is_utf8_continuation(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U;
}

// Appends the encoding of a code point up to 0x10FFFF that is no surrogate.
void append_utf8(std::string &out, std::uint32_t code_point);

// How many characters a valid text has.
std::size_t count_characters(std::string_view text);

// The offset of the first byte that starts no valid sequence (overlong forms, surrogates and what
// lies beyond 0x10FFFF are invalid); text.size() when all is well.
std::size_t find_invalid_utf8(std::string_view text);

}  // namespace velkhost::mof
