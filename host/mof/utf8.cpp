#include "host/mof/utf8.h"

#include <algorithm>
#include <array>

namespace velkhost::mof {
namespace {

struct SequenceForm {
    unsigned char lead_mask;
    unsigned char lead;
    std::size_t length;
    std::uint32_t smallest;
};

constexpr std::array<SequenceForm, 4> kForms = {{
    {0x80, 0x00, 1, 0x0},
    {0xE0, 0xC0, 2, 0x80},
    {0xF0, 0xE0, 3, 0x800},
    {0xF8, 0xF0, 4, 0x10000},
}};

constexpr unsigned char byte_of(std::uint32_t bits) {
    return static_cast<unsigned char>(bits);
}

bool is_scalar(std::uint32_t code_point) {
    const bool surrogate = code_point >= kHighSurrogates && code_point < kSurrogatesEnd;
    return !surrogate && code_point <= 0x10FFFF;
}

// The length of the valid sequence that the text begins with, or 0.
std::size_t sequence_length(std::string_view text) {
    const auto lead = static_cast<unsigned char>(text.front());
    const auto form = std::find_if(kForms.begin(), kForms.end(), [lead](const SequenceForm &each) {
        return (lead & each.lead_mask) == each.lead;
    });
    if (form == kForms.end() || text.size() < form->length) {
        return 0;
    }
    std::uint32_t code_point = byte_of(lead & ~static_cast<unsigned>(form->lead_mask));
    for (const char byte : text.substr(1, form->length - 1)) {
        if (!is_utf8_continuation(byte)) {
            return 0;
        }
        code_point = code_point << 6U | (static_cast<unsigned char>(byte) & 0x3FU);
    }
    return code_point >= form->smallest && is_scalar(code_point) ? form->length : 0;
}

}  // namespace

void append_utf8(std::string &out, std::uint32_t code_point) {
    auto form = kForms.rbegin();
    while (code_point < form->smallest) {
        ++form;
    }
    const std::size_t trailing = form->length - 1;
    out += static_cast<char>(byte_of(form->lead | code_point >> (6 * trailing)));
    for (std::size_t left = trailing; left > 0; --left) {
        out += static_cast<char>(byte_of(0x80U | (code_point >> (6 * (left - 1)) & 0x3FU)));
    }
}

std::size_t count_characters(std::string_view text) {
    return text.size() -
           static_cast<std::size_t>(std::count_if(text.begin(), text.end(), is_utf8_continuation));
}

std::size_t find_invalid_utf8(std::string_view text) {
    std::size_t offset = 0;
    while (offset < text.size()) {
        const std::size_t length = sequence_length(text.substr(offset));
        if (length == 0) {
            return offset;
        }
        offset += length;
    }
    return offset;
}

}  // namespace velkhost::mof
