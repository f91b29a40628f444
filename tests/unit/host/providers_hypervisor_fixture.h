// The hypervisor's provider, with a bundle to install.
#pragma once

#include "providers_fixture.h"
#include "tests/support/depot_files.h"

#include <string>
#include <vector>

namespace velkhost::providers::testing {

class HypervisorProvider : public ProviderTest {
  protected:
    HypervisorProvider() { play("[host]\nnode = 'host-1'\n"); }

    static cim::ObjectPath class_path(const std::string &class_name) {
        return {"", "root/cimv2", class_name, {}};
    }

    static cim::ObjectPath service(const std::string &system = "host-1") {
        using cim::Value;
        cim::ObjectPath path = class_path("VMware_SoftwareInstallationService");
        path.keys = {{"SystemCreationClassName", Value::string("OMC_UnitaryComputerSystem")},
                     {"SystemName", Value::string(system)},
                     {"CreationClassName", Value::string("VMware_SoftwareInstallationService")},
                     {"Name", Value::string("SoftwareInstallationService")}};
        return path;
    }

    static cim::ObjectPath target(const std::string &system = "host-1") {
        using cim::Value;
        cim::ObjectPath path = class_path("OMC_UnitaryComputerSystem");
        path.keys = {{"CreationClassName", Value::string("OMC_UnitaryComputerSystem")},
                     {"Name", Value::string(system)}};
        return path;
    }

    broker::MethodReply install(const std::string &uri) {
        return broker_.invoke_method(
            service(), "InstallFromURI",
            {{"URI", cim::Value::string(uri)}, {"Target", cim::Value::reference(target())}});
    }

    std::vector<cim::Instance> instances(const std::string &class_name) {
        const auto reply = broker_.enumerate_instances(class_path(class_name));
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        return reply.instances;
    }

    // JobStatus of every job, as one enumeration shows them.
    std::vector<std::string> look() {
        std::vector<std::string> out;
        for (const cim::Instance &job : instances("VMware_ConcreteJob")) {
            out.push_back(text(job.properties, "JobStatus"));
        }
        return out;
    }

    // JobStatus of the latest job at each of the next enumerations.
    std::vector<std::string> looks(int count) {
        std::vector<std::string> out;
        for (int i = 0; i < count; ++i) {
            const std::vector<std::string> found = look();
            out.push_back(found.empty() ? "(no job)" : found.back());
        }
        return out;
    }

    velktest::DepotFiles depot_{folder_ / "depot"};
};

inline constexpr const char *kScanning = "Scanning URI for installable packages";
inline constexpr const char *kUpdating =
    "Scan of URI Complete and installable packages found. Starting Update.";
inline constexpr const char *kCompleted =
    "The update completed successfully, but the system needs to be rebooted for the changes to be "
    "effective.";
inline constexpr const char *kObsolete =
    "Updates at supplied URI are obsolete or already installed";

}  // namespace velkhost::providers::testing
