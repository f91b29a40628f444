// What a provider answers, as plain data: values, references, instances, results of methods. The
// kit turns it into the broker's objects, so that a provider's own files read as what it answers.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace velkhost::providers {

struct Property;

// The path of an instance, without its namespace: it lies where the call came in.
struct Reference {
    std::string class_name;
    std::vector<Property> keys;
};

// A moment, in microseconds since 1970-01-01 UTC, or the length of an interval.
struct DateTime {
    std::uint64_t micros = 0;
    bool is_interval = false;
};

// A text that may be null, a number of its CIM type, a reference, a time, or a list of numbers or
// texts.
using Text = std::optional<std::string>;
using Value =
    std::variant<Text, bool, std::uint8_t, std::uint16_t, std::uint32_t, std::uint64_t, Reference,
                 DateTime, std::vector<std::uint16_t>, std::vector<std::string>>;

struct Property {
    std::string name;
    Value value;
};

struct Instance {
    std::vector<Property> keys;
    std::vector<Property> properties;  // without the keys
};

// An instance with its class.
struct Element {
    std::string class_name;
    Instance instance;

    [[nodiscard]] Reference reference() const { return {class_name, instance.keys}; }
};

// What a method answers when its CIM status is success.
struct MethodResult {
    std::uint32_t return_value = 0;
    std::vector<Property> outputs;
};

}  // namespace velkhost::providers
