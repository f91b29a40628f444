// The families of adapters that a host can have, and what is fixed for each of them.
#pragma once

#include "host/scenario/model.h"

#include <array>
#include <cstddef>
#include <string>
#include <string_view>

namespace velkhost::scenario {

// What is fixed for a family.
struct FamilyTraits {
    AdapterFamily family;
    std::string_view name;  // in scenarios: an adapter's family, the table of answers, the steps
    ServiceKind service;
    bool has_nic_ports;
    bool has_fc_ports;
};

// clang-format off
inline constexpr std::array<FamilyTraits, kAdapterFamilies> kFamilyTraits{{
    {AdapterFamily::kEmulexFc,  "emulex_fc",  ServiceKind::kAtOnce, false, true},
    {AdapterFamily::kEmulexCna, "emulex_cna", ServiceKind::kAtOnce, true,  false},
    {AdapterFamily::kQlogic,    "qlogic",     ServiceKind::kJob,    true,  true},
    {AdapterFamily::kBrocade,   "brocade",    ServiceKind::kAtOnce, false, true},
    {AdapterFamily::kBroadcom,  "broadcom",   ServiceKind::kStatus, true,  false},
    {AdapterFamily::kLsi,       "lsi",        ServiceKind::kAtOnce, false, false},
}};
// clang-format on

inline std::string name_of(AdapterFamily family) {
    return std::string(kFamilyTraits.at(static_cast<std::size_t>(family)).name);
}

}  // namespace velkhost::scenario
