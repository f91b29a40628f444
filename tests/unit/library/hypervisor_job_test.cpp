// Following the hypervisor's jobs to the end of an install.
#include "tests/unit/library/hypervisor_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using ::testing::Not;

constexpr const char *kObsolete = "Updates at supplied URI are obsolete or already installed";
constexpr const char *kReportedObsolete = "59: The Updates are obsolete or already installed.";
constexpr const char *kReportedScanning = "60: Scanning URI for installable packages.";
constexpr const char *kReportedStarting =
    "61: Scan of URI Complete and installable packages found. Starting Update.";

using Pauses = std::vector<int>;

class HypervisorJob : public HypervisorTest {
  protected:
    // Every look finds these jobs; the one report.
    std::string end_of(const std::vector<VendorInstance> &jobs, int expected_result) {
        clear_log();
        set_field(package().TFTPPayloadPkgURIs, "file:///pkgs/");
        job().enumerations = {jobs};
        EXPECT_EQ(install(), expected_result);
        EXPECT_EQ(reports().size(), 1U);
        EXPECT_EQ(package().OrderFlag, 300);
        return reports().empty() ? "" : reports().back();
    }

    std::string end_of(const std::string &status, int expected_result) {
        return end_of({with_status(text(status))}, expected_result);
    }
};

TEST_F(HypervisorJob, FinalTextsEndTheInstall) {
    EXPECT_EQ(end_of(kDone, 1), kReportedDone);
    EXPECT_EQ(end_of(kObsolete, 1), kReportedObsolete);
    EXPECT_THAT(pauses(), IsEmpty());
}

TEST_F(HypervisorJob, RunningTextsAreReportedAndWaitedFor) {
    show(kScanning);
    show(kScanning);
    show(kStarting);
    show(kDone);
    EXPECT_EQ(install(), 1);
    EXPECT_THAT(reports(), ElementsAre(kReportedScanning, kReportedScanning, kReportedStarting,
                                       kReportedDone));
    EXPECT_EQ(pauses(), Pauses(3, 10));
}

TEST_F(HypervisorJob, WaitingIsLoggedWithTheTimeThatElapsed) {
    show(kScanning);
    show(kStarting);
    show(kObsolete);
    clear_log();
    EXPECT_EQ(install(), 1);
    const std::string whole = log();
    const auto begin = whole.find(entry("Enter GetVMWareJobstatus.\n"));
    ASSERT_NE(begin, std::string::npos);
    const auto look = [](const std::string &status, int elapsed) {
        return entry("Enter GetVMWareJobstatus.\n", elapsed) + entry(status + "\n", elapsed);
    };
    const auto report = [](int code, const char *message, int elapsed) {
        return report_log({HypervisorTest::kLocation, "bundle", code, message, elapsed});
    };
    EXPECT_EQ(whole.substr(begin),
              look(kScanning, 0) + report(60, "Scanning URI for installable packages.", 0) +
                  entry("Update time elapses ", 10) + "10\n" + look(kStarting, 10) +
                  report(61, kStarting, 10) + entry("Update time elapses ", 20) + "20\n" +
                  look(kObsolete, 20) +
                  report(59, "The Updates are obsolete or already installed.", 20));
}

TEST_F(HypervisorJob, ScanIsWaitedForAsLongAsItTakes) {
    constexpr int kLooks = 500;
    for (int i = 0; i < kLooks; ++i) {
        show(kScanning);
    }
    show(kDone);
    EXPECT_EQ(install(), 1);
    EXPECT_EQ(pauses(), Pauses(kLooks, 10));
    EXPECT_EQ(occurrences(log(), "Update time elapses "), kLooks);
    EXPECT_EQ(occurrences(log(), "] Update time elapses 5000\n"), 1);
    std::vector<std::string> expected(kLooks, kReportedScanning);
    expected.emplace_back(kReportedDone);
    EXPECT_THAT(reports(), ElementsAreArray(expected));
}

TEST_F(HypervisorJob, TextsMustFitWhole) {
    const std::vector<std::string> known = {kDone, kObsolete, kScanning, kStarting};
    for (const std::string &status : known) {
        std::string other_case = status;
        other_case[0] = static_cast<char>(other_case[0] ^ 0x20);
        for (const std::string &near :
             {status + ".", status + " ", " " + status, status.substr(0, status.size() - 1),
              other_case, status + "\n"}) {
            EXPECT_EQ(end_of(near, 0), kReportedError) << near;
        }
    }
}

TEST_F(HypervisorJob, AnyOtherTextIsAnError) {
    for (const char *status :
         {"", "The update completed successfully", "The update completed successfully.",
          "Scanning URI for installable packages.", "Package installation successfully.", "0x00"}) {
        EXPECT_EQ(end_of(status, 0), kReportedError) << status;
    }
    for (const std::size_t length : {1022U, 1023U, 1024U, 5000U}) {
        EXPECT_EQ(end_of(std::string(length, 'x'), 0), kReportedError) << length;
    }
}

TEST_F(HypervisorJob, LastJobDecidesWhoseverItIs) {
    const VendorInstance done = with_status(text(kDone));
    const VendorInstance obsolete = with_status(text(kObsolete));
    const VendorInstance failed = with_status(text("No space left"));
    EXPECT_EQ(end_of({failed, obsolete, done}, 1), kReportedDone);
    EXPECT_EQ(end_of({done, failed, obsolete}, 1), kReportedObsolete);
    EXPECT_EQ(end_of({done, obsolete, failed}, 0), kReportedError);
    EXPECT_EQ(end_of({failed, without_status(), done}, 1), kReportedDone);
}

TEST_F(HypervisorJob, WithoutAJobTheInstallFails) {
    EXPECT_EQ(end_of(std::vector<VendorInstance>{}, 0), kReportedError);
}

TEST_F(HypervisorJob, LastJobMustTellItsStatus) {
    const VendorInstance done = with_status(text(kDone));
    EXPECT_EQ(end_of({done, without_status()}, 0), kReportedError);
    EXPECT_EQ(end_of({done, with_status(Value::null(CMPI_string))}, 0), kReportedError);
    EXPECT_EQ(end_of({done, with_status(Value::uint16(7))}, 0), kReportedError);
}

TEST_F(HypervisorJob, JobsThatCannotBeEnumeratedFailTheInstall) {
    job().enumerations = {std::nullopt};
    EXPECT_EQ(install(), 0);
    EXPECT_THAT(reports(), ElementsAre(kReportedError));
    EXPECT_EQ(package().OrderFlag, 300);
}

TEST_F(HypervisorJob, JobsThatVanishMeanwhileFailTheInstall) {
    show(kStarting);
    job().enumerations.emplace_back(std::vector<VendorInstance>{});
    EXPECT_EQ(install(), 0);
    EXPECT_THAT(reports(), ElementsAre(kReportedStarting, kReportedError));
    EXPECT_EQ(pauses(), Pauses{10});
}

TEST_F(HypervisorJob, WithoutAPathTheJobsAreNotLookedAt) {
    fail_service("broker.newObjectPath", "VMware_ConcreteJob", CMPI_RC_ERR_FAILED);
    show(kDone);
    EXPECT_EQ(install(), 0);
    EXPECT_THAT(reports(), ElementsAre(kReportedError));
    EXPECT_THAT(service().targets, Not(IsEmpty()));
}

TEST_F(HypervisorJob, LongFollowingLeavesNothingOfTheBrokersAlive) {
    for (int i = 0; i < 50; ++i) {
        show(kScanning);  // what is left is looked for when the request ends
    }
    show(kDone);
    EXPECT_EQ(install(), 1);
}

}  // namespace
}  // namespace velktest
