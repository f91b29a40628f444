// Payloads through QLogic's services, and the jobs that they start.
#include "tests/unit/library/qlogic_fixture.h"
#include "velk/cim.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Pauses = std::vector<int>;

class QlogicPayload : public QlogicTest, public ::testing::WithParamInterface<QlogicKind> {
  protected:
    QlogicPayload() { kind().furnish(*this); }

    static const QlogicKind &kind() { return GetParam(); }
    VendorClass &service() { return vendor(kind().service); }

    // Runs with a port controller of an enumeration, as the installer does.
    template <class Work>
    int with_port(Work work) {
        vendor(kind().port).instances = {port("port-1")};
        int result = -1;
        in_request([&](const CMPIContext *context) {
            const auto ports = velk::cim::Instances::of(
                context, velk::cim::make_path("qlogic/cimv2", kind().port));
            for (const CMPIInstance *controller : ports) {
                result = work(context, controller);
            }
        });
        return result;
    }

    int install_one(const char *path = "fw.bin") {
        return with_port([=](const CMPIContext *context, const CMPIInstance *controller) {
            return kind().install_one(context, path, controller);
        });
    }

    int install_all() {
        return with_port([](const CMPIContext *context, const CMPIInstance *controller) {
            return kind().install_all(0, context, controller);
        });
    }

    // Up to the call of the service.
    static std::string way_to_call_log() {
        const std::string service = kind().service_word;
        return entry(std::string("Eneter installSingleQlg") + kind().letters + "payload.\n") +
               kind().system_label + "host-1\n" + entry("Create " + service + " successfully.\n") +
               entry("+++passing IN InstallOptions argument - type uint16[].\n") +
               entry("+++Setting InstallOptions element - Update.\n") +
               entry("+++Adding InstallOptions to argument array.\n") +
               entry("+++passing IN Target argument - type ref.\n") +
               entry(std::string("Create ") + kind().port + " sucessfully.\n") +
               entry("To install package...") + "file:///var/tmp/ZEB/Pakro/Package/fw.bin\n" +
               entry("Invoking InstallFromURI Method and Updating flash image.Please wait...\n");
    }
    static std::string look_log(int state, int elapsed = 0) {
        return entry("Enter Get installSingleQlgNICpayload Status.\n", elapsed) +
               entry("JobState is " + std::to_string(state) + "\n", elapsed);
    }
    static std::string running_log(int elapsed) {
        return entry(std::string("Qlogic ") + kind().update + " update is running.\n",
                     elapsed - 10) +
               entry("Update time elapses", elapsed) + std::to_string(elapsed) + "\n";
    }
    static std::string failed_log() {
        return entry(std::string("Qlogic ") + kind().update +
                     " update is failed due to the jobState is 10.\n");
    }
};

TEST_P(QlogicPayload, CompletedJobIsASuccess) {
    EXPECT_EQ(install_one(), 0);
    EXPECT_EQ(log(), way_to_call_log() + entry("CBInvokeMethod Retcode:4096\n") + look_log(7));
    EXPECT_EQ(pauses(), Pauses{});
}

TEST_P(QlogicPayload, RunningJobIsLookedAtEveryTenSeconds) {
    job().looks = {job_state(4), job_state(4), job_state(7)};
    EXPECT_EQ(install_one(), 0);
    EXPECT_EQ(pauses(), Pauses(2, 10));
    EXPECT_TRUE(log().ends_with(look_log(4) + running_log(10) + look_log(4, 10) + running_log(20) +
                                look_log(7, 20)));
}

TEST_P(QlogicPayload, JobHasNoLimitOfTime) {
    job().looks = std::deque(1000, job_state(4));
    job().looks.push_back(job_state(7));
    EXPECT_EQ(install_one(), 0);
    EXPECT_EQ(pauses(), Pauses(1000, 10));
    EXPECT_EQ(logged("Update time elapses"), 1000);
    EXPECT_EQ(broker().ledger().live_clones(), 0U);
}

TEST_P(QlogicPayload, AnyOtherStateFails) {
    constexpr std::uint16_t kStates[] = {0, 1, 2, 3, 5, 6, 8, 9, 10, 11, 32768, 65535};
    for (const std::uint16_t state : kStates) {
        clear_log();
        job().looks = {job_state(state)};
        EXPECT_EQ(install_one(), 10) << state;
        EXPECT_TRUE(log().ends_with(look_log(state) + failed_log())) << "the text always says 10";
    }
    EXPECT_EQ(pauses(), Pauses{});
}

TEST_P(QlogicPayload, JobMayFailAfterItRan) {
    job().looks = {job_state(4), job_state(8)};
    EXPECT_EQ(install_one(), 10);
    EXPECT_EQ(pauses(), Pauses{10});
}

TEST_P(QlogicPayload, JobThatIsGoneFails) {
    job().looks.clear();
    EXPECT_EQ(install_one(), 10);
    EXPECT_TRUE(log().ends_with(look_log(0) + failed_log()));
}

TEST_P(QlogicPayload, JobWithoutAStateFails) {
    for (const NamedValues &look : {NamedValues{}, NamedValues{{"JobState", text("7")}},
                                    NamedValues{{"JobState", Value::null(CMPI_uint16)}}}) {
        job().looks = {look};
        EXPECT_EQ(install_one(), 10);
    }
}

TEST_P(QlogicPayload, ServiceThatNamesNoJobFails) {
    for (const NamedValues &outputs : {NamedValues{}, NamedValues{{"Job", text("job-1")}}}) {
        service().answers["InstallFromURI"] = {{.value = 4096, .outputs = outputs, .message = {}}};
        EXPECT_EQ(install_one(), 10);
    }
}

TEST_P(QlogicPayload, AnythingButAStartedJobIsAFailure) {
    for (const std::uint32_t value : {0U, 1U, 4095U, 4097U, 4107U, 0xFFFFFFFFU}) {
        clear_log();
        service().answers["InstallFromURI"] = {
            {.value = value, .outputs = job_started().outputs, .message = {}}};
        EXPECT_EQ(install_one(), 4098) << value;
        const auto shown = std::to_string(static_cast<std::int32_t>(value));
        EXPECT_EQ(log(), way_to_call_log() + entry("CBInvokeMethod Retcode:" + shown + "\n") +
                             entry("Package installation error message:") + "\n");
    }
}

TEST_P(QlogicPayload, FailedCallIsLoggedWithItsMessage) {
    service().answers["InstallFromURI"] = {
        {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
    EXPECT_EQ(install_one(), 4098);
    EXPECT_EQ(log(), way_to_call_log() + entry("CBInvokeMethod Retcode:0\n") +
                         entry("Package installation error message:") + "busy\n");
}

TEST_P(QlogicPayload, ServiceIsNamedByItsFourKeys) {
    install_one();
    EXPECT_THAT(service().targets,
                ElementsAre(std::string("qlogic/cimv2:") + kind().service +
                            ".CreationClassName=\"" + kind().service +
                            "\",SystemName=\"host-1\",Name=\"CNA_SW_INSTALLER\","
                            "SystemCreationClassName=\"QLogic_Adapter_ComputerSystem\""));
}

TEST_P(QlogicPayload, ServiceIsGivenOptionsTargetAndUri) {
    install_one("sub/fw.bin");
    const std::string service = std::string("qlogic/cimv2:") + kind().service;
    EXPECT_THAT(up_calls(),
                ElementsAre(std::string("enumerateInstances qlogic/cimv2:") + kind().port + "()",
                            "enumerateInstances " + service + "()",
                            "invokeMethod " + service +
                                ".InstallFromURI(InstallOptions={32768}, "
                                "Target=qlogic/cimv2:" +
                                kind().port +
                                ".DeviceID=\"port-1\", "
                                "URI=\"file:///var/tmp/ZEB/Pakro/Package/sub/fw.bin\")",
                            "getInstance qlogic/cimv2:QLogic_UpdateJob(InstanceID=\"job-1\")"));
}

TEST_P(QlogicPayload, LastServiceNamesTheSystem) {
    service().instances = {service_on("host-1"), service_on("host-2")};
    install_one();
    EXPECT_EQ(logged(std::string(kind().system_label) + "host-1\n"), 1);
    EXPECT_NE(service().targets.back().find("SystemName=\"host-2\""), std::string::npos);
    service().instances.clear();
    install_one();
    EXPECT_NE(service().targets.back().find("SystemName=NULL"), std::string::npos);
}

TEST_P(QlogicPayload, WithoutAPathOfTheServiceNothingIsCalled) {
    fail_service("broker.newObjectPath", kind().service, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one(), 1);
    EXPECT_EQ(log(), entry(std::string("Eneter installSingleQlg") + kind().letters + "payload.\n"));
}

TEST_P(QlogicPayload, WithoutAPortControllerNothingIsCalled) {
    int result = -1;
    in_request([&](const CMPIContext *context) {
        result = kind().install_one(context, "fw.bin", nullptr);
    });
    EXPECT_EQ(result, 1);
    EXPECT_TRUE(log().ends_with(entry("+++passing IN Target argument - type ref.\n") +
                                entry(kind().no_target)));
    EXPECT_THAT(service().targets, IsEmpty());
}

TEST_P(QlogicPayload, OptionsThatCannotBeMadeAreLeftOut) {
    fail_service("broker.newArray", "uint16", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(install_one(), 0);
    EXPECT_EQ(up_calls()[2].find("InstallOptions"), std::string::npos);
}

// ---- The loop over the payloads ----

TEST_P(QlogicPayload, AllAreInstalledThroughOnePortController) {
    put_payload("a.bin", "SN-1");
    put_payload("b.bin", "SN-1");
    EXPECT_EQ(install_all(), 0);
    EXPECT_THAT(installs(), ElementsAre("a.bin to port-1", "b.bin to port-1"));
    EXPECT_TRUE(
        log().starts_with(entry(std::string("Enter installQlg") + kind().letters + "payload.\n") +
                          entry(std::string(kind().payload_begin) + "0" + kind().payload_end +
                                "a.bin, Device ID: SN-1\n")));
    EXPECT_EQ(logged(std::string(kind().payload_begin) + "1" + kind().payload_end +
                     "b.bin, Device ID: SN-1\n"),
              1);
}

TEST_P(QlogicPayload, FailureIsOneWhateverItWas) {
    put_payload("a.bin", "SN-1");
    put_payload("b.bin", "SN-1");
    put_payload("c.bin", "SN-1");
    job().looks = {job_state(7), job_state(10)};
    EXPECT_EQ(install_all(), 1);
    EXPECT_EQ(installs().size(), 2U) << "the third is not tried";
    const std::string line = std::string("installQlg") + kind().letters + "payload() failed: ";
    EXPECT_TRUE(log().ends_with(entry(line + "10\n")));
    service().answers["InstallFromURI"] = {{}};
    EXPECT_EQ(install_all(), 1);
    EXPECT_TRUE(log().ends_with(entry(line + "4098\n")));
}

TEST_P(QlogicPayload, NoneIsNoFailure) {
    EXPECT_EQ(install_all(), 0);
    EXPECT_THAT(installs(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Each, QlogicPayload, ::testing::Values(kQlogicNic, kQlogicFc),
                         [](const auto &about) { return std::string(about.param.name); });

}  // namespace
}  // namespace velktest
