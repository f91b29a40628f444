#include "host/providers/kit/building.h"

#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/reading.h"

#include <cmpi/cmpimacs.h>

#include <type_traits>

namespace velkhost::providers {
namespace {

void check(const CMPIStatus &status, const std::string &what) {
    if (status.rc != CMPI_RC_OK) {
        throw CimError(status.rc, "The broker refused " + what + ": " +
                                      text_of(status.msg).value_or("no reason"));
    }
}

// A text goes through the interface as the characters themselves, not as a value that names them.
const CMPIValue *chars(const Text &text) {
    return text ? reinterpret_cast<const CMPIValue *>(text->c_str()) : nullptr;
}

CMPIDateTime *make(const Maker &maker, const DateTime &time) {
    CMPIStatus made{CMPI_RC_OK, nullptr};
    CMPIDateTime *out = CMNewDateTimeFromBinary(maker.broker, time.micros,
                                                static_cast<CMPIBoolean>(time.is_interval), &made);
    check(made, "a date");
    return out;
}

template <typename T, typename Set>
CMPIArray *make_array(const Maker &maker, const std::vector<T> &values, CMPIType type, Set set) {
    CMPIStatus made{CMPI_RC_OK, nullptr};
    CMPIArray *out = CMNewArray(maker.broker, static_cast<CMPICount>(values.size()), type, &made);
    check(made, "an array");
    for (CMPICount i = 0; i < values.size(); ++i) {
        check(set(out, i, values[i]), "an array's element");
    }
    return out;
}

CMPIArray *make(const Maker &maker, const std::vector<std::uint16_t> &numbers) {
    return make_array(maker, numbers, CMPI_uint16,
                      [](CMPIArray *array, CMPICount i, std::uint16_t number) {
                          CMPIValue element{};
                          element.uint16 = number;
                          return CMSetArrayElementAt(array, i, &element, CMPI_uint16);
                      });
}

CMPIArray *make(const Maker &maker, const std::vector<std::string> &texts) {
    return make_array(maker, texts, CMPI_string,
                      [](CMPIArray *array, CMPICount i, const Text &text) {
                          return CMSetArrayElementAt(array, i, chars(text), CMPI_chars);
                      });
}

// Hands `value` to `sink(const CMPIValue *, CMPIType)` in the form that its type asks for.
template <typename Sink>
CMPIStatus pass(const Maker &maker, const Value &value, Sink sink) {
    return std::visit(
        [&](const auto &held) {
            using Held = std::decay_t<decltype(held)>;
            CMPIValue out{};
            if constexpr (std::is_same_v<Held, Text>) {
                return sink(chars(held), CMPI_chars);
            } else if constexpr (std::is_same_v<Held, Reference>) {
                out.ref = maker.path(held);
                return sink(&out, CMPI_ref);
            } else if constexpr (std::is_same_v<Held, DateTime>) {
                out.dateTime = make(maker, held);
                return sink(&out, CMPI_dateTime);
            } else if constexpr (std::is_same_v<Held, std::vector<std::uint16_t>>) {
                out.array = make(maker, held);
                return sink(&out, CMPI_uint16A);
            } else if constexpr (std::is_same_v<Held, std::vector<std::string>>) {
                out.array = make(maker, held);
                return sink(&out, CMPI_stringA);
            } else if constexpr (std::is_same_v<Held, bool>) {
                out.boolean = static_cast<CMPIBoolean>(held);
                return sink(&out, CMPI_boolean);
            } else if constexpr (std::is_same_v<Held, std::uint8_t>) {
                out.uint8 = held;
                return sink(&out, CMPI_uint8);
            } else if constexpr (std::is_same_v<Held, std::uint16_t>) {
                out.uint16 = held;
                return sink(&out, CMPI_uint16);
            } else if constexpr (std::is_same_v<Held, std::uint32_t>) {
                out.uint32 = held;
                return sink(&out, CMPI_uint32);
            } else {
                out.uint64 = held;
                return sink(&out, CMPI_uint64);
            }
        },
        value);
}

void set_property(const Maker &maker, CMPIInstance *instance, const Property &property) {
    const auto sink = [&](const CMPIValue *value, CMPIType type) {
        return CMSetProperty(instance, property.name.c_str(), value, type);
    };
    check(pass(maker, property.value, sink), "property " + property.name);
}

bool is_wanted(const std::string &name, const char **wanted) {
    if (wanted == nullptr) {
        return true;
    }
    for (; *wanted != nullptr; ++wanted) {
        if (same_name(name, *wanted)) {
            return true;
        }
    }
    return false;
}

}  // namespace

CMPIObjectPath *Maker::path(const Reference &reference) const {
    CMPIStatus made{CMPI_RC_OK, nullptr};
    CMPIObjectPath *out =
        CMNewObjectPath(broker, name_space.c_str(), reference.class_name.c_str(), &made);
    check(made, "a path of " + reference.class_name);
    if (out == nullptr) {
        throw CimError(CMPI_RC_ERR_FAILED, "The broker made no path of " + reference.class_name);
    }
    for (const Property &key : reference.keys) {
        const auto sink = [&](const CMPIValue *value, CMPIType type) {
            return CMAddKey(out, key.name.c_str(), value, type);
        };
        check(pass(*this, key.value, sink), "key " + key.name);
    }
    return out;
}

CMPIInstance *Maker::instance(const std::string &class_name, const Instance &data,
                              const char **wanted) const {
    CMPIStatus made{CMPI_RC_OK, nullptr};
    CMPIInstance *out = CMNewInstance(broker, path({class_name, data.keys}), &made);
    check(made, "an instance of " + class_name);
    if (out == nullptr) {
        throw CimError(CMPI_RC_ERR_FAILED, "The broker made no instance of " + class_name);
    }
    // Some brokers copy the keys of the path into properties, others do not.
    for (const Property &key : data.keys) {
        set_property(*this, out, key);
    }
    for (const Property &property : data.properties) {
        if (is_wanted(property.name, wanted)) {
            set_property(*this, out, property);
        }
    }
    return out;
}

void Maker::add_argument(CMPIArgs *args, const Property &argument) const {
    if (args == nullptr) {
        return;
    }
    const auto sink = [&](const CMPIValue *value, CMPIType type) {
        return CMAddArg(args, argument.name.c_str(), value, type);
    };
    check(pass(*this, argument.value, sink), "argument " + argument.name);
}

CMPIStatus Maker::status(CMPIrc code, const std::string &message) const {
    return {code, CMNewString(broker, message.c_str(), nullptr)};
}

}  // namespace velkhost::providers
