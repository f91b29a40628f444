// The typed fields ("elements") of the controller's OEM commands: a header byte, then the value.
//
//   0x1n   n bytes
//   0x4n   n bytes that are numbers of 32 bits, most significant byte first; n is 4, 8 or 12
//   0x80 + n   n characters
#pragma once

#include "host/bmc/byte_cursor.h"
#include "host/bmc/message.h"

#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace velkhost::bmc {

using Numbers = std::vector<std::uint32_t>;
using Element = std::variant<Bytes, Numbers, std::string>;

// Every element up to the end; no value when one has an unknown header or is cut off.
std::optional<std::vector<Element>> read_elements(ByteCursor in);

// The only number, or the text, of an element; nothing when the element is of another kind.
std::optional<std::uint32_t> number_of(const Element &element);
std::optional<std::string> text_of(const Element &element);

void append_number(Bytes &out, std::uint32_t value);
void append_text(Bytes &out, std::string_view text);  // cut at 127 characters

// "5", "XFLASH", "[01 02 03]"; anything but letters, digits and punctuation in a text becomes '?'.
std::string in_words(const Element &element);

}  // namespace velkhost::bmc
