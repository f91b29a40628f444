// The factories, the function tables and the answers to a broker that wants to unload.

#include "provider/provider.h"

#include <cerrno>

#include "tests/support/library_test.h"
#include "velk/cim.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

using velktest::entry;

class Registration : public velktest::LibraryTest {
  protected:
    static CMPIMethodMI *make_method_mi(const CMPIBroker *broker, CMPIStatus *status = nullptr) {
        return ZEB_VMWarePackageInstallationProvider_Create_MethodMI(broker, nullptr, status);
    }
    static CMPIInstanceMI *make_instance_mi(const CMPIBroker *broker,
                                            CMPIStatus *status = nullptr) {
        return ZEB_VMWarePackageInstallationProvider_Create_InstanceMI(broker, nullptr, status);
    }

    const CMPIBroker broker_{};
    const CMPIBroker other_broker_{};
};

const std::string kStartLine =
    "[ 8: 5: 3] VELK:  Initializing the ZEB vmware package installation Provider.\n";

}  // namespace

TEST_F(Registration, NamesAreThoseOfTheServedClass) {
    EXPECT_STREQ(_VELKClassName, "PAKRO_VMpkgInstallationService");
    EXPECT_STREQ(_VELKSuperClassName, "CIM_SoftwareInstallationService");
    EXPECT_STREQ(_VELKNameSpace, "velk/cimv2");
}

TEST_F(Registration, MethodTableHoldsTheEntryPoints) {
    const CMPIMethodMI *mi = make_method_mi(&broker_);
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, "methodZEB_VMWarePackageInstallationProvider");
    EXPECT_EQ(mi->ft->cleanup, ZEB_VMWarePackageInstallationProviderMethodCleanup);
    EXPECT_EQ(mi->ft->invokeMethod, ZEB_VMWarePackageInstallationProviderInvokeMethod);
}

TEST_F(Registration, InstanceTableHoldsTheEntryPoints) {
    const CMPIInstanceMI *mi = make_instance_mi(&broker_);
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    const CMPIInstanceMIFT &table = *mi->ft;
    EXPECT_EQ(table.ftVersion, 200);
    EXPECT_EQ(table.miVersion, 200);
    EXPECT_STREQ(table.miName, "instanceZEB_VMWarePackageInstallationProvider");
    EXPECT_EQ(table.cleanup, ZEB_VMWarePackageInstallationProviderCleanup);
    EXPECT_EQ(table.enumerateInstanceNames, ZEB_VMWarePackageInstallationProviderEnumInstanceNames);
    EXPECT_EQ(table.enumerateInstances, ZEB_VMWarePackageInstallationProviderEnumInstances);
    EXPECT_EQ(table.getInstance, ZEB_VMWarePackageInstallationProviderGetInstance);
    EXPECT_EQ(table.createInstance, ZEB_VMWarePackageInstallationProviderCreateInstance);
    EXPECT_EQ(table.modifyInstance, ZEB_VMWarePackageInstallationProviderModifyInstance);
    EXPECT_EQ(table.deleteInstance, ZEB_VMWarePackageInstallationProviderDeleteInstance);
    EXPECT_EQ(table.execQuery, ZEB_VMWarePackageInstallationProviderExecQuery);
}

TEST_F(Registration, EveryFactoryCallLogsTheStart) {
    make_method_mi(&broker_);
    EXPECT_EQ(log(), kStartLine);
    make_instance_mi(&broker_);
    EXPECT_EQ(log(), kStartLine + kStartLine);
    EXPECT_EQ(ZEB_VMWarePackageInstallationProviderInit(), 0);
    EXPECT_EQ(log(), kStartLine + kStartLine + kStartLine);
}

TEST_F(Registration, BrokerOfTheLaterCallIsKept) {
    make_method_mi(&broker_);
    EXPECT_EQ(ZEB_VMWarePackageInstallationBroker, &broker_);
    make_instance_mi(&other_broker_);
    EXPECT_EQ(ZEB_VMWarePackageInstallationBroker, &other_broker_);
    make_method_mi(&broker_);
    EXPECT_EQ(ZEB_VMWarePackageInstallationBroker, &broker_);
}

TEST_F(Registration, FactoriesAlwaysReturnTheSameObjects) {
    EXPECT_EQ(make_method_mi(&broker_), make_method_mi(&other_broker_));
    EXPECT_EQ(make_instance_mi(&broker_), make_instance_mi(&other_broker_));
}

TEST_F(Registration, StatusIsLeftUntouched) {
    CMPIStatus status = {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    make_method_mi(&broker_, &status);
    make_instance_mi(&broker_, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ALREADY_EXISTS);
}

TEST_F(Registration, NothingButTheBrokerHandleChanges) {
    std::string before = velktest::session_image();
    make_method_mi(&broker_);
    ZEB_VMWarePackageInstallationBroker = nullptr;
    EXPECT_EQ(velktest::session_image(), before);
}

TEST_F(Registration, MethodCleanupAgreesOnceProgressWasReported) {
    for (const int value : {0, 1, -1}) {
        set_totalstatus(value);
        const CMPIStatus status = ZEB_VMWarePackageInstallationProviderMethodCleanup(
            make_method_mi(&broker_), nullptr, 0);
        EXPECT_EQ(status.rc, value == 0 ? CMPI_RC_NEVER_UNLOAD : CMPI_RC_OK);
        EXPECT_EQ(status.msg, nullptr);
    }
    EXPECT_TRUE(
        log().ends_with(entry("calling ZEB_VMWarePackageInstallationProviderMethodCleanup.\n")));
}

TEST_F(Registration, InstanceCleanupNeverAgreesAndLogsNothing) {
    for (const int value : {0, 1}) {
        set_totalstatus(value);
        const CMPIStatus status = ZEB_VMWarePackageInstallationProviderCleanup(nullptr, nullptr, 1);
        EXPECT_EQ(status.rc, CMPI_RC_NEVER_UNLOAD);
        EXPECT_EQ(status.rc, 51);
        EXPECT_EQ(status.msg, nullptr);
    }
    EXPECT_EQ(log(), "");
}

TEST_F(Registration, WritingOperationsAreNotSupportedAndLeaveNoTrace) {
    const CMPIStatus answers[] = {
        ZEB_VMWarePackageInstallationProviderCreateInstance(nullptr, nullptr, nullptr, nullptr,
                                                            nullptr),
        ZEB_VMWarePackageInstallationProviderModifyInstance(nullptr, nullptr, nullptr, nullptr,
                                                            nullptr, nullptr),
        ZEB_VMWarePackageInstallationProviderDeleteInstance(nullptr, nullptr, nullptr, nullptr),
        ZEB_VMWarePackageInstallationProviderExecQuery(nullptr, nullptr, nullptr, nullptr, nullptr,
                                                       nullptr),
    };
    for (const CMPIStatus &answer : answers) {
        EXPECT_EQ(answer.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(answer.rc, 7);
        EXPECT_EQ(answer.msg, nullptr);
    }
    EXPECT_EQ(log(), "");
}

TEST_F(Registration, UnwritableLogDoesNotKeepTheProviderFromLoading) {
    fail_step("open:/tmp/velkdebug.txt", EACCES);
    EXPECT_NE(make_method_mi(&broker_), nullptr);
    EXPECT_EQ(ZEB_VMWarePackageInstallationProviderInit(), -1);
}
