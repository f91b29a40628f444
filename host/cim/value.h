// A CIM value outside of any broker object: what clients give and get, what the broker stores.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace velkhost::cim {

struct ObjectPath;
struct Instance;

// A string that is there but has no text: what a null char pointer becomes in a key or argument.
// Its state is good, unlike that of a null value.
struct NullText {
    bool operator==(const NullText &) const = default;
};

class Value {
  public:
    using Array = std::vector<Value>;
    using PathPointer = std::shared_ptr<const ObjectPath>;
    using InstancePointer = std::shared_ptr<const Instance>;
    using Content =
        std::variant<std::monostate, NullText, bool, std::uint64_t, std::int64_t, double,
                     std::string, PathPointer, InstancePointer, Array, CMPIValuePtr>;

    // The untyped null.
    Value() = default;

    // `content` must be what `type` asks for: bool for CMPI_boolean, uint64_t for unsigned integers
    // and char16, int64_t for signed ones, double for reals, std::string for string, chars and
    // dateTime (25 characters, DSP0004, 5.2.4), Array for array types; monostate for null.
    Value(CMPIType type, Content content) : type_(type), content_(std::move(content)) {}

    static Value null(CMPIType type) { return {type, std::monostate{}}; }
    static Value boolean(bool value) { return {CMPI_boolean, value}; }
    static Value uint8(std::uint8_t value) { return {CMPI_uint8, std::uint64_t{value}}; }
    static Value uint16(std::uint16_t value) { return {CMPI_uint16, std::uint64_t{value}}; }
    static Value uint32(std::uint32_t value) { return {CMPI_uint32, std::uint64_t{value}}; }
    static Value uint64(std::uint64_t value) { return {CMPI_uint64, value}; }
    static Value sint32(std::int32_t value) { return {CMPI_sint32, std::int64_t{value}}; }
    static Value sint64(std::int64_t value) { return {CMPI_sint64, value}; }
    static Value real64(double value) { return {CMPI_real64, value}; }
    static Value string(std::string text) { return {CMPI_string, std::move(text)}; }
    static Value date_time(std::string text) { return {CMPI_dateTime, std::move(text)}; }
    static Value reference(ObjectPath path);
    static Value instance(Instance instance);
    // `element_type` without CMPI_ARRAY.
    static Value array(CMPIType element_type, Array elements);

    [[nodiscard]] CMPIType type() const { return type_; }
    [[nodiscard]] const Content &content() const { return content_; }
    [[nodiscard]] bool is_array() const { return (type_ & CMPI_ARRAY) != 0; }
    // No value, or a string without text.
    [[nodiscard]] bool is_null() const;

    // The content if it is of that form, else nothing.
    [[nodiscard]] std::optional<bool> as_bool() const;
    [[nodiscard]] std::optional<std::uint64_t> as_unsigned() const;  // not for negative numbers
    [[nodiscard]] std::optional<std::int64_t> as_signed() const;     // not above INT64_MAX
    [[nodiscard]] std::optional<std::string_view> as_text() const;
    [[nodiscard]] const ObjectPath *as_path() const;
    [[nodiscard]] const Instance *as_instance() const;
    [[nodiscard]] const Array *as_array() const;

    // Same type and content; references and instances are compared by what they hold.
    bool operator==(const Value &other) const;

  private:
    CMPIType type_ = CMPI_null;
    Content content_;
};

// As CIM types it is called: "uint16", "string[]"; CMPI_chars counts as "string", CMPI_ref is
// "reference". Unknown codes give "unknown".
std::string type_name(CMPIType type);

// The code of a type name without regard to case and without an array suffix; CMPI_null if unknown.
CMPIType type_from_name(std::string_view name);

// `text` as a value of the scalar type `type`, the way a broker reads a client's value: integers
// are decimal or 0x hexadecimal and keep only the bits that the type has (70000 as uint16 is
// 4464); booleans are true or false in any case. No value when the text is of another form.
std::optional<Value> value_from_text(CMPIType type, std::string_view text);

// For people: strings in quotes, arrays in braces, NULL for no value.
std::string to_text(const Value &value);

}  // namespace velkhost::cim
