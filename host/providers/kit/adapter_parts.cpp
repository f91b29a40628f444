#include "host/providers/kit/adapter_parts.h"

#include "host/providers/kit/step_fault.h"
#include "host/scenario/adapter_family.h"
#include "host/scenario/scenario.h"

#include <iterator>

namespace velkhost::providers {
namespace {

// What `list` says of every adapter of the family, one after the other.
template <typename Part>
std::vector<Part> list_all(const char *class_name, scenario::AdapterFamily family,
                           std::vector<Part> (*list)(const TaggedAdapter &)) {
    const std::string name = scenario::name_of(family);
    pass_step(name + ".adapters", class_name);
    const auto scenario = scenario::Scenario::current();
    std::vector<Part> all;
    int number = 0;
    for (const scenario::Adapter &adapter : scenario->adapters) {
        if (adapter.family == family) {
            auto parts = list({adapter, name + ':' + std::to_string(++number)});
            std::move(parts.begin(), parts.end(), std::back_inserter(all));
        }
    }
    return all;
}

}  // namespace

AdapterParts::AdapterParts(const char *class_name, scenario::AdapterFamily family, List list)
    : class_name_(class_name), family_(family), list_(list) {
    scenario::Scenario::current();  // fails while it is unusable
}

std::vector<Instance> AdapterParts::instances() {
    return list_all(class_name_, family_, list_);
}

AdapterLinks::AdapterLinks(const char *class_name, Roles roles, scenario::AdapterFamily family,
                           List list)
    : Association(roles), class_name_(class_name), family_(family), list_(list) {
    scenario::Scenario::current();  // fails while it is unusable
}

std::vector<Link> AdapterLinks::links() {
    return list_all(class_name_, family_, list_);
}

}  // namespace velkhost::providers
