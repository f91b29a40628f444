// Brocade adapters: which are found, and an install line by line.
#include "installers/brocade_update.h"

#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr const char *kService = "BROCADE_HBASoftwareInstallationService";

class Brocade : public AdapterTest {
  protected:
    void discover() {
        in_request([](const CMPIContext *context) { getBrocadeDFNDeviceIDArray(0, context); });
    }

    int install_payload() {
        int result = -1;
        in_request([&](const CMPIContext *context) {
            result = installSingleBrcdFCpayload(context, "fw.bin", "DEV-1");
        });
        return result;
    }

    std::vector<VendorInstance> &packages() { return vendor("BROCADE_PhysicalPackage").instances; }
    std::vector<VendorInstance> &ports() { return vendor("BROCADE_PortController").instances; }

    // Of the one payload, up to the service's answer.
    static std::string way_to_call_log() {
        return entry("Enter installSingleBrcdFCpayload.\n") + "Brocade SystemName =host-1\n" +
               entry("Create BROCADE_HBASoftwareInstallationService successfully.\n") +
               entry("+++passing IN InstallOptions argument - type uint16[].\n") +
               entry("+++Setting InstallOptions element - Update.") +
               entry("+++Adding InstallOptions to argument array.\n") +
               entry("+++passing IN Target argument - type ref.\n") +
               entry("Create BROCADE_PortController sucessfully.\n") +
               entry("To install package...") + "file:///var/tmp/ZEB/Pakro/Package/fw.bin\n" +
               entry(
                   "Invoking InstallFromByteStream Method and updating flash image. "
                   "Please wait...\n");
    }

    static std::string discovery_log() {
        return entry("Enter getBrocadeDFNDeviceIDArray.\n") +
               entry("DFN raw data from Brocade provider is \"DFN-A\", to trim it.\n") +
               entry("DFN after trim is \"DFN-A\"\n") + entry("SerialNumber is SN-1\n") +
               entry("PortName is SN-1\n") + entry("find the supported deviceid.") +
               entry("Port DeviceId is DEV-1\n");
    }
};

// ---- Discovery ----

TEST_F(Brocade, PortNamedLikeThePackagesSerialNumberIsFound) {
    furnish_brocade(*this);
    package().dfnnumber = 7;
    discover();
    EXPECT_THAT(devices(), ElementsAre("DFN-A on DEV-1"));
    EXPECT_EQ(log(), discovery_log());
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances root/brocade:BROCADE_PhysicalPackage()",
                            "enumerateInstances root/brocade:BROCADE_PortController()"));
}

TEST_F(Brocade, EveryPortOfThatNameIsFound) {
    packages() = {brocade_package(" DFN-A\t", "SN-1")};
    ports() = {brocade_port("SN-1", "d1"), brocade_port("SN-2", "d2"), brocade_port("SN-1", "d3")};
    discover();
    EXPECT_THAT(devices(), ElementsAre("DFN-A on d1", "DFN-A on d3"));
    EXPECT_EQ(logged("PortName is "), 3);
}

TEST_F(Brocade, NameMustBeTheWholeSerialNumber) {
    packages() = {brocade_package("DFN-A", "SN-1a")};
    for (const char *name : {"sn-1a", "SN-1A", "SN-1", "SN-1ab", " SN-1a", ""}) {
        ports() = {brocade_port(name, "d1")};
        discover();
        EXPECT_THAT(devices(), IsEmpty()) << name;
    }
}

TEST_F(Brocade, LongNamesAreComparedWhole) {
    const std::string serial(300, 's');
    packages() = {brocade_package("DFN-A", serial)};
    ports() = {brocade_port(serial + "x", "d1"), brocade_port(serial.substr(1), "d2"),
               brocade_port(serial, "d3")};
    discover();
    EXPECT_THAT(devices(), ElementsAre("DFN-A on d3"));
}

TEST_F(Brocade, MissingNamesMatchNothing) {
    packages() = {{{}, {{"Model", text("DFN-A")}}}};
    ports() = {{{}, {{"DeviceID", text("d1")}}}, brocade_port("", "d2")};
    discover();
    EXPECT_THAT(devices(), IsEmpty());
}

TEST_F(Brocade, OnlyTheFirstAdaptersPortsAreFound) {
    packages() = {brocade_package("DFN-A", "SN-1"), brocade_package("DFN-B", "SN-2")};
    ports() = {brocade_port("SN-2", "d2"), brocade_port("SN-1", "d1")};
    discover();
    EXPECT_THAT(devices(), ElementsAre("DFN-A on d1"));
    EXPECT_EQ(logged("SerialNumber is SN-2\n"), 1) << "the second is looked at";
    EXPECT_EQ(logged("PortName is "), 2) << "but its ports have been walked";
}

TEST_F(Brocade, FiftyFirstPortIsLeftOut) {
    packages() = {brocade_package("DFN-A", "SN-1")};
    for (int i = 0; i < velk::kMaxDevices + 1; ++i) {
        ports().push_back(brocade_port("SN-1", "d" + std::to_string(i)));
    }
    discover();
    EXPECT_EQ(package().dfnnumber, velk::kMaxDevices);
    EXPECT_EQ(devices().back(), "DFN-A on d49");
}

TEST_F(Brocade, LongTextsAreCut) {
    for (const std::size_t length : {199U, 200U, 1023U}) {
        packages() = {brocade_package(std::string(length, 'M'), "SN-1")};
        ports() = {brocade_port("SN-1", std::string(length, 'd'))};
        discover();
        EXPECT_THAT(devices(), ElementsAre(std::string(199, 'M') + " on " + std::string(199, 'd')));
    }
}

TEST_F(Brocade, FailedEnumerationsFindNone) {
    for (const char *name : {"BROCADE_PhysicalPackage", "BROCADE_PortController"}) {
        furnish_brocade(*this);
        package().dfnnumber = 7;
        fail_service("broker.enumerateInstances", name, CMPI_RC_ERR_FAILED);
        discover();
        EXPECT_EQ(package().dfnnumber, 0) << name;
    }
}

TEST_F(Brocade, IndexOutsideOfTheTableFindsNone) {
    furnish_brocade(*this);
    const std::string before = session_image();
    in_request([](const CMPIContext *context) {
        getBrocadeDFNDeviceIDArray(-1, context);
        getBrocadeDFNDeviceIDArray(velk::kMaxPackages, context);
    });
    EXPECT_EQ(session_image(), before);
}

// ---- Install ----

TEST_F(Brocade, InstallIsLoggedStepByStep) {
    furnish_brocade(*this);
    EXPECT_EQ(install(installBrocadePkg), 0);
    EXPECT_EQ(log_without_matching(),
              entry("Enter installBrocadePkg.\n") + discovery_log() +
                  entry("tmpDestinationPath = file:///pkgs/adapter.zip\n") +
                  entry("Effective path: //pkgs/adapter.zip\n") + entry("minizip successfully.\n") +
                  entry("minizip finished.\n") + entry("before install the payload.\n") +
                  no_session_log() +
                  entry("Install Brocade 0 package. Payload path: fw.bin, Device ID: DEV-1\n") +
                  way_to_call_log() + entry("CBInvokeMethod Retcode:0\n") +
                  entry("util_remove_file successfully.\n") +
                  final_report_log(50, "Package installation successfully."));
}

TEST_F(Brocade, WithoutAdaptersTheStatusKeepsItsLineEnd) {
    EXPECT_EQ(install(installBrocadePkg), 0);
    EXPECT_EQ(log(), entry("Enter installBrocadePkg.\n") +
                         entry("Enter getBrocadeDFNDeviceIDArray.\n") +
                         entry("Error: No driver file name that need to be update.\n") +
                         final_report_log(57, "No driver file name that need to be update.\n"));
}

TEST_F(Brocade, FailedUnpackingIsOverlookedAndFailedMatchingIsSilent) {
    furnish_brocade(*this);
    unzip().files.clear();
    unzip().result = 3;
    EXPECT_EQ(install(installBrocadePkg), 0);
    EXPECT_TRUE(log().ends_with(entry("open file failed, return 0\n")));
    EXPECT_EQ(logged("minizip successfully.\n"), 0);
    EXPECT_EQ(logged("minizip finished.\n"), 1);
    EXPECT_THAT(reports(), IsEmpty());
}

TEST_F(Brocade, ServiceIsNamedByItsFourKeys) {
    furnish_brocade(*this);
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(vendor(kService).targets,
                ElementsAre("root/brocade:BROCADE_HBASoftwareInstallationService."
                            "CreationClassName=\"BROCADE_HBASoftwareInstallationService\","
                            "SystemName=\"host-1\","
                            "Name=\"Brocade Adapter Software Update Service\","
                            "SystemCreationClassName=\"BROCADE_ComputerSystem\""));
}

TEST_F(Brocade, OptionsHoldTheFirstSettingAlone) {
    furnish_brocade(*this);
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances "
                            "root/brocade:BROCADE_HBASoftwareInstallationService()",
                            "invokeMethod root/brocade:BROCADE_HBASoftwareInstallationService."
                            "InstallFromURI(InstallOptions={4}, "
                            "Target=root/brocade:BROCADE_PortController."
                            "SystemCreationClassName=\"BROCADE_ComputerSystem\","
                            "SystemName=\"host-1\",CreationClassName=\"BROCADE_PortController\","
                            "DeviceID=\"DEV-1\", "
                            "URI=\"file:///var/tmp/ZEB/Pakro/Package/fw.bin\")"));
}

TEST_F(Brocade, OptionsThatCannotBeMadeAreLeftOut) {
    furnish_brocade(*this);
    fail_service("broker.newArray", "uint16", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 0);
    EXPECT_EQ(up_calls().back().find("InstallOptions"), std::string::npos);
}

TEST_F(Brocade, FailedCallIsLoggedWithItsMessage) {
    furnish_brocade(*this);
    vendor(kService).answers["InstallFromURI"] = {
        {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
    EXPECT_EQ(install_payload(), 4098);
    EXPECT_EQ(log(), way_to_call_log() + entry("CBInvokeMethod Retcode:0\n") +
                         entry("Package installation error message:") + "busy\n");
}

TEST_F(Brocade, PathsThatCannotBeBuiltAreTold) {
    furnish_brocade(*this);
    fail_service("broker.newObjectPath", kService, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 1);
    EXPECT_EQ(log(), entry("Enter installSingleBrcdFCpayload.\n"));
    clear_log();
    fail_service("broker.newObjectPath", "BROCADE_PortController", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 1);
    EXPECT_TRUE(log().ends_with(entry("+++passing IN Target argument - type ref.\n") +
                                entry("Create OMC_UnitaryComputerSystem failed.\n")));
}

TEST_F(Brocade, StartedJobIsNotFollowed) {
    furnish_brocade(*this);
    vendor(kService).answers["InstallFromURI"] = {job_started()};
    install(installBrocadePkg);
    EXPECT_THAT(reports(), ElementsAre("57: Package installation error happened."));
    EXPECT_THAT(pauses(), IsEmpty());
}

}  // namespace
}  // namespace velktest
