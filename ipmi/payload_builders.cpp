#include "ipmi/payload_builders.h"

#include <cstring>

namespace {

// Element types, in the header's high nibble.
constexpr unsigned kByteElement = 0x10;
constexpr unsigned kDwordElement = 0x40;
constexpr unsigned kStringElement = 0x80;

constexpr unsigned kLengthNibble = 0x0F;
constexpr int kDwordSize = 4;
constexpr int kHeaderSize = 1;

}  // namespace

int build_byte_payload(unsigned char *out, const unsigned char *bytes, int count) {
    const auto length = static_cast<unsigned>(count);
    *out = static_cast<unsigned char>(kByteElement | (length & kLengthNibble));
    std::memcpy(out + kHeaderSize, bytes, length);
    return count + kHeaderSize;
}

int build_dword_payload(unsigned char *out, const unsigned int *values, int count) {
    const auto length = static_cast<unsigned>(count * kDwordSize);
    *out++ = static_cast<unsigned char>(kDwordElement | (length & kLengthNibble));
    for (int i = 0; i < count; ++i) {
        for (int shift = 24; shift >= 0; shift -= 8) {
            *out++ = static_cast<unsigned char>(values[i] >> shift);
        }
    }
    return count * kDwordSize + kHeaderSize;
}

int build_string_payload(unsigned char *out, const char *text) {
    const std::size_t length = std::strlen(text);
    *out = static_cast<unsigned char>(kStringElement | length);
    std::memcpy(out + kHeaderSize, text, length + 1);
    return static_cast<int>(length) + kHeaderSize;
}
