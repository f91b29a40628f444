#include "tests/unit/library/adapter_families.h"

#include <algorithm>
#include <array>
#include <ostream>

#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/brocade_update.h"
#include "installers/facade_update.h"

namespace velktest {
namespace {

constexpr const char *kFcService = "ELXHBA_SoftwareInstallationService";
constexpr const char *kCnaService = "ELXUCNA_SoftwareInstallationService";
constexpr const char *kNicService = "QLogic_NIC_SoftwareInstallationService";
constexpr const char *kQlogicFcService = "QLogic_FCHBA_SoftwareInstallationService";
constexpr const char *kBrocadeService = "BROCADE_HBASoftwareInstallationService";
constexpr const char *kBroadcomService = "BRCMFWUP_SoftwareInstallationService";
constexpr const char *kLsiService = "TAVU_SoftwareInstallationService";

constexpr const char *kSuccess = "50: Package installation successfully.";
constexpr const char *kError = "57: Package installation error happened.";
constexpr const char *kFailed =
    "54: Error when Create Input Parameter and the installation failed.";
constexpr const char *kNothing = "57: No driver file name that need to be update.";

void furnish(AdapterTest &test, const char *service, const VendorAnswer &answer) {
    test.vendor(service).instances = {service_on("host-1")};
    test.vendor(service).answers["InstallFromURI"] = {answer};
    test.offer({{kPayload, {kDfn}, 1}});
}

template <const char *const &kService>
void return_from(AdapterTest &test, int result) {
    test.vendor(kService).answers["InstallFromURI"] = {
        {.value = static_cast<std::uint32_t>(result), .outputs = {}, .message = {}}};
}

void end_job(AdapterTest &test, int result) {
    test.vendor("QLogic_UpdateJob").looks = {job_state(result == 0 ? 7 : 10)};
}

void end_update(AdapterTest &test, int result) {
    test.vendor(kBroadcomService).answers["CheckStatus"] = {
        update_status(static_cast<std::uint32_t>(result))};
}

void furnish_qlogic(AdapterTest &test, const char *association, const char *service) {
    furnish(test, service, job_started());
    test.vendor("QLogic_Adapter_PhysicalPackage").instances = {
        qlogic_adapter("adapter-1", kDfn, kDevice)};
    test.vendor(association).linked["adapter-1"] = {{{{"DeviceID", text("port-1")}}, {}}};
    end_job(test, 0);
}

constexpr const char *kElxUnpacked = "Minizip() successfully.\n";
constexpr const char *kElxRemoved = "util_remove_file() successfully.\n";
constexpr const char *kUnpacked = "minizip successfully.\n";
constexpr const char *kRemoved = "util_remove_file successfully.\n";

const std::array kFamilies = {
    AdapterFamily{
        .name = "EmulexFc",
        .install = installElxFCPkg,
        .service = kFcService,
        .furnish = furnish_emulex_fc,
        .end_with = return_from<kFcService>,
        .failure_report = kError,
        .no_adapter_report = kNothing,
        .no_adapter_result = 4098,
        .must_unpack = true,
        .unpacked_line = kElxUnpacked,
        .matching = nullptr,
        .nothing_report = kSuccess,
        .removed_line = kElxRemoved,
        .returns_removal = true,
    },
    AdapterFamily{
        .name = "EmulexCna",
        .install = installElxCNAPkg,
        .service = kCnaService,
        .furnish = furnish_emulex_cna,
        .end_with = return_from<kCnaService>,
        .failure_report = kError,
        .no_adapter_report = kNothing,
        .no_adapter_result = 4098,
        .must_unpack = true,
        .unpacked_line = kElxUnpacked,
        .matching = nullptr,
        .nothing_report = kSuccess,
        .removed_line = kElxRemoved,
        .returns_removal = true,
    },
    AdapterFamily{
        .name = "QlogicNic",
        .install = installQlgPkg,
        .service = kNicService,
        .furnish = furnish_qlogic_nic,
        .end_with = end_job,
        .failure_report = kFailed,
        .no_adapter_report = kNothing,
        .no_adapter_result = 0,
        .must_unpack = false,
        .unpacked_line = kUnpacked,
        .matching = kNothing,
        .nothing_report = kNothing,
        .removed_line = kRemoved,
        .returns_removal = false,
    },
    AdapterFamily{
        .name = "QlogicFc",
        .install = installQlgPkg,
        .service = kQlogicFcService,
        .furnish = furnish_qlogic_fc,
        .end_with = end_job,
        .failure_report = kFailed,
        .no_adapter_report = kNothing,
        .no_adapter_result = 0,
        .must_unpack = false,
        .unpacked_line = kUnpacked,
        .matching = kNothing,
        .nothing_report = kNothing,
        .removed_line = kRemoved,
        .returns_removal = false,
    },
    AdapterFamily{
        .name = "Brocade",
        .install = installBrocadePkg,
        .service = kBrocadeService,
        .furnish = furnish_brocade,
        .end_with = return_from<kBrocadeService>,
        .failure_report = kError,
        .no_adapter_report = kNothing,
        .no_adapter_result = 0,
        .must_unpack = false,
        .unpacked_line = kUnpacked,
        .matching = nullptr,
        .nothing_report = kSuccess,
        .removed_line = kRemoved,
        .returns_removal = false,
    },
    AdapterFamily{
        .name = "Broadcom",
        .install = installBroadcomPkg,
        .service = kBroadcomService,
        .furnish = furnish_broadcom,
        .end_with = end_update,
        .failure_report = kError,
        .no_adapter_report = nullptr,
        .no_adapter_result = 0,
        .must_unpack = false,
        .unpacked_line = kUnpacked,
        .matching = kSuccess,
        .nothing_report = kSuccess,
        .removed_line = nullptr,
        .returns_removal = false,
    },
    AdapterFamily{
        .name = "Lsi",
        .install = installLSIPkg,
        .service = kLsiService,
        .furnish = furnish_lsi,
        .end_with = return_from<kLsiService>,
        .failure_report = kError,
        .no_adapter_report = nullptr,
        .no_adapter_result = 0,
        .must_unpack = false,
        .unpacked_line = kUnpacked,
        .matching = kSuccess,
        .nothing_report = kSuccess,
        .removed_line = nullptr,
        .returns_removal = false,
    },
};

}  // namespace

std::span<const AdapterFamily> adapter_families() {
    return kFamilies;
}

const AdapterFamily &adapter_family(std::string_view name) {
    return *std::ranges::find(kFamilies, name,
                              [](const auto &family) { return std::string_view(family.name); });
}

void PrintTo(const AdapterFamily &family, std::ostream *out) {
    *out << family.name;
}

// ---- Vendors ----

void furnish_emulex_fc(AdapterTest &test) {
    furnish(test, kFcService, {});
    test.vendor("ELXHBA_VitalProductData").instances = {
        {{}, {{"FieldV2", text(kDfn)}, {"InstanceID", text(kDevice)}}}};
}

void furnish_emulex_cna(AdapterTest &test) {
    furnish(test, kCnaService, {});
    test.vendor("ELXUCNA_EthernetPort").instances = {elx_port(kDevice, "adapter-1")};
    test.vendor("CIM_Realizes").linked[kDevice] = {{{{"Tag", text("connector-1")}}, {}}};
    test.vendor("CIM_Container").linked["connector-1"] = {elx_card("card-1", kDfn)};
}

void furnish_qlogic_nic(AdapterTest &test) {
    furnish_qlogic(test, "QLogic_NIC_PhysicalPackagePortController", kNicService);
}

void furnish_qlogic_fc(AdapterTest &test) {
    furnish_qlogic(test, "QLogic_FCHBA_PhysicalPackagePortController", kQlogicFcService);
}

void furnish_brocade(AdapterTest &test) {
    furnish(test, kBrocadeService, {});
    test.vendor("BROCADE_PhysicalPackage").instances = {brocade_package(kDfn, "SN-1")};
    test.vendor("BROCADE_PortController").instances = {brocade_port("SN-1", kDevice)};
}

void furnish_broadcom(AdapterTest &test) {
    furnish(test, kBroadcomService, {.value = 4096, .outputs = {}, .message = {}});
    end_update(test, 0);
}

void furnish_lsi(AdapterTest &test) {
    furnish(test, kLsiService, {});
}

// ---- Instances ----

VendorInstance elx_port(const std::string &device, const std::string &adapter) {
    return {{{"DeviceID", text(device)}},
            {{"InstanceID", text("port of " + device)},
             {"DeviceID", text(device)},
             {"OtherIdentifyingInfo", texts({adapter, "second"})}}};
}

VendorInstance elx_card(const std::string &tag, const std::string &part_number) {
    return {{{"Tag", text(tag)}}, {{"PartNumber", text(part_number)}}};
}

VendorInstance qlogic_adapter(const std::string &tag, const std::string &model,
                              const std::string &serial) {
    return {{{"Tag", text(tag)}}, {{"Model", text(model)}, {"SerialNumber", text(serial)}}};
}

VendorInstance brocade_package(const std::string &model, const std::string &serial) {
    return {{}, {{"Model", text(model)}, {"SerialNumber", text(serial)}}};
}

VendorInstance brocade_port(const std::string &name, const std::string &device) {
    return {{}, {{"Name", text(name)}, {"DeviceID", text(device)}}};
}

VendorInstance service_on(const std::string &system) {
    return {{{"SystemName", text(system)}}, {}};
}

VendorAnswer job_started() {
    const Value job =
        Value::reference({"", "qlogic/cimv2", "QLogic_UpdateJob", {{"InstanceID", text("job-1")}}});
    return {.value = 4096, .outputs = {{"Job", job}}, .message = {}};
}

NamedValues job_state(std::uint16_t state) {
    return {{"JobState", Value::uint16(state)}};
}

VendorAnswer update_status(std::uint32_t status) {
    return {.outputs = {{"status", Value::uint32(status)}}, .message = {}};
}

}  // namespace velktest
