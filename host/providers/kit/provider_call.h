// One call from the broker to a provider: what all function tables share.
#pragma once

#include "host/providers/kit/building.h"
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

namespace velkhost::providers {

inline constexpr CMPIStatus kSuccess{CMPI_RC_OK, nullptr};
inline constexpr int kTableVersion = 200;

// The table declares the handle of an instance provider const; what is behind it is not.
inline Binding &binding_of(const void *hdl) {
    return *static_cast<Binding *>(const_cast<void *>(hdl));
}

// The status for the exception in flight.
CMPIStatus status_of_exception(const Maker &maker);

// Runs one provider call; nothing is thrown across the interface.
template <typename Mi, typename Call>
CMPIStatus run(const Mi *mi, const CMPIObjectPath *path, Call call) noexcept {
    const Binding &binding = binding_of(mi->hdl);
    Maker maker{binding.broker, {}};
    try {
        if (!binding.provider) {
            throw CimError(CMPI_RC_ERR_FAILED, "The provider has been cleaned up");
        }
        maker.name_space = Path(path).name_space();
        call(*binding.provider, maker);
        return kSuccess;
    } catch (...) {
        return status_of_exception(maker);
    }
}

template <typename Mi>
CMPIStatus clean_up(Mi *mi, const CMPIContext * /*context*/, CMPIBoolean terminating) {
    Binding &binding = binding_of(mi->hdl);
    if (terminating == 0 && binding.provider && !binding.provider->may_unload()) {
        return {CMPI_RC_NEVER_UNLOAD, nullptr};
    }
    binding.provider.reset();
    return kSuccess;
}

}  // namespace velkhost::providers
