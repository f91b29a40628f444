// Asking the management controller to install, and what becomes of it when it refuses.

#include "tests/unit/library/esw_fixture.h"

namespace {

using velktest::entry;
using Texts = std::vector<std::string>;
using Keys = std::vector<std::pair<std::string, std::string>>;

class SystemFirmwareStart : public velktest::SystemFirmwareTest {
  protected:
    // The controller refuses, so that nothing is followed.
    void refuse() { controller().end = {CMPI_RC_OK, "", 0, {}}; }

    static constexpr const char *kNotStarted = "56: Package installation error message: ";
};

}  // namespace

TEST_F(SystemFirmwareStart, ServiceIsNamedByItsFourKeys) {
    refuse();
    install();
    ASSERT_EQ(controller().orders.size(), 1U);
    EXPECT_EQ(controller().orders[0].keys,
              (Keys{{"SystemCreationClassName", "ZEB_ManagementController"},
                    {"SystemName", "ManagementController"},
                    {"CreationClassName", "ZEB_SoftwareInstallationService"},
                    {"Name", "RXCSoftwareInstallatiIonService"}}));
}

TEST_F(SystemFirmwareStart, PayloadsLocationIsSentAndTheServiceIsNotEnumerated) {
    refuse();
    install();
    EXPECT_EQ(up_calls(), (Texts{"invokeMethod zeb/cimv2:ZEB_SoftwareInstallationService."
                                 R"(InstallFromURI(URI="file:///pkgs/fw.bin", Update_Operation=0, )"
                                 "reboot_option=1)"}));
}

TEST_F(SystemFirmwareStart, FlagsChooseTheBankAndTheReboot) {
    struct {
        int backup, no_reboot, operation, reboot;
    } const cases[] = {
        {0, 0, 0, 1}, {1, 0, 1, 1}, {0, 1, 0, 0},
        {1, 1, 1, 0}, {2, 2, 0, 1},  // only exactly 1 counts
    };
    refuse();
    for (const auto &row : cases) {
        SCOPED_TRACE(testing::Message() << row.backup << " " << row.no_reboot);
        g_is_backup_update = row.backup;
        g_is_noreboot_update = row.no_reboot;
        clear_log();
        install();
        EXPECT_EQ(controller().orders.back().update_operation, row.operation);
        EXPECT_EQ(controller().orders.back().reboot_option, row.reboot);
        const std::string bank = row.operation == 1 ? "backup" : "primary";
        const std::string reboot = row.reboot == 1 ? "rxc reboot" : "no rxc reboot";
        EXPECT_NE(log().find("This update is for " + bank + " bank.\n"), std::string::npos);
        EXPECT_NE(log().find("This update with " + reboot + "["), std::string::npos);
    }
}

TEST_F(SystemFirmwareStart, AnythingButAStartedJobIsAFailure) {
    for (const unsigned value : {0U, 1U, 4095U, 4097U, 4098U, 4107U, 0xFFFFFFFFU}) {
        SCOPED_TRACE(value);
        package().OrderFlag = 350;
        controller().end.value = value;
        EXPECT_EQ(install(), 1);
        EXPECT_STREQ(package().installResult, (std::string("rxc: ") + kNotStarted).c_str());
        EXPECT_EQ(package().OrderFlag, 1000);
    }
    EXPECT_EQ(pauses(), std::vector<int>(7, 10)) << "one pause each, and no polling";
}

TEST_F(SystemFirmwareStart, MessageOfAFailedCallIsReported) {
    controller().end = {CMPI_RC_ERR_FAILED, "controller busy", 4096, {}};
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(reports(), Texts{std::string(kNotStarted) + "controller busy"});
    EXPECT_EQ(package().OrderFlag, 1000);
    EXPECT_EQ(pauses(), std::vector<int>{10}) << "it waits also when the call failed";
}

TEST_F(SystemFirmwareStart, FailedCallWithoutAMessageReportsThePrefixAlone) {
    fail_service("broker.invokeMethod", "ZEB_SoftwareInstallationService.InstallFromURI",
                 CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(reports(), Texts{kNotStarted});
}

TEST_F(SystemFirmwareStart, FailedStatusOutweighsTheRightValue) {
    fail_service("broker.invokeMethod", "ZEB_SoftwareInstallationService.InstallFromURI",
                 CMPI_RC_ERR_NOT_FOUND, "no such class");
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(reports(), Texts{std::string(kNotStarted) + "no such class"});
}

TEST_F(SystemFirmwareStart, LongMessageIsCut) {
    for (const std::size_t length : {163U, 1023U, 1024U, 5000U}) {
        SCOPED_TRACE(length);
        const std::string message(length, 'x');
        controller().end = {CMPI_RC_ERR_FAILED, message, 0, {}};
        install();
        const std::string whole = std::string("rxc: ") + kNotStarted + message;
        EXPECT_EQ(package().installResult, whole.substr(0, 199));
        EXPECT_STREQ(package().manufacturer, "");
    }
}

TEST_F(SystemFirmwareStart, WithoutAServicePathNothingIsReported) {
    fail_service("broker.newObjectPath", "ZEB_SoftwareInstallationService", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(log(), entry("Enter installESWPkg.\n"));
    EXPECT_STREQ(package().installResult, "");
    EXPECT_EQ(package().OrderFlag, 350);
    EXPECT_TRUE(pauses().empty());
    EXPECT_TRUE(up_calls().empty());
}

TEST_F(SystemFirmwareStart, WithoutArgumentListsTheControllerRefuses) {
    fail_service("broker.newArgs", "", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(package().OrderFlag, 1000);
}

TEST_F(SystemFirmwareStart, RefusalIsLoggedStepByStep) {
    controller().end = {CMPI_RC_ERR_FAILED, "busy", 0, {}};
    install();
    const std::string text = log();
    EXPECT_TRUE(text.starts_with(
        velktest::entries({"Enter installESWPkg.\n", "This update is for primary bank.\n",
                           "This update with rxc reboot", "To install package..."}) +
        "file:///pkgs/fw.bin\n" + entry("retCode: ") + "0\n" +
        entry("enter update velk status.\n", 10)));
    EXPECT_TRUE(text.ends_with(entry("rxc: 56: Package installation error message: busy\n", 10) +
                               entry("Complete installZEBPackage\n", 10)));
}

TEST_F(SystemFirmwareStart, IndexOutsideOfTheTableFails) {
    in_request([&](const CMPIContext *context) {
        EXPECT_EQ(installESWPkg(-1, context), 1);
        EXPECT_EQ(installESWPkg(20, context), 1);
    });
    EXPECT_TRUE(up_calls().empty());
}
