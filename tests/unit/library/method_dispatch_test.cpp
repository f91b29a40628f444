// Which method calls are answered, and with what.

#include <cerrno>

#include "provider/work_area.h"
#include "tests/unit/library/request_fixture.h"

namespace {

using velktest::entries;
using velktest::entry;
namespace fs = std::filesystem;

class MethodDispatch : public velktest::RequestTest {
  protected:
    static std::string begin(const std::string &method) {
        return entries({"Enter ZEB_VMWarePackageInstallationProviderInvokeMethod.\n",
                        "velk version is 5.1-9.100 for patch9.\n", "methodName:"}) +
               method + "\n";
    }
};

// A result that keeps nothing but the numbers that were sent: brokers always pass a path and
// arguments, so that a call without them is made by hand.
std::vector<unsigned> values_sent;

const CMPIResult *bare_result() {
    static CMPIResultFT table{};
    table.returnData = [](const CMPIResult *, const CMPIValue *value, CMPIType type) {
        EXPECT_EQ(type, CMPI_uint32);
        values_sent.push_back(value->uint32);
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    table.returnDone = [](const CMPIResult *) { return CMPIStatus{CMPI_RC_OK, nullptr}; };
    static CMPIResult result{nullptr, &table};
    values_sent.clear();
    return &result;
}

const std::string kEnd = entry("Complete ZEB_VMWarePackageInstallationProviderInvokeMethod.\n");

}  // namespace

TEST_F(MethodDispatch, UnknownMethodIsRefused) {
    for (const char *method : {"Install", "InstallFromURI2", "", "GetInstance"}) {
        clear_log();
        const auto reply = call(method);
        EXPECT_EQ(reply.status.code, CMPI_RC_ERR_METHOD_NOT_FOUND);
        EXPECT_EQ(reply.status.code, 17);
        EXPECT_EQ(reply.status.message, "InValid Method Name");
        EXPECT_TRUE(reply.return_done);
        EXPECT_EQ(log(), begin(method) + kEnd);
    }
}

TEST_F(MethodDispatch, OtherClassIsRefusedWhateverTheMethod) {
    for (const char *method : {"InstallFromURI", "ResetCimmon", "DeleteVELKDebugLogFile"}) {
        const auto reply = call(method, {uri()}, kOtherClass);
        EXPECT_EQ(reply.status.code, 17);
        EXPECT_EQ(reply.status.message, "InValid Method Name");
    }
    EXPECT_EQ(pkgnum, 0);
}

TEST_F(MethodDispatch, ResetAnswersZeroWhateverItFound) {
    velktest::write_file(at(velk::kLockMarker), "");
    for (int i = 0; i < 2; ++i) {
        clear_log();
        const auto reply = call("ResetCimmon");
        EXPECT_TRUE(reply.status.ok());
        EXPECT_EQ(reply.return_value, velktest::cim::Value::uint32(0));
        EXPECT_TRUE(reply.return_done);
        EXPECT_FALSE(fs::exists(at(velk::kLockMarker)));
        EXPECT_TRUE(log().starts_with(
            begin("ResetCimmon") +
            entries({"Enter ResetCimmon.\n", "Delete the files that left after update.\n"})));
        EXPECT_TRUE(log().ends_with(kEnd));
    }
}

TEST_F(MethodDispatch, DeletedLogStartsWithItsSuccessLine) {
    const auto reply = call("DeleteVELKDebugLogFile");
    EXPECT_TRUE(reply.status.ok());
    EXPECT_EQ(reply.return_value, velktest::cim::Value::uint32(0));
    EXPECT_EQ(log(), entry("Successfully to delete ") + "/tmp/velkdebug.txt\n" + kEnd);
}

TEST_F(MethodDispatch, LogThatStaysAnswersZeroAsWell) {
    fail_step("unlink:/tmp/velkdebug.txt", EPERM);
    const auto reply = call("DeleteVELKDebugLogFile");
    EXPECT_EQ(reply.return_value, velktest::cim::Value::uint32(0));
    EXPECT_EQ(log(), begin("DeleteVELKDebugLogFile") +
                         entries({"calling Method: DeleteVELKDebugLogFile\n",
                                  "Delete the velk debug log file.\n",
                                  "Fail to delete velk debug log file.\n"}) +
                         kEnd);
}

TEST_F(MethodDispatch, NamesAreComparedWithoutRegardToCase) {
    EXPECT_TRUE(call("RESETCIMMON").status.ok());
    EXPECT_TRUE(call("deleteVelkDebugLogFile").status.ok());
    EXPECT_EQ(call("installfromuri").status.message, "Invalid parameter URI.");
    EXPECT_TRUE(call("ResetCimmon", {}, "pakro_vmPKGinstallationSERVICE").status.ok());
}

TEST_F(MethodDispatch, CallWithoutANameOrAPathIsRefused) {
    in_request([](const CMPIContext *context) {
        const CMPIStatus status = ZEB_VMWarePackageInstallationProviderInvokeMethod(
            nullptr, context, bare_result(), nullptr, nullptr, nullptr, nullptr);
        EXPECT_EQ(status.rc, 17);
    });
    EXPECT_EQ(values_sent, std::vector<unsigned>{0});
}

TEST_F(MethodDispatch, InstallWithoutArgumentsIsRefusedWithTheClosingEntry) {
    in_request([](const CMPIContext *context) {
        const velk::cim::Path path = velk::cim::make_path(kNamespace, kClass);
        const CMPIStatus status = ZEB_VMWarePackageInstallationProviderInvokeMethod(
            nullptr, context, bare_result(), path.get(), "InstallFromURI", nullptr, nullptr);
        EXPECT_EQ(status.rc, 17);
        EXPECT_STREQ(velk::cim::message_of(status), "IN Parameter is NULL");
    });
    EXPECT_EQ(values_sent, std::vector<unsigned>{0});
    EXPECT_EQ(log(), begin("InstallFromURI") + entry("calling Method: InstallFromURI.\n") + kEnd);
}
