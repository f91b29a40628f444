// Bytes as text: "01", "0A FF".
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

namespace velkhost::bmc {

inline std::string hex(std::uint8_t byte) {
    constexpr std::string_view kDigits = "0123456789ABCDEF";
    return {kDigits[byte >> 4], kDigits[byte & 0x0F]};
}

inline std::string hex(std::span<const std::uint8_t> bytes) {
    std::string out;
    for (const std::uint8_t byte : bytes) {
        out += (out.empty() ? "" : " ") + hex(byte);
    }
    return out;
}

}  // namespace velkhost::bmc
