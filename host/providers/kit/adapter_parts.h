// The adapters of this host as instances: each class shows one kind of part of one family's
// adapters, and each association links two kinds.
#pragma once

#include "host/providers/kit/association.h"
#include "host/providers/kit/provider.h"
#include "host/scenario/model.h"

#include <string>
#include <vector>

namespace velkhost::providers {

// An adapter, and what its physical parts are tagged with: the family and a number.
struct TaggedAdapter {
    const scenario::Adapter &about;
    std::string tag;
};

class AdapterParts : public Provider {
  public:
    // The parts of that class that an adapter has.
    using List = std::vector<Instance> (*)(const TaggedAdapter &adapter);

    // A look at the parts is a pass of the family's step "adapters". `class_name` is a literal.
    AdapterParts(const char *class_name, scenario::AdapterFamily family, List list);

    [[nodiscard]] const char *class_name() const final { return class_name_; }
    std::vector<Instance> instances() final;

  private:
    const char *class_name_;
    scenario::AdapterFamily family_;
    List list_;
};

class AdapterLinks : public Association {
  public:
    // The links between the parts of an adapter.
    using List = std::vector<Link> (*)(const TaggedAdapter &adapter);

    // As with AdapterParts.
    AdapterLinks(const char *class_name, Roles roles, scenario::AdapterFamily family, List list);

    [[nodiscard]] const char *class_name() const final { return class_name_; }
    std::vector<Link> links() final;

  private:
    const char *class_name_;
    scenario::AdapterFamily family_;
    List list_;
};

}  // namespace velkhost::providers
