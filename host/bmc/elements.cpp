#include "host/bmc/elements.h"

#include "host/bmc/hex.h"

#include <algorithm>
#include <utility>

namespace velkhost::bmc {
namespace {

constexpr std::uint8_t kBytesType = 0x10;
constexpr std::uint8_t kNumbersType = 0x40;
constexpr std::uint8_t kTextFlag = 0x80;
constexpr std::uint8_t kTypeNibble = 0xF0;
constexpr std::uint8_t kLengthNibble = 0x0F;
constexpr std::uint8_t kTextLength = 0x7F;
constexpr std::size_t kNumberSize = 4;

std::uint32_t big_endian(std::span<const std::uint8_t> bytes) {
    std::uint32_t value = 0;
    for (const std::uint8_t byte : bytes) {
        value = value << 8 | byte;
    }
    return value;
}

// An empty list is no element: its length was lost in the header's four bits.
std::optional<Element> read_numbers(ByteCursor value) {
    if (value.at_end() || value.left() % kNumberSize != 0) {
        return std::nullopt;
    }
    Numbers numbers;
    while (const auto bytes = value.take(kNumberSize)) {
        numbers.push_back(big_endian(*bytes));
    }
    return numbers;
}

std::optional<Element> read_value(std::uint8_t header, std::span<const std::uint8_t> value) {
    if ((header & kTextFlag) != 0) {
        return std::string(value.begin(), value.end());
    }
    switch (header & kTypeNibble) {
        case kBytesType:
            return Bytes(value.begin(), value.end());
        case kNumbersType:
            return read_numbers(ByteCursor(value));
        default:
            return std::nullopt;
    }
}

std::optional<Element> read_element(ByteCursor &in) {
    const auto header = in.byte();
    if (!header) {
        return std::nullopt;
    }
    const bool is_text = (*header & kTextFlag) != 0;
    const auto value = in.take(*header & (is_text ? kTextLength : kLengthNibble));
    return value ? read_value(*header, *value) : std::nullopt;
}

bool is_printable(char c) {
    return c > ' ' && c <= '~';
}

}  // namespace

std::optional<std::vector<Element>> read_elements(ByteCursor in) {
    std::vector<Element> out;
    while (!in.at_end()) {
        auto element = read_element(in);
        if (!element) {
            return std::nullopt;
        }
        out.push_back(*std::move(element));
    }
    return out;
}

std::optional<std::uint32_t> number_of(const Element &element) {
    const auto *numbers = std::get_if<Numbers>(&element);
    return numbers != nullptr && numbers->size() == 1 ? std::optional(numbers->front())
                                                      : std::nullopt;
}

std::optional<std::string> text_of(const Element &element) {
    const auto *text = std::get_if<std::string>(&element);
    return text == nullptr ? std::nullopt : std::optional(*text);
}

void append_number(Bytes &out, std::uint32_t value) {
    out.push_back(kNumbersType | kNumberSize);
    for (int shift = 24; shift >= 0; shift -= 8) {
        out.push_back(static_cast<std::uint8_t>(value >> shift));
    }
}

void append_text(Bytes &out, std::string_view text) {
    const std::string_view fitting = text.substr(0, kTextLength);
    out.push_back(static_cast<std::uint8_t>(kTextFlag | fitting.size()));
    out.insert(out.end(), fitting.begin(), fitting.end());
}

std::string in_words(const Element &element) {
    if (const auto *bytes = std::get_if<Bytes>(&element)) {
        return "[" + hex(*bytes) + "]";
    }
    if (const auto *text = std::get_if<std::string>(&element)) {
        std::string out = *text;
        std::ranges::replace_if(
            out, [](char c) { return !is_printable(c); }, '?');
        return out;
    }
    std::string out;
    for (const std::uint32_t number : std::get<Numbers>(element)) {
        out += (out.empty() ? "" : ",") + std::to_string(number);
    }
    return out;
}

}  // namespace velkhost::bmc
