#include "host/providers/kit/export.h"

#include "host/providers/kit/provider_call.h"

#include <cmpi/cmpimacs.h>

namespace velkhost::providers {
namespace {

CMPIStatus enumerate_names(CMPIInstanceMI *mi, const CMPIContext * /*context*/,
                           const CMPIResult *result, const CMPIObjectPath *path) {
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        for (const Instance &instance : provider.instances()) {
            CMReturnObjectPath(result, maker.path({provider.class_name(), instance.keys}));
        }
        CMReturnDone(result);
    });
}

CMPIStatus enumerate(CMPIInstanceMI *mi, const CMPIContext * /*context*/, const CMPIResult *result,
                     const CMPIObjectPath *path, const char **wanted) {
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        for (const Instance &instance : provider.instances()) {
            CMReturnInstance(result, maker.instance(provider.class_name(), instance, wanted));
        }
        CMReturnDone(result);
    });
}

CMPIStatus get(CMPIInstanceMI *mi, const CMPIContext * /*context*/, const CMPIResult *result,
               const CMPIObjectPath *path, const char **wanted) {
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        const Instance instance = provider.read(Path(path));
        CMReturnInstance(result, maker.instance(provider.class_name(), instance, wanted));
        CMReturnDone(result);
    });
}

CMPIStatus remove(CMPIInstanceMI *mi, const CMPIContext * /*context*/, const CMPIResult *result,
                  const CMPIObjectPath *path) {
    return run(mi, path, [&](Provider &provider, const Maker & /*maker*/) {
        provider.remove(Path(path));
        CMReturnDone(result);
    });
}

CMPIStatus invoke(CMPIMethodMI *mi, const CMPIContext * /*context*/, const CMPIResult *result,
                  const CMPIObjectPath *path, const char *method, const CMPIArgs *in,
                  CMPIArgs *out) {
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        const MethodResult answer =
            provider.invoke(Path(path), method == nullptr ? "" : method, Args(in));
        for (const Property &output : answer.outputs) {
            maker.add_argument(out, output);
        }
        CMPIValue value{};
        value.uint32 = answer.return_value;
        CMReturnData(result, &value, CMPI_uint32);
        CMReturnDone(result);
    });
}

// The operations that no provider of the stand-in host serves, in the shape of any slot.
template <typename... Parameters>
CMPIStatus not_supported(CMPIInstanceMI *mi, const CMPIContext * /*context*/,
                         const CMPIResult * /*result*/, Parameters... /*rest*/) {
    const Maker maker{binding_of(mi->hdl).broker, {}};
    return maker.status(CMPI_RC_ERR_NOT_SUPPORTED,
                        "Instances of this class are made by the service itself and only read");
}

}  // namespace

CMPIStatus status_of_exception(const Maker &maker) {
    try {
        throw;
    } catch (const CimError &error) {
        return maker.status(error.code(), error.what());
    } catch (const std::exception &error) {
        return maker.status(CMPI_RC_ERR_FAILED, error.what());
    } catch (...) {
        return maker.status(CMPI_RC_ERR_FAILED, "Unknown failure in a provider");
    }
}

CMPIInstanceMIFT instance_table(const char *name) {
    CMPIInstanceMIFT table{};
    table.ftVersion = kTableVersion;
    table.miVersion = kTableVersion;
    table.miName = name;
    table.cleanup = clean_up;
    table.enumerateInstanceNames = enumerate_names;
    table.enumerateInstances = enumerate;
    table.getInstance = get;
    table.createInstance = not_supported;
    table.modifyInstance = not_supported;
    table.deleteInstance = remove;
    table.execQuery = not_supported;
    return table;
}

CMPIMethodMIFT method_table(const char *name) {
    CMPIMethodMIFT table{};
    table.ftVersion = kTableVersion;
    table.miVersion = kTableVersion;
    table.miName = name;
    table.cleanup = clean_up;
    table.invokeMethod = invoke;
    return table;
}

void report_made(CMPIStatus *status) {
    if (status != nullptr) {
        *status = kSuccess;
    }
}

void report_exception(const CMPIBroker *broker, CMPIStatus *status) {
    if (status != nullptr) {
        *status = status_of_exception(Maker{broker, {}});
    }
}

}  // namespace velkhost::providers
