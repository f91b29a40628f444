// Registration files as brokers of the sfcb kind read them:
//
//   [PAKRO_VMpkgInstallationService]
//      provider: ZEB_VMWarePackageInstallationProvider
//      location: velkprovider
//      type: instance method
//      namespace: velk/cimv2
//   #
//
// One section per class. `location` names lib<location>.so; `type` is one or more of instance,
// association, method, property, indication; `namespace` one or more names. `unload: never`,
// `group`, `user` and `parameters` may be left out. Lines that start with '#' are comments.
#pragma once

#include "host/broker/api.h"

#include <array>
#include <bitset>
#include <cstddef>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::broker {

enum class ProviderKind : std::size_t { kInstance, kAssociation, kMethod, kProperty, kIndication };

// As factories spell the kinds; registration files spell them in lower case.
inline constexpr std::array<std::string_view, 5> kKindNames{"Instance", "Association", "Method",
                                                            "Property", "Indication"};

class ProviderKinds {
  public:
    void add(ProviderKind kind) { set_.set(static_cast<std::size_t>(kind)); }
    void add(ProviderKinds kinds) { set_ |= kinds.set_; }
    [[nodiscard]] bool has(ProviderKind kind) const {
        return set_.test(static_cast<std::size_t>(kind));
    }
    [[nodiscard]] bool none() const { return set_.none(); }

  private:
    std::bitset<kKindNames.size()> set_;
};

struct Registration {
    std::string class_name;
    std::string provider;
    std::string location;
    ProviderKinds kinds;
    std::vector<std::string> namespaces;
    bool never_unload = false;
    std::string group;
    std::string user;
    std::string parameters;
};

struct RegistrationFile {
    std::vector<Registration> entries;  // empty when there is an error
    std::string error;                  // "file:line: what is wrong", empty when all is well
};

// `name` stands for the file in errors.
VELKBROKER_API RegistrationFile parse_registration(std::string_view text, const std::string &name);

VELKBROKER_API RegistrationFile read_registration(const std::filesystem::path &file);

}  // namespace velkhost::broker
