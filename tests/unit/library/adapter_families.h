// The adapter families as the tests of what they share see them.
#pragma once

#include <span>
#include <string>

#include "tests/unit/library/adapter_fixture.h"

namespace velktest {

// The one adapter that a furnished vendor knows of, and the payload that a package has for it.
inline constexpr const char *kDfn = "DFN-A";
inline constexpr const char *kDevice = "DEV-1";
inline constexpr const char *kPayload = "fw.bin";

struct AdapterFamily {
    const char *name;
    velk::Installer install;
    const char *service;  // the class of the vendor's service

    // Puts an adapter on the host and a payload into the package; the vendor's service installs it.
    void (*furnish)(AdapterTest &test);

    // From now on the vendor's service lets payloads end like this.
    void (*end_with)(AdapterTest &test, int result);

    const char *failure_report;  // of a payload that ends with 2 or cannot be started

    const char *no_adapter_report;  // null where adapters are not looked for
    int no_adapter_result;

    bool must_unpack;           // a failure ends the install
    const char *unpacked_line;  // when the archive was unpacked

    const char *matching;        // how an archive without a configuration ends: the report, if any
    const char *nothing_report;  // how one ends that has nothing for the adapter

    const char *removed_line;  // null: not told
    bool returns_removal;
};

std::span<const AdapterFamily> adapter_families();
const AdapterFamily &adapter_family(std::string_view name);

// For test names.
void PrintTo(const AdapterFamily &family, std::ostream *out);
inline std::string family_name(const ::testing::TestParamInfo<AdapterFamily> &about) {
    return about.param.name;
}

// Furnishes one family's vendor.
void furnish_emulex_fc(AdapterTest &test);
void furnish_emulex_cna(AdapterTest &test);
void furnish_qlogic_nic(AdapterTest &test);
void furnish_qlogic_fc(AdapterTest &test);
void furnish_brocade(AdapterTest &test);
void furnish_broadcom(AdapterTest &test);
void furnish_lsi(AdapterTest &test);

// Vendors' instances.
VendorInstance elx_port(const std::string &device, const std::string &adapter);
VendorInstance elx_card(const std::string &tag, const std::string &part_number);
VendorInstance qlogic_adapter(const std::string &tag, const std::string &model,
                              const std::string &serial);
VendorInstance brocade_package(const std::string &model, const std::string &serial);
VendorInstance brocade_port(const std::string &name, const std::string &device);

// An instance of a vendor's service on this system.
VendorInstance service_on(const std::string &system);

// What starts QLogic's job; how the job and Broadcom's update look.
VendorAnswer job_started();
NamedValues job_state(std::uint16_t state);
VendorAnswer update_status(std::uint32_t status);

}  // namespace velktest
