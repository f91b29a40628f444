// What a broker sees of the library before the first request and when it wants to unload it.

#include <cmpi/cmpift.h>

#include "tests/conformance/conformance_test.h"

namespace {

using velktest::entry;
namespace cim = velktest::cim;

using MethodFactory = CMPIMethodMI *(const CMPIBroker *, const CMPIContext *, CMPIStatus *);
using InstanceFactory = CMPIInstanceMI *(const CMPIBroker *, const CMPIContext *, CMPIStatus *);

const std::string kStarted =
    entry("VELK:  Initializing the ZEB vmware package installation Provider.\n");

class Lifecycle : public velktest::ConformanceTest {
  protected:
    CMPIMethodMI *method_mi(CMPIStatus *status = nullptr) {
        return host().function<MethodFactory>(
            "ZEB_VMWarePackageInstallationProvider_Create_MethodMI")(broker().cmpi(), nullptr,
                                                                     status);
    }
    CMPIInstanceMI *instance_mi(CMPIStatus *status = nullptr) {
        return host().function<InstanceFactory>(
            "ZEB_VMWarePackageInstallationProvider_Create_InstanceMI")(broker().cmpi(), nullptr,
                                                                       status);
    }

    template <class Slot>
    void expect_export(Slot slot, const std::string &name) {
        const std::string symbol = "ZEB_VMWarePackageInstallationProvider" + name;
        EXPECT_EQ(slot, host().function<std::remove_pointer_t<Slot>>(symbol.c_str())) << symbol;
    }

    // A request that is at its end: the only package cannot be read, so that nothing is installed,
    // but it has reported.
    void report_progress() { run({"file:///no/such.xml"}); }

    std::vector<unsigned> cleanup_answers() {
        const CMPIStatus method = method_mi()->ft->cleanup(method_mi(), nullptr, 0);
        const CMPIStatus instance = instance_mi()->ft->cleanup(instance_mi(), nullptr, 0);
        EXPECT_EQ(method.msg, nullptr);
        EXPECT_EQ(instance.msg, nullptr);
        return {unsigned{method.rc}, unsigned{instance.rc}};
    }
};

}  // namespace

TEST_F(Lifecycle, LoadingCallsBothFactoriesAndLogsTwoStarts) {
    EXPECT_EQ(host().log(), kStarted + kStarted);
}

TEST_F(Lifecycle, LoadingLeavesEveryIntegerOfTheSessionZero) {
    for (const char *name :
         {"pkgnum", "filelocation", "totalstatus", "is_sync_install", "is_async_install",
          "invoke_client", "g_is_backup_update", "g_is_noreboot_update", "Velkchild_thread_num",
          "ga_is_thread_running"}) {
        EXPECT_EQ(host().value(name), 0) << name;
    }
    EXPECT_EQ(std::string(host().data<char[40]>("instanceID"), 40), std::string(40, '\0'));
}

TEST_F(Lifecycle, NamesAreThoseOfTheServedClass) {
    EXPECT_STREQ(host().data<const char *>("_VELKClassName"), "PAKRO_VMpkgInstallationService");
    EXPECT_STREQ(host().data<const char *>("_VELKSuperClassName"),
                 "CIM_SoftwareInstallationService");
    EXPECT_STREQ(host().data<const char *>("_VELKNameSpace"), "velk/cimv2");
}

TEST_F(Lifecycle, MethodTableHasItsVersionsNameAndSlots) {
    const CMPIMethodMI *mi = method_mi();
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, "methodZEB_VMWarePackageInstallationProvider");
    expect_export(mi->ft->cleanup, "MethodCleanup");
    expect_export(mi->ft->invokeMethod, "InvokeMethod");
}

TEST_F(Lifecycle, InstanceTableHasItsVersionsNameAndSlots) {
    const CMPIInstanceMI *mi = instance_mi();
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, "instanceZEB_VMWarePackageInstallationProvider");
    expect_export(mi->ft->cleanup, "Cleanup");
    expect_export(mi->ft->enumerateInstanceNames, "EnumInstanceNames");
    expect_export(mi->ft->enumerateInstances, "EnumInstances");
    expect_export(mi->ft->getInstance, "GetInstance");
    expect_export(mi->ft->createInstance, "CreateInstance");
    expect_export(mi->ft->modifyInstance, "ModifyInstance");
    expect_export(mi->ft->deleteInstance, "DeleteInstance");
    expect_export(mi->ft->execQuery, "ExecQuery");
}

TEST_F(Lifecycle, FactoriesReturnTheSameObjectsEveryTime) {
    EXPECT_EQ(method_mi(), method_mi());
    EXPECT_EQ(instance_mi(), instance_mi());
}

TEST_F(Lifecycle, BrokerOfTheLaterFactoryCallIsKept) {
    const auto &kept = host().data<const CMPIBroker *>("ZEB_VMWarePackageInstallationBroker");
    EXPECT_EQ(kept, broker().cmpi());
    const velkhost::broker::Broker other;
    host().function<InstanceFactory>("ZEB_VMWarePackageInstallationProvider_Create_InstanceMI")(
        other.cmpi(), nullptr, nullptr);
    EXPECT_EQ(kept, other.cmpi());
    method_mi();
    EXPECT_EQ(kept, broker().cmpi());
}

TEST_F(Lifecycle, FactoriesLeaveTheStatusUntouched) {
    CMPIStatus status = {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    method_mi(&status);
    instance_mi(&status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_EQ(status.msg, nullptr);
}

TEST_F(Lifecycle, CleanUpsRefuseWhileNothingHasBeenReported) {
    EXPECT_EQ(cleanup_answers(), (std::vector<unsigned>{51, 51}));
}

TEST_F(Lifecycle, MethodCleanUpAgreesAfterTheLastPackageReported) {
    report_progress();
    ASSERT_EQ(host().value("totalstatus"), 1);
    EXPECT_EQ(cleanup_answers(), (std::vector<unsigned>{0, 51}));
}

TEST_F(Lifecycle, MethodCleanUpRefusesAgainOnceANewListIsRead) {
    report_progress();
    host().remove_job_library();
    install({uri()});
    EXPECT_EQ(cleanup_answers(), (std::vector<unsigned>{51, 51}));
}

TEST_F(Lifecycle, MethodCleanUpLogsOneEntryAndInstanceCleanUpNone) {
    CMPIMethodMI *methods = method_mi();
    CMPIInstanceMI *instances = instance_mi();
    host().clear_log();
    for (const bool terminating : {false, true}) {
        instances->ft->cleanup(instances, nullptr, terminating ? 1 : 0);
        EXPECT_EQ(host().log(), "");
    }
    methods->ft->cleanup(methods, nullptr, 0);
    EXPECT_EQ(host().log(), entry("calling ZEB_VMWarePackageInstallationProviderMethodCleanup.\n"));
}

TEST_F(Lifecycle, CleanUpsDeleteNothing) {
    report_progress();
    cleanup_answers();
    EXPECT_TRUE(std::filesystem::exists(host().at("/tmp/sfcb/velk.safelock")));
    EXPECT_TRUE(std::filesystem::exists(host().at("/tmp/sfcb/velkstatVELK-1.txt")));
    EXPECT_EQ(host().value("pkgnum"), 1);
}

TEST_F(Lifecycle, IdleBrokerKeepsTheLibraryForEver) {
    report_progress();
    using Decision = velkhost::broker::UnloadAnswer::Decision;
    for (const auto &answer : broker().idle()) {
        if (answer.provider == "ZEB_VMWarePackageInstallationProvider") {
            EXPECT_EQ(answer.decision, Decision::kStaysForEver);
            return;
        }
    }
    FAIL() << "the library was not asked";
}

TEST_F(Lifecycle, WritingRequestsAreNotSupportedAndLeaveNoLogEntry) {
    host().clear_log();
    const cim::ObjectPath path = host().service_path();
    const cim::Instance instance{path, {}};
    const velkhost::broker::Status answers[] = {
        broker().create_instance(instance).status,
        broker().modify_instance(instance),
        broker().delete_instance(path),
        broker().exec_query(path, "select * from PAKRO_VMpkgInstallationService").status,
    };
    for (const auto &answer : answers) {
        EXPECT_EQ(answer.code, 7);
        EXPECT_EQ(answer.message, "");
    }
    EXPECT_EQ(host().log(), "");
}
