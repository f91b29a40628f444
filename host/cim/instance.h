// Object paths and instances outside of any broker object.
#pragma once

#include "host/cim/named_values.h"

#include <string>

namespace velkhost::cim {

// The name of a class (no keys) or of an instance.
struct ObjectPath {
    std::string host;  // empty: not set
    std::string name_space;
    std::string class_name;
    NamedValues keys;

    // Host, namespace and class ignore case; keys match by name and value.
    bool operator==(const ObjectPath &other) const;
};

struct Instance {
    ObjectPath path;
    NamedValues properties;

    bool operator==(const Instance &other) const = default;
};

// `namespace:Class.key=value,key="text"`; the host stands in front as `//host/`.
std::string to_text(const ObjectPath &path);

// `instance of Class { Name=value, ... }`.
std::string to_text(const Instance &instance);

}  // namespace velkhost::cim
