// The one instance that the provider describes: the package installation service of this host. It
// is made afresh from constants and the node name, whatever keys a request names.
#include <sys/utsname.h>

#include <algorithm>
#include <cstring>

#include "provider/provider.h"
#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"

namespace velk {
namespace {

constexpr int kNodeNameSize = 64;

// The name differs between instance names and instances. Clients know both.
constexpr const char *kNameInPath = "ZEB:ZEB_PackageInstallationBroker";
constexpr const char *kNameInInstance = "ZEB:PackageInstallationBroker";

// Calls `set` with each of the service's four texts.
template <class Setter>
void describe_service(const char *name, Setter set) {
    char node_name[kNodeNameSize + 1] = {};  // one more, for a name that fills its 64 bytes
    set("SystemCreationClassName", "CIM_ComputerSystem");
    set("SystemName", get_sys_name(node_name, kNodeNameSize));
    set("CreationClassName", "ZEB_PackageInstallationBroker");
    set("Name", name);
}

CMPIStatus return_instance(const CMPIResult *result) {
    const cim::Path path = cim::make_path(_VELKNameSpace, _VELKClassName);
    const cim::Instance instance = cim::make_instance(path);
    describe_service(kNameInInstance, [&](const char *name, const char *value) {
        cim::set_text(instance, name, value);
    });
    if (instance) {
        CMReturnInstance(result, instance.get());
    }
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

}  // namespace
}  // namespace velk

char *get_sys_name(char *buffer, int length) {
    utsname host = {};
    if (buffer == nullptr || length <= 0 || uname(&host) != 0) {
        return buffer;
    }
    const auto size = static_cast<std::size_t>(length);
    const std::size_t name = velk::view(host.nodename).size();
    std::memcpy(buffer, host.nodename, std::min(name + 1, size));
    return buffer;
}

CMPIStatus ZEB_VMWarePackageInstallationProviderGetInstance(CMPIInstanceMI *, const CMPIContext *,
                                                            const CMPIResult *result,
                                                            const CMPIObjectPath *, const char **) {
    velk::log_entry("Enter ZEB_VMWarePackageInstallationProviderGetInstance.\n");
    return velk::return_instance(result);
}

CMPIStatus ZEB_VMWarePackageInstallationProviderEnumInstances(CMPIInstanceMI *, const CMPIContext *,
                                                              const CMPIResult *result,
                                                              const CMPIObjectPath *,
                                                              const char **) {
    velk::log_entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstances.\n");
    const CMPIStatus status = velk::return_instance(result);
    velk::log_entry("Complete ZEB_VMWarePackageInstallationProviderEnumInstances.\n");
    return status;
}

CMPIStatus ZEB_VMWarePackageInstallationProviderEnumInstanceNames(CMPIInstanceMI *,
                                                                  const CMPIContext *,
                                                                  const CMPIResult *result,
                                                                  const CMPIObjectPath *) {
    using namespace velk;
    log_entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstanceNames.\n");
    const cim::Path path = cim::make_path(_VELKNameSpace, _VELKClassName);
    describe_service(kNameInPath,
                     [&](const char *name, const char *value) { cim::add_key(path, name, value); });
    if (path) {
        CMReturnObjectPath(result, path.get());
    }
    CMReturnDone(result);
    log_entry("Complete ZEB_VMWarePackageInstallationProviderEnumInstances.\n");
    return {CMPI_RC_OK, nullptr};
}
