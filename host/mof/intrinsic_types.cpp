#include "host/mof/intrinsic_types.h"

#include "host/cim/names.h"

#include <algorithm>
#include <array>
#include <limits>

namespace velkhost::mof {
namespace {

template <typename Integer>
constexpr IntrinsicType integer(std::string_view name, CMPIType type) {
    constexpr auto kMax = static_cast<std::uint64_t>(std::numeric_limits<Integer>::max());
    return {name, type, ValueClass::kInteger, kMax,
            std::numeric_limits<Integer>::is_signed ? kMax + 1 : 0};
}

constexpr IntrinsicType other(std::string_view name, CMPIType type, ValueClass takes) {
    return {name, type, takes, 0, 0};
}

// The last row is none that a MOF can name.
constexpr std::array<IntrinsicType, 15> kTypes = {{
    integer<std::uint8_t>("uint8", CMPI_uint8),
    integer<std::uint16_t>("uint16", CMPI_uint16),
    integer<std::uint32_t>("uint32", CMPI_uint32),
    integer<std::uint64_t>("uint64", CMPI_uint64),
    integer<std::int8_t>("sint8", CMPI_sint8),
    integer<std::int16_t>("sint16", CMPI_sint16),
    integer<std::int32_t>("sint32", CMPI_sint32),
    integer<std::int64_t>("sint64", CMPI_sint64),
    other("real32", CMPI_real32, ValueClass::kReal),
    other("real64", CMPI_real64, ValueClass::kReal),
    other("boolean", CMPI_boolean, ValueClass::kBoolean),
    other("char16", CMPI_char16, ValueClass::kCharacter),
    other("string", CMPI_string, ValueClass::kText),
    other("datetime", CMPI_dateTime, ValueClass::kDateTime),
    other("reference", CMPI_ref, ValueClass::kText),
}};

std::string range_of(const IntrinsicType &type) {
    const std::string low = type.max_negative == 0 ? "0" : "-" + std::to_string(type.max_negative);
    return " (" + low + " to " + std::to_string(type.max_magnitude) + ")";
}

}  // namespace

const IntrinsicType *find_intrinsic(std::string_view name) {
    const auto *const found =
        std::find_if(kTypes.begin(), kTypes.end() - 1,
                     [name](const IntrinsicType &each) { return cim::same_name(each.name, name); });
    return found == kTypes.end() - 1 ? nullptr : found;
}

const IntrinsicType &intrinsic_of(CMPIType type) {
    const auto *const found =
        std::find_if(kTypes.begin(), kTypes.end() - 1,
                     [type](const IntrinsicType &each) { return each.type == element_of(type); });
    return *found;
}

std::string expectation(const IntrinsicType &type) {
    const std::string value = "a " + std::string{type.name} + " value";
    return type.takes == ValueClass::kInteger ? value + range_of(type) : value;
}

bool is_date_time(std::string_view text) {
    constexpr std::string_view kTimestamp = "dddddddddddddd.dddddd+ddd";
    if (text.size() != kTimestamp.size()) {
        return false;
    }
    const bool interval = text[21] == ':';
    const auto fits = [interval](char byte, char wanted) {
        switch (wanted) {
            case 'd':
                return byte == '*' || (byte >= '0' && byte <= '9');
            case '+':
                return interval || byte == '+' || byte == '-';
            default:
                return byte == wanted;
        }
    };
    return std::equal(text.begin(), text.end(), kTimestamp.begin(), fits) &&
           (!interval || text.ends_with(":000"));
}

}  // namespace velkhost::mof
