#include "host/broker/unload.h"

#include "host/broker/provider_call.h"

namespace velkhost::broker {
namespace {

// The clean-up's status; an interface that the provider does not have agrees.
template <class Interface>
CMPIrc clean_up(Core &core, const Registration &registration, Interface *interface,
                bool terminating) {
    if (interface == nullptr) {
        return CMPI_RC_OK;
    }
    ResultSink unused;
    ProviderCall call(core, {"$$", 0, 0, false}, registration.parameters, unused);
    return interface->ft->cleanup(interface, call.context(), terminating ? 1 : 0).rc;
}

// One kind after the other; the first that refuses ends the round.
CMPIrc first_refusal(Core &core, const Registration &registration,
                     const ManagementInterfaces &interfaces) {
    CMPIrc rc = clean_up(core, registration, interfaces.instance, false);
    const auto next = [&](auto *interface) {
        if (rc == CMPI_RC_OK) {
            rc = clean_up(core, registration, interface, false);
        }
    };
    next(interfaces.association);
    next(interfaces.method);
    next(interfaces.property);
    next(interfaces.indication);
    return rc;
}

bool is_empty(const ManagementInterfaces &interfaces) {
    return interfaces.instance == nullptr && interfaces.association == nullptr &&
           interfaces.method == nullptr && interfaces.property == nullptr &&
           interfaces.indication == nullptr;
}

}  // namespace

std::optional<UnloadAnswer::Decision> ask_to_unload(Core &core, Provider &provider) {
    const ManagementInterfaces interfaces = provider.loaded();
    const Registration &registration = provider.registration();
    if (is_empty(interfaces) || registration.never_unload || provider.stays_for_ever()) {
        return std::nullopt;
    }
    const CMPIrc rc = first_refusal(core, registration, interfaces);
    if (rc == CMPI_RC_OK) {
        provider.forget();
        return UnloadAnswer::Decision::kUnloads;
    }
    if (rc == CMPI_RC_NEVER_UNLOAD) {
        provider.stay_for_ever();
        return UnloadAnswer::Decision::kStaysForEver;
    }
    return UnloadAnswer::Decision::kStays;
}

void tell_shutdown(Core &core, Provider &provider) {
    const ManagementInterfaces interfaces = provider.loaded();
    const Registration &registration = provider.registration();
    clean_up(core, registration, interfaces.instance, true);
    clean_up(core, registration, interfaces.association, true);
    clean_up(core, registration, interfaces.method, true);
    clean_up(core, registration, interfaces.property, true);
    clean_up(core, registration, interfaces.indication, true);
}

}  // namespace velkhost::broker
