// Asking the hypervisor to install a bundle: which service, for which system, from where.
#include "provider/install_driver.h"
#include "provider/package_list.h"
#include "tests/unit/library/descriptor_fixture.h"
#include "tests/unit/library/hypervisor_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

constexpr const char *kBundle = "file:///pkgs/metadata.zip";

// The log up to the call: the bundle, each system that was found, and the two paths. Both lines
// that end in a question mark carry two bytes that are no text of any code page in use.
std::string begin_log(const std::vector<std::string> &systems) {
    std::string log = entry("Enter InstallVMPkg\n") +
                      entry("pkgInstance[pkgIdx].TFTPPayloadPkgURIs =") + kBundle + "\n";
    for (const std::string &system : systems) {
        log += entry("vm enumerate next?\xA1\xEA\n") + system + "\n";
    }
    return log;
}

const std::string kServiceMade =
    entry("Create VMware_SoftwareInstallationService successfully?\xA1\xEA\n");
const std::string kTargetMade = entry("Create OMC_UnitaryComputerSystem sucessfully.\n");

std::string call_log(int value) {
    return entry("To install package...") + kBundle + "\n" + entry(std::to_string(value) + "\n");
}

class HypervisorInstall : public HypervisorTest {
  protected:
    HypervisorInstall() { show(kDone); }

    // Whose service was asked, and for which system.
    std::string service_and_target() {
        for (const std::string &call : up_calls()) {
            if (call.starts_with("invokeMethod")) {
                return service().targets.back() + " " + call.substr(call.find("Target="));
            }
        }
        return "";
    }
};

TEST_F(HypervisorInstall, IsLoggedStepByStep) {
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(log(), begin_log({"esxi-1"}) + kServiceMade + kTargetMade + call_log(4096) +
                         entry("Enter GetVMWareJobstatus.\n") + entry(kDone + std::string("\n")) +
                         report_log({HypervisorTest::kLocation, "bundle", 50,
                                     "Package installation successfully."}));
    EXPECT_THAT(pauses(), IsEmpty()) << "the first look is taken at once";
}

TEST_F(HypervisorInstall, ServicesAreEnumeratedThenOneIsCalledAndTheJobsAreLookedAt) {
    install();
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances root/cimv2:VMware_SoftwareInstallationService()",
                            "invokeMethod root/cimv2:VMware_SoftwareInstallationService."
                            "InstallFromURI(URI=\"file:///pkgs/metadata.zip\", "
                            "Target=root/cimv2:OMC_UnitaryComputerSystem."
                            "CreationClassName=\"OMC_UnitaryComputerSystem\",Name=\"esxi-1\")",
                            "enumerateInstances root/cimv2:VMware_ConcreteJob()"));
}

TEST_F(HypervisorInstall, ServiceIsNamedByItsFourKeys) {
    install();
    EXPECT_THAT(service().targets,
                ElementsAre("root/cimv2:VMware_SoftwareInstallationService."
                            "CreationClassName=\"VMware_SoftwareInstallationService\","
                            "SystemName=\"esxi-1\","
                            "Name=\"SoftwareInstallationService\","
                            "SystemCreationClassName=\"OMC_UnitaryComputerSystem\""));
}

TEST_F(HypervisorInstall, LastOfSeveralServicesIsUsed) {
    service().instances = {of_system(text("esxi-1")), of_system(text("esxi-2")),
                           of_system(text("esxi-3"))};
    EXPECT_EQ(install(), 1);
    EXPECT_THAT(log(), HasSubstr(begin_log({"esxi-1", "esxi-2", "esxi-3"}) + kServiceMade));
    EXPECT_THAT(service_and_target(), HasSubstr("SystemName=\"esxi-3\""));
    EXPECT_THAT(service_and_target(), HasSubstr(",Name=\"esxi-3\""));
}

TEST_F(HypervisorInstall, LastServiceCountsAlsoWithoutASystem) {
    service().instances = {of_system(text("esxi-1")), of_no_system()};
    install();
    EXPECT_THAT(log(), HasSubstr(begin_log({"esxi-1", ""}) + kServiceMade));
    EXPECT_EQ(service_and_target().find("esxi-1"), std::string::npos);
}

TEST_F(HypervisorInstall, WithoutAServiceTheCallIsAttempted) {
    service().instances = {};
    EXPECT_EQ(install(), 1) << "the double does not mind";
    EXPECT_EQ(log().find("vm enumerate next"), std::string::npos);
    EXPECT_EQ(service().targets.size(), 1U);
}

TEST_F(HypervisorInstall, WithoutAnEnumerationTheCallIsAttempted) {
    service().enumerations = {std::nullopt};
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(service().targets.size(), 1U);
    EXPECT_THAT(reports(), ElementsAre(kReportedDone));
}

TEST_F(HypervisorInstall, LongNameOfASystemDoesNoHarm) {
    service().instances = {of_system(text(std::string(5000, 's')))};
    EXPECT_EQ(install(), 1);
    EXPECT_THAT(reports(), ElementsAre(kReportedDone));
}

TEST_F(HypervisorInstall, ServiceWithoutAPathEndsItUnreported) {
    fail_service("broker.newObjectPath", kService, CMPI_RC_ERR_FAILED);
    const std::string result_before = package().installResult;
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(log(), begin_log({}));
    EXPECT_EQ(package().installResult, result_before);
    EXPECT_EQ(package().OrderFlag, 300);
    EXPECT_THAT(up_calls(), IsEmpty());
}

TEST_F(HypervisorInstall, TargetWithoutAPathIsReported) {
    fail_service("broker.newObjectPath", "OMC_UnitaryComputerSystem", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(log(), begin_log({"esxi-1"}) + kServiceMade +
                         entry("Create OMC_UnitaryComputerSystem failed.\n") +
                         report_log({HypervisorTest::kLocation, "bundle", 56,
                                     "Create OMC_UnitaryComputerSystem failed."}));
    EXPECT_EQ(package().OrderFlag, 300);
    EXPECT_THAT(service().targets, IsEmpty());
}

TEST_F(HypervisorInstall, FailedCallIsReportedWithItsMessageAndRejectsThePackage) {
    answer({.outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "host is in use"});
    EXPECT_EQ(install(), 0);
    EXPECT_EQ(log(), begin_log({"esxi-1"}) + kServiceMade + kTargetMade + call_log(0) +
                         report_log({HypervisorTest::kLocation, "bundle", 56,
                                     "Package installation error message: host is in use"}) +
                         entry("Complete InstallVMPkg\n"));
    EXPECT_EQ(package().OrderFlag, 1000);
    EXPECT_EQ(up_calls().size(), 2U) << "no job is looked at";
}

TEST_F(HypervisorInstall, FailedCallWithoutAMessageIsReportedWithAnEmptyOne) {
    fail_service("broker.invokeMethod", std::string(kService) + ".InstallFromURI",
                 CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(install(), 0);
    EXPECT_THAT(reports(), ElementsAre("56: Package installation error message: "));
}

TEST_F(HypervisorInstall, ReturnValueIsOnlyLogged) {
    for (const std::uint32_t value : {0U, 1U, 4097U, 4107U}) {
        clear_log();
        set_field(package().TFTPPayloadPkgURIs, "file:///pkgs/");
        answer({.value = value, .outputs = {}, .message = {}});
        EXPECT_EQ(install(), 1);
        EXPECT_THAT(log(), HasSubstr(call_log(static_cast<int>(value))));
        EXPECT_THAT(reports(), ElementsAre(kReportedDone));
    }
}

TEST_F(HypervisorInstall, MetadatasNameIsAppendedForGood) {
    install();
    install();
    EXPECT_STREQ(package().TFTPPayloadPkgURIs, "file:///pkgs/metadata.zipmetadata.zip");
}

TEST_F(HypervisorInstall, MetadatasNameIsCutToTheField) {
    const std::string folder = "file:///" + std::string(185, 'd') + "/";
    set_field(package().TFTPPayloadPkgURIs, folder);
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(package().TFTPPayloadPkgURIs, folder + "metad");
    EXPECT_STREQ(package().LocalPkgURI, "") << "the field behind it";
}

TEST_F(HypervisorInstall, IndexOutsideOfTheTableAsksNobody) {
    const std::string before = session_image();
    for (const int index : {-1, 20}) {
        EXPECT_EQ(install(index), 0);
    }
    EXPECT_EQ(session_image(), before);
    EXPECT_THAT(up_calls(), IsEmpty());
}

// A whole request: which packages come to this installer, and with which location.
class HypervisorRequest : public HypervisorInstall {
  protected:
    int run(const std::string &locations) {
        initPkgInstall(locations.c_str());
        int result = -99;
        in_request([&](const CMPIContext *context) { result = syncInstallAllPkgs(context); });
        return result;
    }

    std::string write_bundle(const std::string &type) {
        return write_descriptor(property("Name", "VMware ESXi 5.1") + property("type", type) +
                                property("category", "Embedded Hypervisor") +
                                property("payload", "depot/") +
                                property("identificationCode", "bundle"));
    }

    // The location that the service was given; empty when it was not called.
    std::string installed_from() {
        for (const std::string &call : up_calls()) {
            const auto from = call.find("InstallFromURI(URI=\"");
            if (from != std::string::npos) {
                const auto begin = from + std::string("InstallFromURI(URI=\"").size();
                return call.substr(begin, call.find('"', begin) - begin);
            }
        }
        return "";
    }
};

TEST_F(HypervisorRequest, BundleOfTypeOneIsInstalledFromWhereItLies) {
    const std::string location = write_bundle("1");
    EXPECT_EQ(run(location), 1);
    EXPECT_EQ(installed_from(), location.substr(0, location.rfind('/') + 1) + "depot/metadata.zip");
    EXPECT_THAT(transfer().deleted, ElementsAre(location)) << "no payload is removed";
    EXPECT_STREQ(pkgInstance[0].installResult,
                 "descriptor: 50: Package installation successfully.");
}

TEST_F(HypervisorRequest, BundleOfAnotherTypeIsNotSupported) {
    EXPECT_EQ(run(write_bundle("2")), 1);
    EXPECT_EQ(installed_from(), "");
    EXPECT_STREQ(pkgInstance[0].installResult,
                 "descriptor: 80: This package is not supported by current VELK provider.");
}

TEST_F(HypervisorRequest, BundleOnATftpServerIsNotFetchedOnlyItsDescriptorIs) {
    const std::string fetched = write_bundle("1");
    transfer().on_transfer = [=](const std::string &source) {
        EXPECT_EQ(source, "tftp://server/pkgs/bundle.xml");
        return MethodEnd{CMPI_RC_OK, "", 0, {{"DestinationURI", kit::Text(fetched)}}};
    };
    EXPECT_EQ(run("tftp://server/pkgs/bundle.xml"), 1);
    EXPECT_EQ(installed_from(), "tftp://server/pkgs/depot/metadata.zip");
    EXPECT_THAT(transfer().deleted, ElementsAre(fetched));
}

TEST_F(HypervisorRequest, FirstPackageOfAnFtpRequestIsABundle) {
    EXPECT_EQ(run("ftp://server/a/x.xml|ftp://server/b/y.xml"), 1);
    EXPECT_EQ(installed_from(), "ftp://server/a/metadata.zip");
    EXPECT_EQ(service().targets.size(), 1U) << "the second one is fetched, and nothing comes of it";
    EXPECT_STREQ(pkgInstance[0].installResult, "x: 50: Package installation successfully.");
    EXPECT_STREQ(pkgInstance[1].installResult, "y: 0: Package Initialization finished");
    EXPECT_THAT(transfer().deleted, IsEmpty());
}

}  // namespace
}  // namespace velktest
