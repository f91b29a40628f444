// What a provider of one association answers: its links, each of two instances. Export it with
// VELKHOST_EXPORT_ASSOCIATION (kit/association_export.h).
#pragma once

#include "host/providers/kit/provider.h"

#include <vector>

namespace velkhost::providers {

// Two instances that are associated, in the order of the association's roles.
struct Link {
    Element first;
    Element second;
};

class Association : public Provider {
  public:
    // The references of the association class, which are its keys.
    struct Roles {
        const char *first;
        const char *second;
    };

    explicit Association(Roles roles) : roles_(roles) {}

    [[nodiscard]] Roles roles() const { return roles_; }

    // Every link as it is now.
    virtual std::vector<Link> links() = 0;

    // The link as an instance of the association class.
    [[nodiscard]] Instance as_instance(const Link &link) const;
    std::vector<Instance> instances() final;

  private:
    Roles roles_;
};

}  // namespace velkhost::providers
