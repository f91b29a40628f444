// Which installer a package goes to.

#include "catalog/classification.h"

#include "installers/ESW_update.h"
#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/Vmware_ESXi_update.h"
#include "installers/brocade_update.h"
#include "installers/facade_update.h"
#include "tests/support/library_test.h"

namespace {

using velktest::set_field;

class Classification : public velktest::LibraryTest {
  protected:
    static velk::Installer chosen(const char *category, const char *name) {
        set_field(pkgInstance[3].category, category);
        set_field(pkgInstance[3].Name, name);
        pkgInstance[3].installer = some_installer;
        getPkgProviderName(3);
        return pkgInstance[3].installer;
    }

    static int some_installer(int, const CMPIContext *) { return 77; }
};

struct Row {
    const char *category, *name;
    velk::Installer installer;
};

}  // namespace

TEST_F(Classification, SystemFirmwareCategoriesGoToTheManagementController) {
    for (const char *category : {"UEFI", "RXC", "FPGA", "Diagnostics", "RXC2"}) {
        EXPECT_EQ(chosen(category, ""), installESWPkg) << category;
        EXPECT_EQ(chosen(category, "QLogic Broadcom"), installESWPkg) << "categories come first";
    }
}

TEST_F(Classification, CategoriesAreComparedWholeAndLetterForLetter) {
    for (const char *category :
         {"UEFI ", " UEFI", "uefi", "RXC3", "RX", "FPGAs", "diagnostics", "RXC22", ""}) {
        EXPECT_EQ(chosen(category, ""), nullptr) << category;
    }
}

TEST_F(Classification, EachRowLeadsToItsInstaller) {
    const Row rows[] = {
        {"Hard Disk Drive", "", installLSIPkg},
        {"SAS", "", installLSIPkg},
        {"Kestroval", "", installLSIPkg},
        {"Network", "Broadcom NetXtreme", installBroadcomPkg},
        {"Network", "NetXtreme by Broadcom", installBroadcomPkg},
        {"Embedded Hypervisor", "VMware ESXi 5.1", installVMPkg},
        {"Fibre", "Emulex LPe12002", installElxFCPkg},
        {"Fibre Channel", "Emulex LPe12002", installElxCNAPkg},
        {"Fibre", "QLogic QLE2562", installQlgPkg},
        {"Fibre", "Qlogic QLE2562", installQlgPkg},
        {"Fibre", "Adapter FC3172", installQlgPkg},
        {"Fibre", "Adapter FC5172", installQlgPkg},
        {"Fibre", "Brocade 1860", installBrocadePkg},
    };
    for (const Row &row : rows) {
        EXPECT_EQ(chosen(row.category, row.name), row.installer)
            << row.category << ", " << row.name;
    }
}

TEST_F(Classification, EarlierRowsWin) {
    EXPECT_EQ(chosen("SAS", "QLogic Broadcom"), installLSIPkg) << "categories come first";
    EXPECT_EQ(chosen("Network", "VMware Broadcom"), installBroadcomPkg);
    EXPECT_EQ(chosen("Network", "Emulex FC5172"), installElxCNAPkg);
    EXPECT_EQ(chosen("Network", "Old VMware"), nullptr) << "begins with, not contains";
}

TEST_F(Classification, UnknownPackageHasNoInstaller) {
    EXPECT_EQ(chosen("Network", "Some adapter"), nullptr);
    EXPECT_EQ(chosen("", ""), nullptr);
}

TEST_F(Classification, NothingIsLogged) {
    chosen("UEFI", "");
    chosen("", "");
    EXPECT_EQ(log(), "");
}

TEST_F(Classification, OnlyTheInstallerIsWritten) {
    set_field(pkgInstance[3].category, "UEFI");
    const std::string before = velktest::session_image();
    getPkgProviderName(3);
    EXPECT_EQ(pkgInstance[3].installer, installESWPkg);
    pkgInstance[3].installer = nullptr;
    EXPECT_EQ(velktest::session_image(), before);
}

TEST_F(Classification, DeployingAnUnknownPackageGivesMinusOneAndKeepsItsResult) {
    use_packages(1);
    set_field(pkgInstance[0].Name, "Some adapter");
    set_field(pkgInstance[0].installResult, "pkg: 10: last report");
    pkgInstance[0].installer = some_installer;
    EXPECT_EQ(DeployUpdate(0, nullptr), -1);
    EXPECT_EQ(log(), velktest::entry("Begin to Deploy.\n"));
    EXPECT_STREQ(pkgInstance[0].installResult, "pkg: 10: last report");
    EXPECT_EQ(pkgInstance[0].installer, nullptr) << "chosen anew right before the install";
}

TEST_F(Classification, IndexOutsideOfTheTableDoesNothing) {
    const std::string before = velktest::session_image();
    for (const int index : {-1, 20}) {
        getPkgProviderName(index);
        EXPECT_EQ(DeployUpdate(index, nullptr), -1);
    }
    EXPECT_EQ(velktest::session_image(), before);
}
