// System firmware of the tests: package 0 of two, its payload fetched, the controller ready.
#pragma once

#include "installers/ESW_update.h"
#include "tests/support/broker_test.h"
#include "tests/support/report_log.h"
#include "velk/request_state.h"

namespace velktest {

class SystemFirmwareTest : public BrokerTest {
  protected:
    SystemFirmwareTest() {
        use_packages(2);
        set_field(package().TFTPXMLPkgURIs, kLocation);
        set_field(package().LocalPkgURI, "file:///pkgs/fw.bin");
        package().OrderFlag = 350;
    }

    static constexpr const char *kLocation = "file:///pkgs/rxc.xml";

    static velk::PackageRecord &package() { return pkgInstance[0]; }

    // Returns the installer's result.
    int install() {
        int result = -1;
        in_request([&](const CMPIContext *context) { result = installESWPkg(0, context); });
        return result;
    }

    // Codes and messages of the reports so far, in their order.
    [[nodiscard]] std::vector<std::string> reports() const { return reports_in(log(), "rxc"); }
};

}  // namespace velktest
