// The adapter installers against doubles of their vendors' providers, of the unzip library and of
// the management controller. Package 0 of two was fetched, there is no controller, and no vendor
// knows of an adapter.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/shim/wait_guard.h"
#include "tests/support/broker_test.h"
#include "tests/support/report_log.h"
#include "tests/support/unzip_double.h"
#include "tests/support/vendor_double.h"
#include "tests/unit/library/controller_stand.h"
#include "tests/unit/library/payload_config.h"
#include "velk/request_state.h"

namespace velktest {

inline constexpr const char *kUnpackFolder = "/var/tmp/ZEB/Pakro/Package/";

class AdapterTest : public BrokerTest, public ControllerStand {
  public:
    AdapterTest();
    ~AdapterTest() override;
    AdapterTest(const AdapterTest &) = delete;
    AdapterTest &operator=(const AdapterTest &) = delete;

    using BrokerTest::fail_service;

    // A class of a vendor's provider, and one's own addition to them.
    VendorClass &vendor(const std::string &class_name) { return *vendors_.at(class_name); }

    UnzipDouble &unzip() { return unzip_; }

    // The archive's configuration lists these payloads.
    void offer(const std::vector<ConfigPayload> &payloads) {
        unzip_.files["image/payload.xml"] = payload_config(payloads);
    }

    // The payloads that were matched, without an archive.
    static void put_payload(const std::string &path, const std::string &device);

  protected:
    static constexpr const char *kLocation = "file:///pkgs/adapter.xml";

    static velk::PackageRecord &package(int index = 0) { return pkgInstance[index]; }

    // Runs an installer in a request of its own; its result.
    int install(velk::Installer installer, int index = 0);

    // Codes and messages of the reports of package 0: "50: Done.".
    [[nodiscard]] std::vector<std::string> reports() const { return reports_in(log(), "adapter"); }

    // "DFN-A on DEV-1" of each adapter that was found.
    static std::vector<std::string> devices();

    // How often the log has this text.
    [[nodiscard]] int logged(std::string_view text) const { return occurrences(log(), text); }

    // The log but for what the matching of payloads writes.
    [[nodiscard]] std::string log_without_matching() const;

    // What is left where archives are unpacked to.
    [[nodiscard]] bool is_unpacked() const;

  private:
    UnzipDouble unzip_;
    std::map<std::string, std::unique_ptr<VendorClass>> vendors_;
    const velkhost::shim::TakePart part_;  // the watcher is another thread for which time passes
};

// What the log says of a session that there is no device for.
std::string no_session_log();

// What it says of a package's end.
std::string final_report_log(int code, std::string_view message, int elapsed = 0);

}  // namespace velktest
