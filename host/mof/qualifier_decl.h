// A qualifier's declaration (DSP0004, 5.6.1.2): what type it has, where it may stand, and how it is
// passed on to subclasses.
#pragma once

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <vector>

namespace velkhost::mof {

// A set of these says where a qualifier may stand.
enum Scope : unsigned {
    kScopeClass = 1U << 0U,
    kScopeAssociation = 1U << 1U,
    kScopeIndication = 1U << 2U,
    kScopeProperty = 1U << 3U,
    kScopeReference = 1U << 4U,
    kScopeMethod = 1U << 5U,
    kScopeParameter = 1U << 6U,
    kScopeQualifier = 1U << 7U,
    kScopeAny = 0xFFU,
};

struct Flavors {
    bool overridable = true;  // EnableOverride, the default, against DisableOverride
    bool to_subclass = true;  // ToSubclass, the default, against Restricted
    bool translatable = false;
};

struct QualifierDecl {
    std::string name;
    CMPIType type = CMPI_boolean;                           // with CMPI_ARRAY for arrays
    std::optional<std::vector<std::string>> default_value;  // no value: null
    unsigned scopes = 0;                                    // of Scope
    Flavors flavors;
};

}  // namespace velkhost::mof
