// Values and type names as text, in both directions.
#include "host/cim/instance.h"
#include "host/cim/names.h"
#include "host/cim/value.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>

namespace velkhost::cim {
namespace {

struct TypeRow {
    CMPIType type;
    std::string_view name;
    unsigned bits;  // of an integer
};

// clang-format off
constexpr std::array kTypes{
    TypeRow{CMPI_boolean,  "boolean",   0},
    TypeRow{CMPI_char16,   "char16",    16},
    TypeRow{CMPI_real32,   "real32",    0},
    TypeRow{CMPI_real64,   "real64",    0},
    TypeRow{CMPI_uint8,    "uint8",     8},
    TypeRow{CMPI_uint16,   "uint16",    16},
    TypeRow{CMPI_uint32,   "uint32",    32},
    TypeRow{CMPI_uint64,   "uint64",    64},
    TypeRow{CMPI_sint8,    "sint8",     8},
    TypeRow{CMPI_sint16,   "sint16",    16},
    TypeRow{CMPI_sint32,   "sint32",    32},
    TypeRow{CMPI_sint64,   "sint64",    64},
    TypeRow{CMPI_string,   "string",    0},
    TypeRow{CMPI_chars,    "string",    0},
    TypeRow{CMPI_dateTime, "datetime",  0},
    TypeRow{CMPI_ref,      "reference", 0},
    TypeRow{CMPI_instance, "instance",  0},
    TypeRow{CMPI_ptr,      "pointer",   0},
};
// clang-format on

const TypeRow *row_of(CMPIType type) {
    const auto *row = std::find_if(kTypes.begin(), kTypes.end(),
                                   [type](const TypeRow &entry) { return entry.type == type; });
    return row == kTypes.end() ? nullptr : row;
}

bool is_signed_integer(CMPIType type) {
    return (type & CMPI_SINT) == CMPI_SINT;
}

// The low `bits` of the number, as the type holds them.
Value cut(CMPIType type, std::uint64_t number, unsigned bits) {
    const unsigned unused = 64 - bits;
    if (is_signed_integer(type)) {
        return {type, static_cast<std::int64_t>(number << unused) >> unused};
    }
    return {type, (number << unused) >> unused};
}

std::optional<Value> integer_from_text(const TypeRow &row, std::string_view text) {
    const bool negative = text.starts_with('-');
    if (negative || text.starts_with('+')) {
        text.remove_prefix(1);
    }
    const bool hexadecimal = text.starts_with("0x") || text.starts_with("0X");
    if (hexadecimal) {
        text.remove_prefix(2);
    }
    std::uint64_t number = 0;
    const char *end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, number, hexadecimal ? 16 : 10);
    if (read.ec != std::errc{} || read.ptr != end) {
        return std::nullopt;
    }
    return cut(row.type, negative ? ~number + 1 : number, row.bits);
}

std::optional<Value> real_from_text(CMPIType type, std::string_view text) {
    double number = 0;
    const char *end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, number);
    if (read.ec != std::errc{} || read.ptr != end) {
        return std::nullopt;
    }
    return Value{type, number};
}

std::string quoted(std::string_view text) {
    std::string result = "\"";
    for (const char letter : text) {
        if (letter == '"' || letter == '\\') {
            result += '\\';
        }
        result += letter;
    }
    return result + '"';
}

struct Render {
    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(NullText) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(std::uint64_t value) const { return std::to_string(value); }
    std::string operator()(std::int64_t value) const { return std::to_string(value); }
    std::string operator()(double value) const {
        std::array<char, 40> text{};
        std::snprintf(text.data(), text.size(), "%.17g", value);
        return text.data();
    }
    std::string operator()(const std::string &value) const { return quoted(value); }
    std::string operator()(const Value::PathPointer &path) const {
        return path ? to_text(*path) : "NULL";
    }
    std::string operator()(const Value::InstancePointer &instance) const {
        return instance ? to_text(*instance) : "NULL";
    }
    std::string operator()(const CMPIValuePtr &block) const {
        return "pointer to " + std::to_string(block.length) + " bytes";
    }
    std::string operator()(const Value::Array &elements) const {
        std::string text = "{";
        for (const Value &element : elements) {
            text += text.size() > 1 ? ", " : "";
            text += to_text(element);
        }
        return text + '}';
    }
};

}  // namespace

std::string type_name(CMPIType type) {
    const TypeRow *row = row_of(static_cast<CMPIType>(type & ~CMPI_ARRAY));
    if (row == nullptr) {
        return "unknown";
    }
    return std::string(row->name) + ((type & CMPI_ARRAY) != 0 ? "[]" : "");
}

CMPIType type_from_name(std::string_view name) {
    const auto *row = std::find_if(kTypes.begin(), kTypes.end(), [name](const TypeRow &entry) {
        return same_name(entry.name, name);
    });
    return row == kTypes.end() ? CMPI_null : row->type;
}

std::optional<Value> value_from_text(CMPIType type, std::string_view text) {
    const TypeRow *row = row_of(type);
    if (row == nullptr) {
        return std::nullopt;
    }
    if (row->bits != 0) {
        return integer_from_text(*row, text);
    }
    if (type == CMPI_real32 || type == CMPI_real64) {
        return real_from_text(type, text);
    }
    if (type == CMPI_boolean) {
        const bool yes = same_name(text, "true");
        return yes || same_name(text, "false") ? std::optional(Value::boolean(yes)) : std::nullopt;
    }
    if (type == CMPI_string || type == CMPI_chars || type == CMPI_dateTime) {
        return Value{type, std::string(text)};
    }
    return std::nullopt;
}

std::string to_text(const Value &value) {
    return std::visit(Render{}, value.content());
}

}  // namespace velkhost::cim
