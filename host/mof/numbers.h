// The number literals of MOF (DSP0004, annex A): decimal, octal, hexadecimal, binary and real.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace velkhost::mof {

struct Number {
    bool real = false;
    bool negative = false;
    std::uint64_t magnitude = 0;  // of an integer
};

// Reads a whole spelling, sign included: 12, 0, 017, 0x1F, 101b, -1.5e+3. No value: it is no
// number, or it fits neither 64 bits nor a double.
std::optional<Number> parse_number(std::string_view spelling);

}  // namespace velkhost::mof
