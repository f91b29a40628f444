// Doubles of the adapter vendors' providers: classes with the instances, methods and associations
// that a test gives them.
#pragma once

#include <cmpi/cmpift.h>

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/broker/broker.h"
#include "host/cim/instance.h"

namespace velktest {

using velkhost::cim::NamedValues;
using velkhost::cim::Value;

struct VendorInstance {
    NamedValues keys;
    NamedValues properties;
};

// How a method call ends.
struct VendorAnswer {
    std::uint32_t value = 0;
    NamedValues outputs;
    CMPIrc code = CMPI_RC_OK;
    std::string message;
};

class VendorClass {
  public:
    VendorClass(std::string name_space, std::string name);
    VendorClass(const VendorClass &) = delete;
    VendorClass &operator=(const VendorClass &) = delete;

    // What a broker registers; valid as long as this object, which makes its objects with `broker`.
    velkhost::broker::ManagementInterfaces interfaces(const CMPIBroker *broker);

    [[nodiscard]] const std::string &name_space() const { return name_space_; }
    [[nodiscard]] const std::string &name() const { return name_; }

    // What an enumeration finds.
    std::vector<VendorInstance> instances;

    // What one enumeration after the other finds instead, the last one for ever; no value for one
    // that fails.
    std::deque<std::optional<std::vector<VendorInstance>>> enumerations;

    // What an instance shows when it is asked for by name: one look after the other, the last one
    // for ever. Without any there is no such instance.
    std::deque<NamedValues> looks;

    // What each method answers: likewise. Methods without an answer do not exist.
    std::map<std::string, std::deque<VendorAnswer>> answers;

    // As an association: the instances behind the source of which a key has this text; no value for
    // a traversal that fails. Sources that are not here lead nowhere.
    std::map<std::string, std::optional<std::vector<VendorInstance>>> linked;

    // A method call takes so long, and this happens meanwhile.
    unsigned seconds = 0;
    std::function<void()> on_call;

    // The objects that methods were called on, as text.
    std::vector<std::string> targets;

  private:
    friend struct VendorTables;

    [[nodiscard]] CMPIInstance *make(const std::string &class_name,
                                     const VendorInstance &instance) const;
    CMPIStatus enumerate(const CMPIResult *result);
    CMPIStatus read(const CMPIResult *result);
    CMPIStatus traverse(const CMPIResult *result, const CMPIObjectPath *source,
                        const char *result_class) const;
    CMPIStatus invoke(const CMPIResult *result, const CMPIObjectPath *path,
                      const std::string &method, CMPIArgs *out);

    std::string name_space_;
    std::string name_;
    const CMPIBroker *broker_ = nullptr;
    CMPIInstanceMI instance_mi_;
    CMPIAssociationMI association_mi_;
    CMPIMethodMI method_mi_;
};

// A text property or key; a list of texts.
inline Value text(std::string value) {
    return Value::string(std::move(value));
}
Value texts(const std::vector<std::string> &values);

}  // namespace velktest
