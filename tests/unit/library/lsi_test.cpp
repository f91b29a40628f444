// LSI controllers: an install line by line.
#include "tests/unit/library/facade_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr const char *kService = "TAVU_SoftwareInstallationService";

class Lsi : public FacadeTest {
  protected:
    Lsi() { furnish_lsi(*this); }

    int install_payload(const char *folder = "/folder/") {
        return result_of(
            [=](const CMPIContext *context) { return installSingleLSIpayload(context, folder); });
    }

    auto &answers() { return vendor(kService).answers["InstallFromURI"]; }
};

TEST_F(Lsi, InstallIsLoggedStepByStep) {
    EXPECT_EQ(install(installLSIPkg), 0);
    EXPECT_EQ(log(),
              way_to_payload_log("--> installLSIPkg.\n") + entry("--> installLSIpayload.\n") +
                  entry("--> installSingleLSIpayload.\n") + call_log(kService, kUnpackFolder, 0) +
                  final_report_log(50, "Package installation successfully.") +
                  entry("<-- installLSIPkg.\n"));
}

TEST_F(Lsi, ServiceIsNamedByItsFourKeys) {
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(vendor(kService).targets,
                ElementsAre("tavu/cimv2:TAVU_SoftwareInstallationService."
                            "SystemCreationClassName=\"TAVU Provider\","
                            "SystemName=\"Management Controller\","
                            "Name=\"TAVUSoftwareInstallationService\","
                            "CreationClassName=\"TAVU_SoftwareInstallationService\""));
}

TEST_F(Lsi, ServiceIsGivenTheFolderAloneAndIsNotEnumerated) {
    EXPECT_EQ(install_payload(), 0);
    EXPECT_THAT(up_calls(), ElementsAre("invokeMethod tavu/cimv2:TAVU_SoftwareInstallationService."
                                        "InstallFromURI(URI=\"/folder/\")"));
}

TEST_F(Lsi, PayloadFunctionPassesItsFolderOn) {
    EXPECT_EQ(result_of([](const CMPIContext *context) {
                  return installLSIpayload(0, context, "/other/");
              }),
              0);
    EXPECT_EQ(log(), entry("--> installLSIpayload.\n") + entry("--> installSingleLSIpayload.\n") +
                         call_log(kService, "/other/", 0));
}

TEST_F(Lsi, ReturnValueIsTheResult) {
    for (const std::uint32_t value : {0U, 1U, 12U, 13U, 4096U, 4097U, 4107U, 0xFFFFFFFFU}) {
        answers() = {{.value = value, .outputs = {}, .message = {}}};
        EXPECT_EQ(install_payload(), static_cast<int>(value));
    }
    EXPECT_THAT(pauses(), IsEmpty()) << "no job is followed";
}

TEST_F(Lsi, WithoutAPathOfTheServiceNothingIsCalled) {
    fail_service("broker.newObjectPath", kService, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_payload(), 1);
    EXPECT_EQ(log(), entry("--> installSingleLSIpayload.\n"));
    EXPECT_THAT(up_calls(), IsEmpty());
}

TEST_F(Lsi, FailedCallIsLoggedWithItsMessage) {
    answers() = {{.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
    EXPECT_EQ(install_payload(), 4098);
    EXPECT_EQ(log(), entry("--> installSingleLSIpayload.\n") + call_log(kService, "/folder/", 0) +
                         entry("Package installation error message:") + "busy\n");
}

}  // namespace
}  // namespace velktest
