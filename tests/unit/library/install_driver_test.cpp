// The loop that carries a request from a filled table to installed packages. All packages are
// local system firmware; the controller refuses each at once unless said otherwise.

#include "provider/install_driver.h"

#include <cerrno>

#include "provider/package_list.h"
#include "provider/work_area.h"
#include "tests/support/broker_test.h"
#include "tests/unit/library/descriptor_fixture.h"
#include "velk/request_state.h"

namespace {

namespace fs = std::filesystem;
using velktest::entry;
using velktest::property;
using velktest::set_field;
using Texts = std::vector<std::string>;

class InstallDriver : public velktest::BrokerTest {
  protected:
    InstallDriver() {
        controller().end = {CMPI_RC_OK, "", 0, {}};
        invoke_client = 1;
    }

    // A descriptor of that name; its payload is NAME.bin beside it.
    std::string add(const std::string &name, const std::string &category,
                    const std::string &more = "", const std::string &type = "1") {
        velktest::write_file(packages_.path() / (name + ".xml"),
                             property("Name", "name of " + name) + property("type", type) +
                                 property("category", category) +
                                 property("payload", name + ".bin") +
                                 property("identificationCode", name) + more);
        return location(name + ".xml");
    }

    [[nodiscard]] std::string location(const std::string &file) const {
        return "file://" + (packages_.path() / file).string();
    }

    int run(const Texts &locations) {
        std::string list = locations.front();
        for (std::size_t i = 1; i < locations.size(); ++i) {
            list += "|" + locations[i];
        }
        initPkgInstall(list.c_str());
        int result = -99;
        in_request([&](const CMPIContext *context) { result = syncInstallAllPkgs(context); });
        return result;
    }

    // The payloads that the controller was asked to install, in order.
    Texts installed() {
        Texts uris;
        for (const auto &order : controller().orders) {
            uris.push_back(order.uri);
        }
        return uris;
    }

  private:
    velktest::TempFolder packages_;
};

}  // namespace

TEST_F(InstallDriver, PackagesAreDeployedInTheOrderOfTheirFlags) {
    run({add("fpga", "FPGA"), add("uefi", "UEFI"), add("rxc", "RXC")});
    EXPECT_EQ(installed(),
              (Texts{location("uefi.bin"), location("rxc.bin"), location("fpga.bin")}));
}

TEST_F(InstallDriver, DescriptorsAreReadInTableOrderAndRemovedOneByOne) {
    run({add("fpga", "FPGA"), add("uefi", "UEFI")});
    EXPECT_EQ(transfer().deleted, (Texts{location("fpga.xml"), location("uefi.xml"),
                                         location("uefi.bin"), location("fpga.bin")}));
}

TEST_F(InstallDriver, ResultIsThatOfTheLastInstaller) {
    EXPECT_EQ(run({add("rxc", "RXC")}), 1);
    controller().end = {
        CMPI_RC_OK, "", 4096, {{"Job", velktest::kit::Reference{"ZEB_UpdateJob", {}}}}};
    job().show(velktest::kit::Text("0x00|Process Completed"));
    EXPECT_EQ(run({add("rxc", "RXC")}), 0);
    EXPECT_STREQ(pkgInstance[0].installResult, "rxc: 50: Package installation successfully.");
    EXPECT_EQ(totalstatus, 1);
}

TEST_F(InstallDriver, WithoutADeployedPackageTheResultIsOne) {
    EXPECT_EQ(run({add("nic", "Network", "", "2")}), 1);
    EXPECT_TRUE(installed().empty());
}

TEST_F(InstallDriver, UnsupportedTypeIsReportedAndPassedBy) {
    run({add("nic", "Network", "", "2")});
    EXPECT_STREQ(pkgInstance[0].installResult,
                 "nic: 80: This package is not supported by current VELK provider.");
    EXPECT_EQ(transfer().deleted, Texts{location("nic.xml")}) << "its payload is not touched";
}

TEST_F(InstallDriver, RejectedPackageIsPassedBySilently) {
    // As a prerequisite of an unsupported package is put one below it, at the mark of rejection.
    const std::string need = velktest::array("preReq", {"rxc"});
    run({add("nic", "Network", need, "2"), add("rxc", "RXC")});
    EXPECT_EQ(pkgInstance[1].OrderFlag, 1000);
    EXPECT_STREQ(pkgInstance[1].installResult, "rxc: 0: Package Initialization finished");
    EXPECT_TRUE(installed().empty());
}

TEST_F(InstallDriver, PrerequisiteGoesFirst) {
    run({add("a", "UEFI", velktest::array("preReq", {"b"})), add("b", "FPGA")});
    EXPECT_EQ(installed(), (Texts{location("b.bin"), location("a.bin")}));
}

TEST_F(InstallDriver, PackageWithAMissingPrerequisiteIsDeployedLast) {
    run({add("a", "UEFI", velktest::array("preReq", {"x"})), add("b", "FPGA")});
    EXPECT_EQ(installed(), (Texts{location("b.bin"), location("a.bin")}));
    EXPECT_EQ(pkgInstance[0].OrderFlag, 1000) << "999, then marked by the refusal";
}

TEST_F(InstallDriver, UnreadableDescriptorGoesOnToTheInstallerStep) {
    EXPECT_EQ(run({location("absent.xml")}), -1) << "nothing says whose package it is";
    EXPECT_STREQ(pkgInstance[0].installResult, "absent: 12: Pakcage XML can't be opened.");
    EXPECT_EQ(pkgInstance[0].OrderFlag, 1002);
    // The payload is still the folder that the list gave it.
    EXPECT_EQ(transfer().deleted, (Texts{location("absent.xml"), location("")}));
}

TEST_F(InstallDriver, HypervisorBundleIsDeployedWithoutAFetchOrARemoval) {
    run({add("bundle", "Embedded Hypervisor")});
    EXPECT_EQ(transfer().deleted, Texts{location("bundle.xml")});
    EXPECT_EQ(velktest::occurrences(log(), "Begin to Deploy.\n"), 1);
    EXPECT_EQ(velktest::occurrences(log(), "prepare to delete the bin file."), 0);
}

TEST_F(InstallDriver, UnknownLocationKindGoesOnWithWhatTheRecordHolds) {
    add("rxc", "RXC");
    initPkgInstall("nowhere/rxc.xml");
    EXPECT_EQ(filelocation, 5);
    set_field(pkgInstance[0].LocalPkgURI, location("rxc.xml"));
    in_request([](const CMPIContext *context) { syncInstallAllPkgs(context); });
    EXPECT_EQ(installed(), Texts{location("rxc.xml")}) << "the location is never changed";
}

TEST_F(InstallDriver, FtpMarksTheFirstPackageAndFetchesNothing) {
    add("rxc", "RXC");
    EXPECT_EQ(filelocation, 0);
    initPkgInstall("ftp://server/a.xml|ftp://server/b.xml");
    in_request([](const CMPIContext *context) { syncInstallAllPkgs(context); });
    EXPECT_STREQ(pkgInstance[0].category, "Embedded Hypervisor");
    EXPECT_TRUE(transfer().deleted.empty());
    EXPECT_STREQ(pkgInstance[1].category, "");
}

TEST_F(InstallDriver, LocalClientLeavesTheMarkerAndTheFileStore) {
    velktest::write_file(at(velk::kFileStore) / "x", "x");
    run({add("rxc", "RXC")});
    EXPECT_TRUE(fs::exists(at(velk::kLockMarker)));
    EXPECT_TRUE(fs::exists(at(velk::kFileStore) / "x"));
    EXPECT_TRUE(log().ends_with("Complete InstallAllPkgs.\n"));
}

TEST_F(InstallDriver, UpdateManagersRequestIsCleanedUp) {
    velktest::write_file(at(velk::kFileStore) / "x", "x");
    invoke_client = 0;
    run({add("rxc", "RXC")});
    EXPECT_FALSE(fs::exists(at(velk::kLockMarker)));
    EXPECT_FALSE(fs::exists(at(velk::kFileStore)));
    EXPECT_TRUE(log().ends_with(
        velktest::entries(
            {"Complete InstallAllPkgs.\n", "Delete the files that left after update.\n",
             "Successfully to delete files under filestore.\n", "Successfully to delete "},
            10) +
        "/tmp/sfcb/velk.safelock\n"));
}

TEST_F(InstallDriver, MarkerIsMadeOrKept) {
    velktest::write_file(at(velk::kLockMarker), "of a former request");
    run({add("rxc", "RXC")});
    EXPECT_EQ(velktest::read_file(at(velk::kLockMarker)), "of a former request");
}

TEST_F(InstallDriver, MarkerThatCannotBeMadeIsNotReported) {
    fail_step("open:/tmp/sfcb/velk.safelock", EACCES);
    EXPECT_EQ(run({add("rxc", "RXC")}), 1);
    EXPECT_EQ(velktest::occurrences(log(), "safe lock"), 0);
    EXPECT_EQ(installed().size(), 1U);
}

TEST_F(InstallDriver, EmptyTableOnlyBeginsAndEnds) {
    in_request([](const CMPIContext *context) { EXPECT_EQ(syncInstallAllPkgs(context), 1); });
    EXPECT_EQ(log(), velktest::entries(
                         {"Enter syncInstallAllPkgs.\n", "Successfully create safe lock file !\n",
                          "Enter OrderPkgInstallation.\n", "Pakage installation sequence:"}) +
                         "\n" + entry("Complete InstallAllPkgs.\n"));
}

TEST_F(InstallDriver, PayloadsRemovalIsLogged) {
    run({add("rxc", "RXC")});
    EXPECT_NE(log().find(entry("Complete installZEBPackage\n", 10) + "\n" +
                         entry("prepare to delete the bin file.", 10) + location("rxc.bin") + "\n" +
                         entry("Delete file ", 10) + location("rxc.bin") + "\n"),
              std::string::npos);
}

TEST_F(InstallDriver, TwentyPackagesRunAndLeaveNothingOpen) {
    Texts locations;
    for (int i = 0; i < 20; ++i) {
        locations.push_back(add("p" + std::to_string(i), "RXC"));
    }
    const std::size_t before = velktest::open_descriptors();
    run(locations);
    EXPECT_EQ(velktest::open_descriptors(), before);
    EXPECT_EQ(installed().size(), 20U);
    EXPECT_EQ(installed().front(), location("p19.bin")) << "ties go to the highest index";
    EXPECT_EQ(totalstatus, 0) << "index 19 reported first, others after it";
}
