// The intrinsic types of CIM (DSP0004, 5.2.2) and what a literal must be to be a value of one.
#pragma once

#include "host/cim/class_decl.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::mof {

enum class ValueClass { kBoolean, kInteger, kReal, kText, kCharacter, kDateTime };

struct IntrinsicType {
    std::string_view name;
    CMPIType type;
    ValueClass takes;
    std::uint64_t max_magnitude;  // of a positive integer
    std::uint64_t max_negative;   // of a negative integer, without its sign
};

// The type of that name, whatever its case, or nullptr.
const IntrinsicType *find_intrinsic(std::string_view name);

// The type with that CMPI code, array or not; a reference takes the text of an object path.
const IntrinsicType &intrinsic_of(CMPIType type);

// "a uint8 value (0 to 255)", for messages.
std::string expectation(const IntrinsicType &type);

// True for "yyyymmddhhmmss.mmmmmmsutc" and "ddddddddhhmmss.mmmmmm:000", where digits may be
// asterisks (DSP0004, 5.2.4).
bool is_date_time(std::string_view text);

constexpr bool is_array(CMPIType type) {
    return (type & CMPI_ARRAY) != 0;
}

constexpr CMPIType array_of(CMPIType type) {
    return static_cast<CMPIType>(type | CMPI_ARRAY);
}

constexpr CMPIType element_of(CMPIType type) {
    return static_cast<CMPIType>(type & ~CMPI_ARRAY);
}

}  // namespace velkhost::mof
