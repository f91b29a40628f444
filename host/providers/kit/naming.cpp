#include "host/providers/kit/naming.h"

#include "host/scenario/scenario.h"

namespace velkhost::providers {

std::string host_name() {
    return scenario::Scenario::current()->host.node;
}

std::vector<Property> service_keys(const char *system_class, const std::string &system_name,
                                   const char *class_name, const char *name) {
    return {{"SystemCreationClassName", Text(system_class)},
            {"SystemName", Text(system_name)},
            {"CreationClassName", Text(class_name)},
            {"Name", Text(name)}};
}

std::vector<Property> device_keys(const char *system_class, const char *class_name,
                                  const std::string &device_id) {
    return {{"SystemCreationClassName", Text(system_class)},
            {"SystemName", Text(host_name())},
            {"CreationClassName", Text(class_name)},
            {"DeviceID", Text(device_id)}};
}

std::vector<Property> physical_keys(const char *class_name, const std::string &tag) {
    return {{"Tag", Text(tag)}, {"CreationClassName", Text(class_name)}};
}

}  // namespace velkhost::providers
