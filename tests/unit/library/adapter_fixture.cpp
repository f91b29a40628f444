#include "tests/unit/library/adapter_fixture.h"

#include <unistd.h>

#include <array>

#include "ipmi/kcs_channel.h"

namespace velktest {
namespace {

struct KnownClass {
    const char *name_space;
    const char *name;
};

constexpr std::array kClasses = {
    KnownClass{"root/emulex", "ELXHBA_VitalProductData"},
    KnownClass{"root/emulex", "ELXHBA_SoftwareInstallationService"},
    KnownClass{"root/emulex", "ELXUCNA_EthernetPort"},
    KnownClass{"root/emulex", "ELXUCNA_PhysicalConnector"},
    KnownClass{"root/emulex", "ELXUCNA_Card"},
    KnownClass{"root/emulex", "ELXUCNA_SoftwareInstallationService"},
    KnownClass{"root/emulex", "CIM_Realizes"},
    KnownClass{"root/emulex", "CIM_Container"},
    KnownClass{"qlogic/cimv2", "QLogic_Adapter_PhysicalPackage"},
    KnownClass{"qlogic/cimv2", "QLogic_NIC_PhysicalPackagePortController"},
    KnownClass{"qlogic/cimv2", "QLogic_FCHBA_PhysicalPackagePortController"},
    KnownClass{"qlogic/cimv2", "QLogic_NIC_PortController"},
    KnownClass{"qlogic/cimv2", "QLogic_FCHBA_PortController"},
    KnownClass{"qlogic/cimv2", "QLogic_NIC_SoftwareInstallationService"},
    KnownClass{"qlogic/cimv2", "QLogic_FCHBA_SoftwareInstallationService"},
    KnownClass{"qlogic/cimv2", "QLogic_UpdateJob"},
    KnownClass{"root/brocade", "BROCADE_PhysicalPackage"},
    KnownClass{"root/brocade", "BROCADE_PortController"},
    KnownClass{"root/brocade", "BROCADE_HBASoftwareInstallationService"},
    KnownClass{"brcmfwup/cimv2", "BRCMFWUP_SoftwareInstallationService"},
    KnownClass{"tavu/cimv2", "TAVU_SoftwareInstallationService"},
};

constexpr std::array kLocations = {"file:///pkgs/adapter.xml", "file:///pkgs/second.xml"};
constexpr std::array kArchives = {"file:///pkgs/adapter.zip", "file:///pkgs/second.zip"};

// Longer than a watcher's pause.
constexpr unsigned kWatchersEnd = 61;

}  // namespace

AdapterTest::AdapterTest() : unzip_(at(kUnpackFolder)) {
    use_packages(static_cast<int>(kLocations.size()));
    for (std::size_t i = 0; i < kLocations.size(); ++i) {
        set_field(pkgInstance[i].TFTPXMLPkgURIs, kLocations[i]);
        set_field(pkgInstance[i].LocalPkgURI, kArchives[i]);
    }
    unzip_.files["readme.txt"] = "An archive has more in it than payloads.";
    for (const KnownClass &known : kClasses) {
        auto made = std::make_unique<VendorClass>(known.name_space, known.name);
        add_provider(known.name_space, known.name, made->interfaces(broker().cmpi()));
        vendors_.emplace(known.name, std::move(made));
    }
}

AdapterTest::~AdapterTest() {
    velk::store(ga_is_thread_running, 0);
    sleep(kWatchersEnd);
    disconnect_kcs();
    broker().shutdown();  // before the vendors go
}

int AdapterTest::install(velk::Installer installer, int index) {
    int result = -1;
    in_request([&](const CMPIContext *context) { result = installer(index, context); });
    return result;
}

void AdapterTest::put_payload(const std::string &path, const std::string &device) {
    velk::PayloadDevice &entry = package().PayloadDeviceIDArray[package().payloadnum++];
    set_field(entry.PayloadPath, path);
    set_field(entry.DeviceID, device);
}

std::vector<std::string> AdapterTest::devices() {
    std::vector<std::string> out;
    for (int i = 0; i < package().dfnnumber; ++i) {
        const velk::DfnDevice &entry = package().DFNDeviceIDArray[i];
        out.push_back(std::string(entry.DFN) + " on " + entry.DeviceID);
    }
    return out;
}

std::string AdapterTest::log_without_matching() const {
    const std::string begin = entry("Enter parsePayloadDeviceIDArray.\n");
    const std::string end = entry("parsePayloadDeviceIDArray finished.\n");
    std::string text = log();
    for (auto from = text.find(begin); from != std::string::npos; from = text.find(begin)) {
        text.erase(from, text.find(end, from) + end.size() - from);
    }
    return text;
}

bool AdapterTest::is_unpacked() const {
    return std::filesystem::exists(at(kUnpackFolder));
}

std::string no_session_log() {
    return dated("SMM : start_update_option_firmware enter .") +
           dated("smm : start_update_option_firmware , connect_kcs failed");
}

std::string final_report_log(int code, std::string_view message, int elapsed) {
    return report_log({"file:///pkgs/adapter.xml", "adapter", code, message, elapsed});
}

}  // namespace velktest
