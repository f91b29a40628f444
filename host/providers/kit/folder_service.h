// An installation service that takes a whole unpacked package and picks its own targets in it.
#pragma once

#include "host/providers/kit/installation_service.h"

#include <cstdint>
#include <string>
#include <vector>

namespace velkhost::providers {

// What distinguishes such a service. All texts are literals.
struct FolderServiceTraits {
    scenario::AdapterFamily family;
    const char *class_name;
    const char *name;  // the key
    const char *element_name;
    const char *system_class;
    std::uint32_t not_applicable;  // what it returns when no adapter of the host takes any payload
};

class FolderService : public InstallationService {
  public:
    explicit FolderService(FolderServiceTraits traits);

  protected:
    [[nodiscard]] std::vector<Property> keys() const override;

    // What stands against an installation from `place`; 0: nothing. `subject` becomes what answers
    // are chosen by: the place and the names of the payloads that apply.
    std::uint32_t examine(const std::string &place, std::string &subject) const;

    [[nodiscard]] scenario::ServiceAnswer next_answer(const std::string &subject) const;
    // A pass of the family's step of that name.
    void pass(const char *step, const std::string &subject) const;

  private:
    FolderServiceTraits traits_;
};

}  // namespace velkhost::providers
