#include "tests/conformance/unexported_broker.h"

#include "tests/conformance/package_files.h"
#include "tests/conformance/provider_host.h"
#include "velk/package_table.h"

namespace velktest {
namespace {

void run_request(bool refuse, RequestReport &report) {
    ProviderHost host;
    host.install_job_library(VELK_JOB_LIBRARY);
    if (refuse) {
        host.fail_service("broker.cloneContext", "", CMPI_RC_ERR_FAILED);
    } else {
        host.job().show(kit::Text("0x00|Process Completed"));
    }
    const std::string uefi = write_package(host.folder(), {.file = "uefi"});
    const auto reply = host.call("InstallFromURI", {{"URI", cim::Value::string(uefi)}});
    if (reply.return_value) {
        report.return_value = reply.return_value->as_unsigned().value_or(0);
    }
    if (!host.wait_until_idle()) {
        throw std::runtime_error("the install does not end");
    }
    report.contexts = host.uses("broker.cloneContext");
    report.clones = host.broker().ledger().live_clones();
    report.result =
        host.data<velk::PackageRecord[velk::kMaxPackages]>("pkgInstance")[0].installResult;
    host.broker().shutdown();
    report.findings = host.broker().ledger().report();
}

}  // namespace
}  // namespace velktest

extern "C" [[gnu::visibility("default")]] void velktest_run_request(
    bool refuse, velktest::RequestReport &report) {
    velktest::run_request(refuse, report);
}
