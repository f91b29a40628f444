// Broadcom adapters: an install line by line, and the update that is followed to its end.
#include "tests/unit/library/facade_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Pauses = std::vector<int>;

constexpr const char *kService = "BRCMFWUP_SoftwareInstallationService";
constexpr const char *kServicePath =
    "brcmfwup/cimv2:BRCMFWUP_SoftwareInstallationService."
    "SystemCreationClassName=\"BRCMFWUP Provider\",SystemName=\"Management Controller\","
    "Name=\"BRCMFWUPSoftwareInstallationService\","
    "CreationClassName=\"BRCMFWUP_SoftwareInstallationService\"";

class Broadcom : public FacadeTest {
  protected:
    Broadcom() { furnish_broadcom(*this); }

    int install_payload(const char *folder = "/folder/") {
        return result_of([=](const CMPIContext *context) {
            return installSingleBroadcompayload(context, folder);
        });
    }

    auto &install_answers() { return vendor(kService).answers["InstallFromURI"]; }
    auto &status_answers() { return vendor(kService).answers["CheckStatus"]; }

    static std::string started_log(const std::string &folder = "/folder/") {
        return entry("Enter installSingleBroadcompayload.\n") + call_log(kService, folder, 4096);
    }
    static std::string status_log(int status, int elapsed = 0) {
        return entry("Enter GetBRCMJob Status.\n", elapsed) +
               entry("CheckStatus Retcode:0\n", elapsed) +
               entry("CheckStatus status is :" + std::to_string(status) + "\n", elapsed);
    }
    static std::string waited_log(int elapsed) {
        return entry("update brcm time elapses ", elapsed) + std::to_string(elapsed) + "\n";
    }
};

TEST_F(Broadcom, InstallIsLoggedStepByStep) {
    EXPECT_EQ(install(installBroadcomPkg), 0);
    EXPECT_EQ(log(),
              way_to_payload_log("Enter installBroadcomPkg.\n") +
                  entry("Enter installBroadcompayload.\n") + started_log(kUnpackFolder) +
                  status_log(0) +
                  entry("installBroadcompayload finished,need to delete the unzipped first.\n") +
                  final_report_log(50, "Package installation successfully.") +
                  entry("InstallBroadcomPkg Completed.\n"));
}

TEST_F(Broadcom, UnlistedResultIsToldBeforeTheRemoval) {
    const std::string first =
        "installBroadcompayload finished,need to delete the unzipped first.\n";
    const std::string files =
        "installBroadcompayload finished,need to delete the unzipped files.\n";
    struct {
        std::uint32_t status;
        bool is_unlisted;
    } const cases[] = {{0, false}, {4097, false}, {4107, false}, {2, true}, {12, true}};
    for (const auto &row : cases) {
        clear_log();
        status_answers() = {update_status(row.status)};
        install(installBroadcomPkg);
        EXPECT_EQ(logged(first), 1) << row.status;
        EXPECT_EQ(logged(entry(first) + entry(files)), row.is_unlisted ? 1 : 0);
        EXPECT_EQ(logged(files), row.is_unlisted ? 1 : 0) << row.status;
    }
}

TEST_F(Broadcom, WithoutAPathOfTheServiceTheStatusStays) {
    set_field(package().installResult, "as before");
    fail_service("broker.newObjectPath", kService, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install(installBroadcomPkg), 0);
    EXPECT_STREQ(package().installResult, "as before");
    EXPECT_EQ(log(),
              way_to_payload_log("Enter installBroadcomPkg.\n") +
                  entry("Enter installBroadcompayload.\n") +
                  entry("Enter installSingleBroadcompayload.\n") +
                  entry("installBroadcompayload finished,need to delete the unzipped first.\n") +
                  entry("InstallBroadcomPkg Completed.\n"));
    EXPECT_FALSE(is_unpacked());
    EXPECT_THAT(up_calls(), IsEmpty());
}

TEST_F(Broadcom, ServiceIsGivenTheFolderAndIsNotEnumerated) {
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(vendor(kService).targets, ElementsAre(kServicePath, kServicePath));
    EXPECT_THAT(up_calls(),
                ElementsAre("invokeMethod brcmfwup/cimv2:BRCMFWUP_SoftwareInstallationService."
                            "InstallFromURI(URI=\"/folder/\", FacadeOption=\"asyn\")",
                            "invokeMethod brcmfwup/cimv2:BRCMFWUP_SoftwareInstallationService."
                            "CheckStatus(ID=\"0\")"));
}

TEST_F(Broadcom, PayloadFunctionPassesItsFolderOn) {
    EXPECT_EQ(result_of([](const CMPIContext *context) {
                  return installBroadcompayload(0, context, "/other/");
              }),
              0);
    EXPECT_TRUE(
        log().starts_with(entry("Enter installBroadcompayload.\n") + started_log("/other/")));
}

TEST_F(Broadcom, LongFolderIsPassedWhole) {
    const std::string folder = "/" + std::string(1023, 'f');
    EXPECT_EQ(install_payload(folder.c_str()), 0);
    EXPECT_NE(up_calls()[0].find("URI=\"" + folder + "\""), std::string::npos);
}

TEST_F(Broadcom, RunningUpdateIsAskedForEveryTenSeconds) {
    status_answers() = {update_status(1), update_status(1), update_status(0)};
    EXPECT_EQ(install_payload(), 0);
    EXPECT_EQ(pauses(), Pauses(2, 10));
    EXPECT_EQ(log(), started_log() + status_log(1) + waited_log(10) + status_log(1, 10) +
                         waited_log(20) + status_log(0, 20));
}

TEST_F(Broadcom, UpdateHasNoLimitOfTime) {
    status_answers() = std::deque(1000, update_status(1));
    status_answers().push_back(update_status(0));
    EXPECT_EQ(install_payload(), 0);
    EXPECT_EQ(pauses(), Pauses(1000, 10));
    EXPECT_EQ(logged("update brcm time elapses "), 1000);
}

TEST_F(Broadcom, FinalStatusIsTheResult) {
    for (const std::uint32_t status : {2U, 7U, 4097U, 4107U, 0xFFFFFFFFU}) {
        status_answers() = {update_status(1), update_status(status)};
        EXPECT_EQ(install_payload(), static_cast<int>(status));
    }
}

TEST_F(Broadcom, StatusMayBeAnyKindOfInteger) {
    for (const Value &status : {Value::uint8(1), Value::uint16(1), Value::uint64(1)}) {
        status_answers() = {{.outputs = {{"status", status}}, .message = {}}, update_status(0)};
        EXPECT_EQ(install_payload(), 0);
    }
    EXPECT_EQ(pauses(), Pauses(3, 10));
}

TEST_F(Broadcom, ReturnValueOfTheStatusCallIsOnlyLogged) {
    VendorAnswer done = update_status(0);
    done.value = 5;
    status_answers() = {done};
    EXPECT_EQ(install_payload(), 0);
    EXPECT_EQ(logged("CheckStatus Retcode:5\n"), 1);
}

TEST_F(Broadcom, StatusThatIsNotToldIsNoSuccess) {
    const VendorAnswer failed = {
        .value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "gone"};
    for (const VendorAnswer &answer :
         {failed, VendorAnswer{}, VendorAnswer{.outputs = {{"status", text("0")}}, .message = {}},
          VendorAnswer{.outputs = {{"status", Value::null(CMPI_uint32)}}, .message = {}}}) {
        clear_log();
        status_answers() = {answer};
        install(installBroadcomPkg);
        EXPECT_THAT(reports(), ElementsAre("57: Package installation error happened."));
    }
}

TEST_F(Broadcom, AnythingButAStartedJobIsAFailure) {
    for (const std::uint32_t value : {0U, 1U, 4097U, 4107U}) {
        clear_log();
        install_answers() = {{.value = value, .outputs = {}, .message = {}}};
        EXPECT_EQ(install_payload(), 4098) << value;
        EXPECT_EQ(log(), entry("Enter installSingleBroadcompayload.\n") +
                             call_log(kService, "/folder/", static_cast<int>(value)) +
                             entry("Package installation error message:") + "\n");
    }
}

TEST_F(Broadcom, ReturnOfZeroIsReportedAsAnError) {
    install_answers() = {{}};
    install(installBroadcomPkg);
    EXPECT_THAT(reports(), ElementsAre("57: Package installation error happened."));
}

TEST_F(Broadcom, FailedCallIsLoggedWithItsMessage) {
    install_answers() = {
        {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
    EXPECT_EQ(install_payload(), 4098);
    EXPECT_TRUE(log().ends_with(entry("Package installation error message:") + "busy\n"));
}

}  // namespace
}  // namespace velktest
