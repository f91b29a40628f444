// Hypervisor bundles against a double of the hypervisor's provider: one service, of the system
// "esxi-1", which starts a job. Package 0 of two is a bundle.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "installers/Vmware_ESXi_update.h"
#include "tests/support/broker_test.h"
#include "tests/support/report_log.h"
#include "tests/support/vendor_double.h"
#include "velk/request_state.h"

namespace velktest {

class HypervisorTest : public BrokerTest {
  public:
    HypervisorTest() {
        use_packages(2);
        set_field(package().TFTPXMLPkgURIs, kLocation);
        set_field(package().TFTPPayloadPkgURIs, "file:///pkgs/");
        package().OrderFlag = 300;
        for (VendorClass *known : {&service_, &job_}) {
            add_provider(known->name_space(), known->name(), known->interfaces(broker().cmpi()));
        }
        service_.instances = {of_system(text("esxi-1"))};
        answer({.value = 4096, .outputs = {}, .message = {}});
    }
    ~HypervisorTest() override { broker().shutdown(); }  // before the doubles go
    HypervisorTest(const HypervisorTest &) = delete;
    HypervisorTest &operator=(const HypervisorTest &) = delete;

  protected:
    static constexpr const char *kLocation = "file:///pkgs/bundle.xml";
    static constexpr const char *kService = "VMware_SoftwareInstallationService";
    static constexpr const char *kDone =
        "The update completed successfully, but the system needs to be rebooted for the changes "
        "to be effective.";
    static constexpr const char *kScanning = "Scanning URI for installable packages";
    static constexpr const char *kStarting =
        "Scan of URI Complete and installable packages found. Starting Update.";
    static constexpr const char *kReportedDone = "50: Package installation successfully.";
    static constexpr const char *kReportedError = "57: Package installation error happened.";

    static velk::PackageRecord &package() { return pkgInstance[0]; }

    VendorClass &service() { return service_; }
    VendorClass &job() { return job_; }

    void answer(const VendorAnswer &answer) { service_.answers["InstallFromURI"] = {answer}; }

    // An installation service of that system; one that tells no system's name.
    static VendorInstance of_system(const Value &system) { return {{{"SystemName", system}}, {}}; }
    static VendorInstance of_no_system() { return {{{"Name", text("nameless")}}, {}}; }

    // A job with this JobStatus; one without any.
    static VendorInstance with_status(const Value &status) {
        return {{{"InstanceID", text("job")}}, {{"JobStatus", status}}};
    }
    static VendorInstance without_status() { return {{{"InstanceID", text("job")}}, {}}; }

    // The next look at the jobs finds one with this status.
    void show(const std::string &status) {
        job_.enumerations.emplace_back(std::vector{with_status(text(status))});
    }

    // Returns the installer's result.
    int install(int index = 0) {
        int result = -99;
        in_request([&](const CMPIContext *context) { result = installVMPkg(index, context); });
        return result;
    }

    // Codes and messages of the package's reports, in their order.
    [[nodiscard]] std::vector<std::string> reports() const { return reports_in(log(), "bundle"); }

  private:
    VendorClass service_{"root/cimv2", kService};
    VendorClass job_{"root/cimv2", "VMware_ConcreteJob"};
};

}  // namespace velktest
