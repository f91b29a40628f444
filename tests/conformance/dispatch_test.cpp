// Which calls of a client are answered, with what, and what they leave in the debug log.

#include <cerrno>

#include "tests/conformance/conformance_test.h"
#include "tests/conformance/recorded_call.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::RecordedCalls;
using Sent = std::vector<std::string>;
namespace cim = velktest::cim;
namespace fs = std::filesystem;

const std::string kEnd = entry("Complete ZEB_VMWarePackageInstallationProviderInvokeMethod.\n");
constexpr const char *kLock = "/tmp/sfcb/velk.safelock";

class Dispatch : public velktest::ConformanceTest {
  protected:
    Dispatch() {
        cim::ClassDecl declaration;
        declaration.name = kSubclass;
        declaration.superclass = velktest::ProviderHost::kClass;
        EXPECT_EQ(broker().repository().add_class(velktest::ProviderHost::kNamespace, declaration),
                  "");
        host().clear_log();
    }

    // Its calls reach the provider of the class that it derives from.
    static constexpr const char *kSubclass = "PAKRO_Subclass";

    static std::string begin(const std::string &method) {
        return entries({"Enter ZEB_VMWarePackageInstallationProviderInvokeMethod.\n",
                        "velk version is 5.1-9.100 for patch9.\n", "methodName:"}) +
               method + "\n";
    }

    void expect_invalid_name(const velkhost::broker::MethodReply &reply) {
        EXPECT_EQ(reply.status.code, 17);
        EXPECT_EQ(reply.status.message, "InValid Method Name");
        EXPECT_TRUE(reply.return_done);
    }
};

}  // namespace

TEST_F(Dispatch, UnknownMethodIsRefusedBetweenOpeningAndClosingEntries) {
    for (const char *method : {"Install", "InstallFromURI2", "InstallFromUR", "", "GetInstance"}) {
        host().clear_log();
        expect_invalid_name(host().call(method));
        EXPECT_EQ(host().log(), begin(method) + kEnd);
    }
}

TEST_F(Dispatch, OtherClassIsRefusedWhateverTheMethod) {
    for (const char *method : {"InstallFromURI", "ResetCimmon", "DeleteVELKDebugLogFile"}) {
        host().clear_log();
        expect_invalid_name(host().call(method, {uri()}, kSubclass));
        EXPECT_EQ(host().log(), begin(method) + kEnd) << "nothing was done";
    }
    EXPECT_EQ(host().value("pkgnum"), 0);
}

TEST_F(Dispatch, NamesAreComparedWithoutRegardToCase) {
    for (const char *method : {"RESETCIMMON", "resetcimmon", "deleteVelkDEBUGLogFile"}) {
        EXPECT_TRUE(host().call(method).status.ok()) << method;
    }
    EXPECT_EQ(host().call("installfromuri").status.message, "Invalid parameter URI.");
    EXPECT_TRUE(host().call("ResetCimmon", {}, "pakro_vmPKGinstallationSERVICE").status.ok());
}

TEST_F(Dispatch, ResetRemovesTheFileStoreAndTheLock) {
    velktest::write_file(host().at("/var/tmp/filestore/deep/payload.bin"), "x");
    velktest::write_file(host().at(kLock), "");
    const auto reply = host().call("ResetCimmon");
    EXPECT_EQ(reply.return_value, cim::Value::uint32(0));
    EXPECT_FALSE(fs::exists(host().at("/var/tmp/filestore")));
    EXPECT_FALSE(fs::exists(host().at(kLock)));
    EXPECT_EQ(host().log(),
              begin("ResetCimmon") +
                  entries({"Enter ResetCimmon.\n", "Delete the files that left after update.\n",
                           "Successfully to delete files under filestore.\n",
                           "Successfully to delete "}) +
                  kLock + "\n" + kEnd);
}

TEST_F(Dispatch, ResetOfACleanHostAnswersZeroAsWell) {
    const auto reply = host().call("ResetCimmon");
    EXPECT_TRUE(reply.status.ok());
    EXPECT_EQ(reply.return_value, cim::Value::uint32(0));
    EXPECT_TRUE(reply.return_done);
    EXPECT_TRUE(host().log().ends_with(
        entries({"Fail to delete files under filestore.\n", "Fail to delete VELK_LOCK_FILE.\n"}) +
        kEnd));
}

TEST_F(Dispatch, DeletedLogBeginsWithItsSuccessLine) {
    const auto reply = host().call("DeleteVELKDebugLogFile");
    EXPECT_EQ(reply.return_value, cim::Value::uint32(0));
    EXPECT_EQ(host().log(), entry("Successfully to delete ") + "/tmp/velkdebug.txt\n" + kEnd);
}

TEST_F(Dispatch, LogThatCannotBeDeletedAnswersZeroAsWell) {
    host().fail_step("unlink:/tmp/velkdebug.txt", EPERM);
    const auto reply = host().call("DeleteVELKDebugLogFile");
    EXPECT_TRUE(reply.status.ok());
    EXPECT_EQ(reply.return_value, cim::Value::uint32(0));
    EXPECT_EQ(host().log(), begin("DeleteVELKDebugLogFile") +
                                entries({"calling Method: DeleteVELKDebugLogFile\n",
                                         "Delete the velk debug log file.\n",
                                         "Fail to delete velk debug log file.\n"}) +
                                kEnd);
}

TEST_F(Dispatch, EveryAnswerSendsItsValueAndThenDone) {
    RecordedCalls calls(host());
    for (const char *method : {"ResetCimmon", "DeleteVELKDebugLogFile", "NoSuchMethod"}) {
        EXPECT_EQ(calls.call(method, {}).sent, (Sent{"returnData uint32 0", "returnDone"}))
            << method;
    }
}

TEST_F(Dispatch, MaintenanceIsServedWhileAnInstallRuns) {
    ASSERT_NO_FATAL_FAILURE(start({"file:///no/such.xml"}));
    EXPECT_TRUE(host().call("ResetCimmon").status.ok());
    EXPECT_TRUE(host().call("DeleteVELKDebugLogFile").status.ok());
    EXPECT_TRUE(host().wait_until_idle());
}

TEST_F(Dispatch, UnwritableLogChangesNoAnswer) {
    host().fail_step("open:/tmp/velkdebug.txt", EACCES);
    EXPECT_EQ(host().call("ResetCimmon").return_value, cim::Value::uint32(0));
    expect_invalid_name(host().call("NoSuchMethod"));
    EXPECT_EQ(install({}).status.message, "Invalid parameter URI.");
}
