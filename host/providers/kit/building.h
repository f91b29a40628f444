// Making the broker's objects from a provider's plain data. What is made belongs to the broker,
// which frees it when the provider call ends.
#pragma once

#include "host/providers/kit/data.h"

#include <cmpi/cmpidt.h>

#include <string>

namespace velkhost::providers {

// Where objects are made: the broker that makes them and the namespace that paths lie in.
struct Maker {
    const CMPIBroker *broker;
    std::string name_space;

    // All throw CimError when the broker refuses.
    [[nodiscard]] CMPIObjectPath *path(const Reference &reference) const;
    // Only keys and the properties in `wanted` (a list that ends with a null pointer, letter case
    // does not matter); a null list means all.
    [[nodiscard]] CMPIInstance *instance(const std::string &class_name, const Instance &data,
                                         const char **wanted) const;
    void add_argument(CMPIArgs *args, const Property &argument) const;

    // A status with a message; without one when the broker cannot make it.
    [[nodiscard]] CMPIStatus status(CMPIrc code, const std::string &message) const;
};

}  // namespace velkhost::providers
