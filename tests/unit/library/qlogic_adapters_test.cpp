// The walk over a host's QLogic adapters: what is matched and installed for each.
#include "tests/unit/library/qlogic_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr const char *kSuccess = "50: Package installation successfully.";
constexpr const char *kFailed =
    "54: Error when Create Input Parameter and the installation failed.";
constexpr const char *kNothing = "57: No driver file name that need to be update.";

class QlogicAdapters : public QlogicTest {
  protected:
    QlogicAdapters() {
        furnish_qlogic_nic(*this);
        furnish_qlogic_fc(*this);
        vendor(kQlogicNic.association).linked.clear();
        vendor(kQlogicFc.association).linked.clear();
        adapters().clear();
        unzip().files.clear();
    }

    void add_adapter(const std::string &tag, const std::string &model, bool has_nic = true) {
        adapters().push_back(qlogic_adapter(tag, model, "serial of " + tag));
        ports_of(has_nic ? kQlogicNic : kQlogicFc, tag) = {port("port of " + tag)};
    }

    int run() { return install(installQlgPkg); }
};

TEST_F(QlogicAdapters, AreCounted) {
    for (int count = 0; count < 4; ++count) {
        package().dfnnumber = 7;
        in_request([](const CMPIContext *context) { getQlgPhysicalAdapterCount(0, context); });
        EXPECT_EQ(package().dfnnumber, count);
        add_adapter("adapter-" + std::to_string(count), "DFN-A");
    }
    EXPECT_THAT(up_calls().back(),
                "enumerateInstances qlogic/cimv2:QLogic_Adapter_PhysicalPackage()");
}

TEST_F(QlogicAdapters, CountIsNoneWhenTheyCannotBeEnumerated) {
    add_adapter("a", "DFN-A");
    package().dfnnumber = 7;
    fail_service("broker.enumerateInstances", "QLogic_Adapter_PhysicalPackage", CMPI_RC_ERR_FAILED);
    in_request([](const CMPIContext *context) { getQlgPhysicalAdapterCount(0, context); });
    EXPECT_EQ(package().dfnnumber, 0);
    in_request([](const CMPIContext *context) {
        getQlgPhysicalAdapterCount(-1, context);
        getQlgPhysicalAdapterCount(velk::kMaxPackages, context);
    });
}

TEST_F(QlogicAdapters, InstallIsLoggedStepByStep) {
    add_adapter("a", "  DFN-A ");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    EXPECT_EQ(run(), 0);
    const std::string all = log_without_matching();
    EXPECT_TRUE(all.starts_with(
        entry("Enter installQlgPkg.\n") + entry("tmpDestinationPath = file:///pkgs/adapter.zip\n") +
        entry("Effective path: //pkgs/adapter.zip\n") + entry("minizip successfully.\n") +
        no_session_log() +
        entry("DFN raw data from qlogic provider is \"  DFN-A \", to trim it.\n") +
        entry("DFN after trim is \"DFN-A\"\n") +
        entry("Try to get QLogic_NIC_PortController first.\n") +
        entry("Get the QLogic_NIC_PortController Instance from associators.\n") +
        entry("QLogic_NIC_PortController instance found.\n") +
        entry("Enter installQlgNICpayload.\n") +
        entry("Install Qlogic  0 package. Payload path: fw.bin, Device ID: serial of a\n")))
        << all;
    EXPECT_TRUE(all.ends_with(entry("JobState is 7\n") + entry("util_remove_file successfully.\n") +
                              final_report_log(50, "Package installation successfully.")))
        << all;
}

TEST_F(QlogicAdapters, WithoutAnyNothingIsDone) {
    EXPECT_EQ(run(), 0);
    EXPECT_EQ(log(), entry("Enter installQlgPkg.\n") +
                         entry("Error: No driver file name that need to be update.\n") +
                         final_report_log(57, "No driver file name that need to be update."));
}

TEST_F(QlogicAdapters, FibreChannelComesWhereThereIsNoNetworkFunction) {
    add_adapter("a", "DFN-A", false);
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
    EXPECT_THAT(installs(), ElementsAre("fw.bin to port of a"));
    EXPECT_NE(log().find(entry("Try to get QLogic_NIC_PortController first.\n") +
                         entry("No instance found for QLogic_NIC_PortController.\n") +
                         entry("update qlogic FCHBA.\n") +
                         entry("Get the QLogic_FCHBA_PortController Instance from associators.\n") +
                         entry("QLogic_FCHBA_PortController instance found.\n") +
                         entry("Enter installQlgFCpayload.\n")),
              std::string::npos);
}

TEST_F(QlogicAdapters, AdapterWithBothIsUpdatedThroughTheNetworkFunctionsOnly) {
    add_adapter("a", "DFN-A");
    ports_of(kQlogicNic, "a") = {port("nic-1"), port("nic-2")};
    ports_of(kQlogicFc, "a") = {port("fc-1")};
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_THAT(installs(), ElementsAre("fw.bin to nic-1", "fw.bin to nic-2"));
    EXPECT_EQ(logged("Get the QLogic_NIC_PortController Instance from associators.\n"), 1);
    EXPECT_EQ(logged("QLogic_NIC_PortController instance found.\n"), 2);
    EXPECT_EQ(logged("update qlogic FCHBA.\n"), 0);
}

TEST_F(QlogicAdapters, AdapterWithoutPortControllersIsNotInstalled) {
    add_adapter("a", "DFN-A");
    ports_of(kQlogicNic, "a")->clear();
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_THAT(reports(), ElementsAre(kNothing));
    EXPECT_EQ(logged("update qlogic FCHBA.\n"), 1);
}

TEST_F(QlogicAdapters, NetworkAssociationThatFailsEndsTheAdapter) {
    add_adapter("a", "DFN-A");
    ports_of(kQlogicNic, "a") = std::nullopt;
    ports_of(kQlogicFc, "a") = {port("fc-1")};
    add_adapter("b", "DFN-A");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_THAT(installs(), ElementsAre("fw.bin to port of b"));
    EXPECT_EQ(logged("update qlogic FCHBA.\n"), 0);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
}

TEST_F(QlogicAdapters, FibreChannelAssociationThatFailsIsTold) {
    add_adapter("a", "DFN-A", false);
    ports_of(kQlogicFc, "a") = std::nullopt;
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_EQ(logged("Association to QLogic_FCHBA_PortController returned NULL.\n"), 1);
    EXPECT_THAT(reports(), ElementsAre(kNothing));
}

TEST_F(QlogicAdapters, AdapterWithoutPayloadsIsSkipped) {
    add_adapter("a", "DFN-A");
    add_adapter("b", "DFN-B");
    offer({{"fw.bin", {"DFN-B"}, 1}});
    run();
    EXPECT_THAT(installs(), ElementsAre("fw.bin to port of b"));
    EXPECT_EQ(logged("No need to update this QLogic Port.\n"), 1);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
}

TEST_F(QlogicAdapters, PayloadsOfTheFormerAdapterAreForgotten) {
    add_adapter("a", "DFN-A");
    add_adapter("b", "DFN-B");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_THAT(installs(), ElementsAre("fw.bin to port of a"));
    EXPECT_EQ(logged("No need to update this QLogic Port.\n"), 1);
    EXPECT_EQ(package().payloadnum, 0);
    EXPECT_STREQ(package().PayloadDeviceIDArray[0].PayloadPath, "");
}

TEST_F(QlogicAdapters, PayloadsOfAFormerPackageAreForgotten) {
    add_adapter("a", "DFN-A");
    put_payload("old.bin", "SN-0");
    run();  // the archive has no configuration
    EXPECT_THAT(installs(), IsEmpty());
    EXPECT_THAT(reports(), ElementsAre(kNothing));
}

TEST_F(QlogicAdapters, EachIsMatchedAlone) {
    add_adapter("a", "DFN-A");
    add_adapter("b", "DFN-A");
    add_adapter("c", "DFN-C");
    offer({{"one.bin", {"DFN-A"}, 1}, {"two.bin", {"DFN-C", "DFN-A"}, 2}});
    run();
    EXPECT_THAT(installs(),
                ElementsAre("one.bin to port of a", "two.bin to port of a", "one.bin to port of b",
                            "two.bin to port of b", "two.bin to port of c"));
    EXPECT_EQ(logged("current DFN=\""), 3);
    EXPECT_EQ(logged("Payload path: two.bin, Device ID: serial of c\n"), 1);
    EXPECT_EQ(package().dfnnumber, 3) << "which stays the number of adapters";
}

TEST_F(QlogicAdapters, PositionAdvancesWithInstalledAdaptersOnly) {
    add_adapter("skipped", "DFN-X");
    add_adapter("first", "DFN-A");
    add_adapter("skipped as well", "DFN-X");
    add_adapter("second", "DFN-A");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_EQ(logged("current index: 0, last_size=0\n"), 2);
    EXPECT_EQ(logged("current index: 1, last_size=0\n"), 2);
    EXPECT_STREQ(package().DFNDeviceIDArray[0].DFN, "") << "the beginning is cleared each time";
    EXPECT_STREQ(package().DFNDeviceIDArray[1].DeviceID, "serial of second");
}

TEST_F(QlogicAdapters, FiftyFirstIsLeftOut) {
    for (int i = 0; i < velk::kMaxDevices + 1; ++i) {
        add_adapter("a" + std::to_string(i), "DFN-A");
    }
    offer({{"fw.bin", {"DFN-A"}, 1}});
    run();
    EXPECT_EQ(installs().size(), 50U);
    EXPECT_EQ(package().dfnnumber, 51);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
}

TEST_F(QlogicAdapters, LongTextsAreCut) {
    for (const std::size_t length : {199U, 200U, 1023U}) {
        adapters() = {qlogic_adapter("a", std::string(length, 'M'), std::string(length, 'S'))};
        ports_of(kQlogicNic, "a") = {port("p")};
        offer({{"fw.bin", {std::string(199, 'M')}, 1}});
        run();
        EXPECT_EQ(package().payloadnum, 1) << length;
        EXPECT_EQ(package().PayloadDeviceIDArray[0].DeviceID, std::string(199, 'S'));
        EXPECT_STREQ(package().DFNDeviceIDArray[1].DFN, "");
    }
}

TEST_F(QlogicAdapters, AdapterWithoutAModelTakesNoPayload) {
    adapters() = {{{{"Tag", text("a")}}, {}}};
    offer({{"fw.bin", {"", "DFN-A"}, 1}});
    run();
    EXPECT_THAT(reports(), ElementsAre(kNothing));
}

TEST_F(QlogicAdapters, LastOneDecides) {
    struct {
        std::uint16_t first, second;
        const char *report;
    } const cases[] = {{7, 7, kSuccess}, {10, 7, kSuccess}, {7, 10, kFailed}, {10, 10, kFailed}};
    add_adapter("a", "DFN-A");
    add_adapter("b", "DFN-A");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    for (const auto &row : cases) {
        job().looks = {job_state(row.first), job_state(row.second)};
        clear_log();
        run();
        EXPECT_THAT(reports(), ElementsAre(row.report)) << row.first << " " << row.second;
    }
}

TEST_F(QlogicAdapters, LastPortControllerDecides) {
    add_adapter("a", "DFN-A");
    ports_of(kQlogicNic, "a") = {port("nic-1"), port("nic-2")};
    offer({{"fw.bin", {"DFN-A"}, 1}});
    job().looks = {job_state(10), job_state(7)};
    run();
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
}

TEST_F(QlogicAdapters, JobThatFailsStopsTheAdaptersOtherPayloads) {
    add_adapter("a", "DFN-A");
    offer({{"one.bin", {"DFN-A"}, 1}, {"two.bin", {"DFN-A"}, 2}});
    job().looks = {job_state(3)};
    run();
    EXPECT_THAT(installs(), ElementsAre("one.bin to port of a"));
    EXPECT_THAT(reports(), ElementsAre(kFailed));
}

TEST_F(QlogicAdapters, ThoseThatAreGoneAfterTheCountAreNotInstalled) {
    add_adapter("a", "DFN-A");
    offer({{"fw.bin", {"DFN-A"}, 1}});
    int enumerations = 0;
    broker().set_fault_hook([&](std::string_view step, std::string_view subject) {
        const bool asks = step == "broker.enumerateInstances" &&
                          subject == "QLogic_Adapter_PhysicalPackage" && ++enumerations == 2;
        return asks ? std::optional(velkhost::broker::Fault{1, ""}) : std::nullopt;
    });
    run();
    EXPECT_THAT(reports(), ElementsAre(kNothing));
    EXPECT_EQ(unzip().calls.size(), 1U);
    EXPECT_FALSE(is_unpacked());
}

}  // namespace
}  // namespace velktest
